// Long work on a thread of its own, under a progress dialog.
#include "lists/LongWork.h"

#include <QEventLoop>
#include <QProgressDialog>
#include <QTimer>
#include <atomic>
#include <memory>

int LongWork::showAfter = 500;
std::function<void()> LongWork::beforeWork;

LongWork::LongWork(QWidget* parent)
    : fParent(parent)
{
}

LongWork::~LongWork()
{
    for (std::thread& thread : fCancelled)
        thread.join();
}

bool LongWork::Run(const QString& label, std::function<void()> work)
{
    fBusy = true;
    // The only thing both threads touch: set by the work's thread when it is through, with
    // release order so that what the work wrote is seen once this reads true.
    auto done = std::make_shared<std::atomic<bool>>(false);
    std::thread thread([work = std::move(work), hold = beforeWork, done] {
        if (hold)
            hold();
        work();
        done->store(true, std::memory_order_release);
    });

    QProgressDialog dialog(label, QStringLiteral("Cancel"), 0, 0, fParent);
    dialog.setWindowModality(Qt::WindowModal);
    dialog.setAutoReset(false);
    dialog.setAutoClose(false);
    dialog.setMinimumDuration(showAfter);
    dialog.setObjectName(QStringLiteral("Long Work"));
    QEventLoop loop;
    bool cancelled = false;
    QObject::connect(&dialog, &QProgressDialog::canceled, &loop, [&] {
        cancelled = true;
        loop.quit();
    });
    // The work's end is looked for between events rather than posted from its thread: a
    // cancelled work's thread must not reach for this loop, which is gone by then.
    QTimer poll;
    poll.setInterval(10);
    QObject::connect(&poll, &QTimer::timeout, &loop, [&] {
        if (done->load(std::memory_order_acquire))
            loop.quit();
    });
    QTimer::singleShot(showAfter, &dialog, [&dialog] { dialog.show(); });
    poll.start();
    if (!done->load(std::memory_order_acquire))
        loop.exec();
    poll.stop();
    dialog.hide();
    fBusy = false;
    if (cancelled && !done->load(std::memory_order_acquire)) {
        fCancelled.push_back(std::move(thread));
        return false;
    }
    thread.join();
    return !cancelled;
}
