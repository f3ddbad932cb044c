// The mailbox's queue, its eventfd wake-up and its place in the application's event loop.
#include "platform/qt/ThreadMailbox.h"

#include <QCoreApplication>
#include <QSocketNotifier>
#include <cstdint>
#include <sys/eventfd.h>
#include <unistd.h>

namespace {

// Every Qt application gets its mailbox hooked in as it is constructed, on its own thread.
void AttachMailbox()
{
    ThreadMailbox::Instance().AttachTo(QCoreApplication::instance());
}

} // namespace

Q_COREAPP_STARTUP_FUNCTION(AttachMailbox)

ThreadMailbox& ThreadMailbox::Instance()
{
    // Never destroyed: render threads may still post while static objects are torn down.
    static auto* mailbox = new ThreadMailbox();
    return *mailbox;
}

ThreadMailbox::ThreadMailbox()
    : fWake(eventfd(0, EFD_NONBLOCK | EFD_CLOEXEC))
{
}

void ThreadMailbox::AttachTo(QCoreApplication* application)
{
    if (!application)
        return;
    fApplicationThread = std::this_thread::get_id();
    // Owned by the application: it watches the eventfd as long as the event loop runs.
    auto* notifier = new QSocketNotifier(fWake, QSocketNotifier::Read, application);
    QObject::connect(notifier, &QSocketNotifier::activated, notifier, [this] { Deliver(); });
}

bool ThreadMailbox::OnApplicationThread() const
{
    return std::this_thread::get_id() == fApplicationThread.load();
}

void ThreadMailbox::Post(std::function<void()> work)
{
    bool wasEmpty;
    {
        std::lock_guard lock(fLock);
        wasEmpty = fQueue.empty();
        fQueue.push_back(std::move(work));
        fChained = fChained || OnApplicationThread();
    }
    // One wake-up for a run of posts: the application's thread takes the whole queue at once.
    if (wasEmpty)
        Wake();
}

void ThreadMailbox::Wake()
{
    const uint64_t one = 1;
    // A full counter (never reached) or a closed descriptor leave the work for Deliver().
    [[maybe_unused]] const ssize_t written = write(fWake, &one, sizeof one);
}

int ThreadMailbox::Deliver()
{
    uint64_t count;
    [[maybe_unused]] const ssize_t read = ::read(fWake, &count, sizeof count);
    int ran = 0;
    for (int round = 0; round < kRounds; round++) {
        std::deque<std::function<void()>> batch;
        {
            std::lock_guard lock(fLock);
            batch.swap(fQueue);
            fChained = false;
        }
        if (batch.empty())
            return ran;
        for (auto& work : batch) {
            work();
            ran++;
        }
        std::lock_guard lock(fLock);
        if (!fChained)
            break;
    }
    // Whatever is still queued was posted after the batch was taken; its poster woke the loop.
    return ran;
}
