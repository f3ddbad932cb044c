// Work handed from other threads (the render threads) to the application's thread. Qt's own
// cross-thread event posting synchronises inside Qt where the thread sanitizer cannot follow,
// and hands the receiver's raw pointer to the posting thread; the mailbox is a queue under a
// standard mutex instead, woken through an eventfd that the application's event loop watches.
#pragma once

#include <atomic>
#include <deque>
#include <functional>
#include <mutex>
#include <thread>

class QCoreApplication;

class ThreadMailbox {
public:
    // The one mailbox of the process.
    static ThreadMailbox& Instance();

    // Queues work to run on the application's thread, after what is already queued. From any
    // thread; the work runs while that thread's event loop runs, or at the next Deliver().
    void Post(std::function<void()> work);
    // Runs everything queued, in order, including what the work itself queues. Only on the
    // application's thread. Returns how many pieces of work ran.
    int Deliver();
    // Whether the calling thread is the application's (the thread that made the application).
    bool OnApplicationThread() const;

    // Hooks the mailbox to the application just made on the calling thread; done by itself
    // whenever a Qt application starts.
    void AttachTo(QCoreApplication* application);

private:
    ThreadMailbox();
    void Wake();

    std::mutex fLock; // guards fQueue
    std::deque<std::function<void()>> fQueue;
    int fWake; // eventfd: readable while work may be waiting
    std::atomic<std::thread::id> fApplicationThread {};
};
