// Where a worker thread waits until it is given more to do (a render worker between frames, the
// terminal thread while idle). A resume that comes before the thread parks is remembered (once),
// so a thread never misses the work it is resumed for.
//
// A thread that is usually resumed again within moments (a render worker, whose next frame
// follows at once when frames are drawn back to back) may watch for the resume for a while
// before it sleeps: waking a sleeping thread costs tens of microseconds (33-61 us measured on a
// virtual machine of 2 cores), as long as the star pass takes for some 20,000 systems.
#pragma once

#include <atomic>
#include <chrono>
#include <condition_variable>
#include <cstdint>
#include <mutex>

// Tells the processor that this thread only waits on a value another thread writes.
inline void SpinPause()
{
#if defined(__x86_64__) || defined(__i386__)
    __builtin_ia32_pause();
#endif
}

// Waits until done() or until micros microseconds have passed; whether done() held.
template <class Done> bool SpinUntil(int64_t micros, Done done)
{
    if (micros <= 0)
        return done();
    const auto until = std::chrono::steady_clock::now() + std::chrono::microseconds(micros);
    while (!done()) {
        if (std::chrono::steady_clock::now() >= until)
            return done();
        SpinPause();
    }
    return true;
}

class ThreadPark {
public:
    // Waits until resumed or released; false when released (the thread is to end). Watches for
    // it first for the spin time given, then sleeps.
    bool Park()
    {
        SpinUntil(fSpinMicros.load(std::memory_order_relaxed), [&] {
            return fResumed.load(std::memory_order_acquire)
                || fReleased.load(std::memory_order_acquire);
        });
        std::unique_lock lock(fLock);
        fChanged.wait(lock, [&] { return fResumed.load() || fReleased.load(); });
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

    // How long Park watches for a resume before it sleeps: 0 (the default) sleeps at once.
    void SetSpin(int64_t micros) { fSpinMicros.store(micros, std::memory_order_relaxed); }

private:
    std::mutex fLock;
    std::condition_variable fChanged;
    // Written under fLock; read outside it only while spinning.
    std::atomic<bool> fResumed { false };
    std::atomic<bool> fReleased { false };
    std::atomic<int64_t> fSpinMicros { 0 };
};
