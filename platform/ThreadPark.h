// Where a worker thread waits until it is given more to do (a render worker between frames, the
// terminal thread while idle). A resume that comes before the thread parks is remembered (once),
// so a thread never misses the work it is resumed for.
#pragma once

#include <condition_variable>
#include <mutex>

class ThreadPark {
public:
    // Waits until resumed or released; false when released (the thread is to end).
    bool Park()
    {
        std::unique_lock lock(fLock);
        fChanged.wait(lock, [&] { return fResumed || fReleased; });
        fResumed = false;
        return !fReleased;
    }
    void Resume()
    {
        {
            std::lock_guard lock(fLock);
            fResumed = true;
        }
        fChanged.notify_one();
    }
    // Lets the parked thread go for good.
    void Release()
    {
        {
            std::lock_guard lock(fLock);
            fReleased = true;
        }
        fChanged.notify_one();
    }

    // Ready for a new thread after the last one was released and has ended.
    void Reset()
    {
        std::lock_guard lock(fLock);
        fResumed = false;
        fReleased = false;
    }

private:
    std::mutex fLock;
    std::condition_variable fChanged;
    bool fResumed = false;
    bool fReleased = false;
};
