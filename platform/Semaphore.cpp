// Counting semaphore on a mutex and a condition variable.
#include "platform/Semaphore.h"

Semaphore::Semaphore(int32_t count, const char* name)
    : fCount(count)
    , fName(name ? name : "")
{
}

bool Semaphore::Acquire(int32_t count, Deadline deadline)
{
    std::unique_lock lock(fLock);
    auto available = [&] { return fCount >= count; };
    if (!available()) {
        fWaiting++;
        fWanted += count;
        bool got = true;
        if (deadline)
            got = fChanged.wait_until(lock, *deadline, available);
        else
            fChanged.wait(lock, available);
        fWaiting--;
        fWanted -= count;
        if (!got)
            return false;
    }
    fCount -= count;
    return true;
}

void Semaphore::Release(int32_t count)
{
    {
        std::lock_guard lock(fLock);
        fCount += count;
    }
    fChanged.notify_all();
}

int32_t Semaphore::Count() const
{
    std::lock_guard lock(fLock);
    return fWaiting > 0 ? fCount - fWanted : fCount;
}

int32_t Semaphore::Waiting() const
{
    std::lock_guard lock(fLock);
    return fWaiting;
}
