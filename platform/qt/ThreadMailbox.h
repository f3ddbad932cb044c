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
    // Runs what is queued, in order, and what that work queues in turn on this thread (at most
    // kRounds rounds of it). Work that other threads post meanwhile waits for the next call, which
    // the event loop makes: threads that never stop posting (every running chart hands over each
    // frame) cannot hold the application's thread here. Only on the application's thread.
    // Returns how many pieces of work ran.
    int Deliver();
    static constexpr int kRounds = 16;
    // Whether the calling thread is the application's (the thread that made the application).
    bool OnApplicationThread() const;

    // Hooks the mailbox to the application just made on the calling thread; done by itself
    // whenever a Qt application starts.
    void AttachTo(QCoreApplication* application);

private:
    ThreadMailbox();
    void Wake();

    std::mutex fLock; // guards fQueue and fChained
    std::deque<std::function<void()>> fQueue;
    bool fChained = false; // work was posted from the application's thread since the last batch
    int fWake; // eventfd: readable while work may be waiting
    std::atomic<std::thread::id> fApplicationThread {};
};
