// Kernel services over the standard library: clocks, sleeping and the semaphore calls.
#include "platform/Kernel.h"

#include "platform/Semaphore.h"

#include <chrono>
#include <thread>

bigtime_t system_time()
{
    using namespace std::chrono;
    return duration_cast<microseconds>(steady_clock::now().time_since_epoch()).count();
}

void snooze(bigtime_t microseconds)
{
    if (microseconds > 0)
        std::this_thread::sleep_for(std::chrono::microseconds(microseconds));
}

uint32_t real_time_clock()
{
    // From the system clock itself: time() reads a coarser copy of it that lags by up to a tick,
    // so just after a second begins it could still give the second before.
    return static_cast<uint32_t>(std::chrono::duration_cast<std::chrono::seconds>(
        std::chrono::system_clock::now().time_since_epoch())
                                     .count());
}

sem_id create_sem(int32_t count, const char* name)
{
    if (count < 0)
        return nullptr;
    return new Semaphore(count, name);
}

status_t delete_sem(sem_id sem)
{
    if (!sem)
        return B_BAD_SEM_ID;
    delete sem;
    return B_OK;
}

status_t acquire_sem(sem_id sem)
{
    return acquire_sem_etc(sem, 1, 0, 0);
}

status_t acquire_sem_etc(sem_id sem, int32_t count, uint32_t flags, bigtime_t timeout)
{
    if (!sem)
        return B_BAD_SEM_ID;
    if (count < 1)
        return B_BAD_VALUE;

    using namespace std::chrono;
    Semaphore::Deadline deadline;
    if (flags & B_RELATIVE_TIMEOUT)
        deadline = steady_clock::now() + microseconds(timeout);
    else if (flags & B_ABSOLUTE_TIMEOUT)
        deadline = steady_clock::time_point(microseconds(timeout));

    if (sem->Acquire(count, deadline))
        return B_OK;
    // A zero relative time-out is a poll: report that the call would have had to wait.
    return (flags & B_RELATIVE_TIMEOUT) && timeout <= 0 ? B_WOULD_BLOCK : B_TIMED_OUT;
}

status_t release_sem(sem_id sem)
{
    return release_sem_etc(sem, 1, 0);
}

status_t release_sem_etc(sem_id sem, int32_t count, uint32_t /*flags*/)
{
    if (!sem)
        return B_BAD_SEM_ID;
    if (count < 1)
        return B_BAD_VALUE;
    sem->Release(count);
    return B_OK;
}

status_t get_sem_count(sem_id sem, int32_t* count)
{
    if (!sem || !count)
        return B_BAD_VALUE;
    *count = sem->Count();
    return B_OK;
}
