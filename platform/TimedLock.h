// A lock that can be waited for with a time-out, on a plain mutex and a condition variable.
// (The standard timed mutex waits through a call that the thread sanitizer cannot see into, so
// every frame hand-over would be reported as a wrong unlock.) Usable with std::unique_lock.
#pragma once

#include <chrono>
#include <condition_variable>
#include <mutex>

class TimedLock {
public:
    void lock()
    {
        std::unique_lock guard(fMutex);
        fReleased.wait(guard, [&] { return !fHeld; });
        fHeld = true;
    }
    bool try_lock()
    {
        std::lock_guard guard(fMutex);
        if (fHeld)
            return false;
        fHeld = true;
        return true;
    }
    template <typename Rep, typename Period>
    bool try_lock_for(std::chrono::duration<Rep, Period> timeout)
    {
        std::unique_lock guard(fMutex);
        if (!fReleased.wait_for(guard, timeout, [&] { return !fHeld; }))
            return false;
        fHeld = true;
        return true;
    }
    void unlock()
    {
        {
            std::lock_guard guard(fMutex);
            fHeld = false;
        }
        fReleased.notify_one();
    }

private:
    std::mutex fMutex;
    std::condition_variable fReleased;
    bool fHeld = false; // guarded by fMutex
};
