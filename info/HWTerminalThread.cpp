// HWTerminal: the "Terminal Thread" (starting, stopping, the frame loop, idling) and showing its
// frames on the GUI thread.
#include "info/HWTerminal.h"

#include <QPainter>
#include <QShowEvent>
#include <chrono>
#include <pthread.h>
#include <time.h>

void HWTerminal::AttachedToWindow()
{
    if (thread.joinable())
        return;
    running = true;
    thread = std::thread(TermTEntryPoint, this);
}

void HWTerminal::DetachedFromWindow()
{
    if (!thread.joinable())
        return;
    {
        // Under the nap lock, so that a sleeping thread cannot miss the news.
        std::lock_guard lock(fNapLock);
        running = false;
    }
    fNapEnd.notify_all();
    fPark.Resume();
    thread.join();
    fPark.Reset();
}

int32_t HWTerminal::TermTEntryPoint(void* terminal)
{
    pthread_setname_np(pthread_self(), "Terminal Thread");
    return static_cast<HWTerminal*>(terminal)->TerminalLoop();
}

int32_t HWTerminal::TerminalLoop()
{
    bigtime_t lastPrint = 0;
    bigtime_t lastFade = 0;
    bool allFaded = false;
    done = false;
    while (running) {
        bool changed = false;
        const bigtime_t start = system_time();
        const bigtime_t frame = frameDelay.load(std::memory_order_relaxed);

        // Typing: at low frame rates several characters a frame.
        if (!done) {
            const bigtime_t now = system_time();
            const bigtime_t perChar = charDelay.load(std::memory_order_relaxed);
            if (lastPrint + perChar < now) {
                changed = true;
                if (PrintToTerminal(int32_t(frame / (perChar + 1) + 1)) == 0) {
                    // Only if nothing came in meanwhile: an append clears `done` under the same
                    // lock, and this must not undo that.
                    std::lock_guard lock(fCommandLock);
                    if (readPos == writePos)
                        done = true;
                }
                lastPrint = now;
            }
        }

        // Fading the trails.
        const bigtime_t now = system_time();
        const bigtime_t perStep = decayDelay.load(std::memory_order_relaxed);
        if (lastFade + perStep < now) {
            changed = true;
            allFaded = Fade(int32_t(frame / (perStep + 1) + 1));
            lastFade = now;
        }

        if (changed) {
            std::lock_guard lock(fRenderLock);
            RenderTerminal();
            fFrames.HandOver(*bitmap);
        }

        const bigtime_t elapsed = system_time() - start;
        if (elapsed < frame)
            Nap(frame - elapsed);

        // Nothing to type and nothing fading: idle until an append or the stop.
        if (allFaded && done && running) {
            fSuspended = true;
            fPark.Park();
            fSuspended = false;
        }
    }
    return 0;
}

void HWTerminal::Nap(bigtime_t microseconds)
{
    std::unique_lock lock(fNapLock);
    fNapEnd.wait_for(lock, std::chrono::microseconds(microseconds), [&] { return !running; });
}

bigtime_t HWTerminal::ThreadCPUTime() const
{
    if (!thread.joinable())
        return -1;
    clockid_t clock;
    timespec used {};
    if (pthread_getcpuclockid(const_cast<std::thread&>(thread).native_handle(), &clock) != 0
        || clock_gettime(clock, &used) != 0)
        return -1;
    return bigtime_t(used.tv_sec) * 1000000 + used.tv_nsec / 1000;
}

void HWTerminal::showEvent(QShowEvent* event)
{
    QWidget::showEvent(event);
    if (!fShownOnce) {
        fShownOnce = true;
        AttachedToWindow();
    }
}

void HWTerminal::paintEvent(QPaintEvent*)
{
    QPainter painter(this);
    if (!fFrames.Paint(painter))
        painter.fillRect(rect(), Qt::black);
}
