// Kernel services the program is written against: microsecond clocks, sleeping, semaphores
// with counted, timed acquisition, and atomic addition. Plain C++ over the standard library.
#pragma once

#include <atomic>
#include <cstdint>

using bigtime_t = int64_t; // microseconds
using status_t = int32_t;

constexpr status_t B_OK = 0;
constexpr status_t B_ERROR = -1;
constexpr status_t B_BAD_VALUE = INT32_MIN + 5;
constexpr status_t B_TIMED_OUT = INT32_MIN + 9;
constexpr status_t B_WOULD_BLOCK = INT32_MIN + 11;
constexpr status_t B_BAD_SEM_ID = INT32_MIN + 0x1000;

// Flags of acquire_sem_etc and release_sem_etc.
constexpr uint32_t B_RELATIVE_TIMEOUT = 0x8;
constexpr uint32_t B_ABSOLUTE_TIMEOUT = 0x10;
constexpr uint32_t B_DO_NOT_RESCHEDULE = 0x2;

// Microseconds since an arbitrary fixed point (steady, never goes back).
bigtime_t system_time();
// Sleeps the calling thread for at least the given number of microseconds.
void snooze(bigtime_t microseconds);
// Seconds since 1970-01-01 UTC.
uint32_t real_time_clock();

// Adds value and returns what the counter held before.
inline int32_t atomic_add(std::atomic<int32_t>* counter, int32_t value)
{
    return counter->fetch_add(value);
}

class Semaphore;
using sem_id = Semaphore*; // owned by whoever called create_sem, until delete_sem

sem_id create_sem(int32_t count, const char* name);
status_t delete_sem(sem_id sem);
status_t acquire_sem(sem_id sem);
// With B_RELATIVE_TIMEOUT the time-out is a duration, with B_ABSOLUTE_TIMEOUT a system_time();
// without either the call waits for as long as it takes.
status_t acquire_sem_etc(sem_id sem, int32_t count, uint32_t flags, bigtime_t timeout);
status_t release_sem(sem_id sem);
status_t release_sem_etc(sem_id sem, int32_t count, uint32_t flags);
// Units currently available, or minus the number of units waited for.
status_t get_sem_count(sem_id sem, int32_t* count);
