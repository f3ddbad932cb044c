// A lock that costs one atomic addition when nobody else holds it and falls back to a
// semaphore only under contention. Not recursive: a thread that acquires twice blocks itself.
#pragma once

#include "platform/Kernel.h"

#include <atomic>
#include <cstdint>

class Benaphore {
public:
    // count 1 gives the classic lock: the first holder passes on the addition alone.
    Benaphore(int32_t count, const char* name);
    ~Benaphore();
    Benaphore(const Benaphore&) = delete;
    Benaphore& operator=(const Benaphore&) = delete;

    status_t Acquire();
    // Waits on the semaphore with the given flags and time-out when contended. On failure
    // the counter keeps the addition, as a waiter that gave up still counts until released.
    status_t Acquire(uint32_t count, uint32_t flags, bigtime_t timeout);
    status_t Release();
    status_t Release(uint32_t count, uint32_t flags);

    // The counter as it was before the latest acquire or release. Written by whichever
    // thread came last, for inspection only, never for decisions.
    std::atomic<int32_t> lastCount;
    sem_id sem; // owned
    std::atomic<int32_t> atom; // acquisitions outstanding, offset by the initial count
};
