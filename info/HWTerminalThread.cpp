// HWTerminal: the "Terminal Thread" (starting, stopping, the frame loop, idling) and showing its
// frames on the GUI thread.
#include "info/HWTerminal.h"

#include "platform/qt/BitmapImage.h"
#include "platform/qt/ThreadMailbox.h"

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
            HandOver();
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

void HWTerminal::HandOver()
{
    // A frame that cannot be handed over within 0.1 s is not shown.
    if (!fHandOver.try_lock_for(std::chrono::milliseconds(100)))
        return;
    fFront.assign(bitmap->Bits(), bitmap->Bits() + bitmap->BitsLength());
    fHandOver.unlock();
    fFramesShown++;
    // One paint request at a time; the GUI thread asks for the next frame when it paints.
    if (!fUpdatePending.exchange(true)) {
        ThreadMailbox::Instance().Post([view = fSelf] {
            if (view) {
                view->fUpdatePending = false;
                view->update();
            }
        });
    }
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

QImage HWTerminal::FrontImage() const
{
    std::lock_guard lock(fHandOver);
    if (fFront.empty())
        return {};
    QImage image(fFront.data(), bitmap->Width(), bitmap->Height(), bitmap->BytesPerRow(),
        QImage::Format_Indexed8);
    image.setColorTable(SystemColorTable());
    return image.copy();
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
    // The terminal thread holds the hand-over lock for a copy at most; if it is busy, its next
    // frame asks for another paint anyway.
    std::unique_lock lock(fHandOver, std::try_to_lock);
    if (!lock.owns_lock())
        return;
    if (fFront.empty()) {
        lock.unlock();
        painter.fillRect(rect(), Qt::black);
        return;
    }
    // The palette look-up is done here, on this thread: handed an indexed image, Qt may convert
    // it on its own worker threads.
    const int32_t width = bitmap->Width();
    const int32_t height = bitmap->Height();
    const int32_t pitch = bitmap->BytesPerRow();
    if (fShown.width() != width || fShown.height() != height)
        fShown = QImage(width, height, QImage::Format_RGB32);
    const QRgb* palette = SystemColorTable().constData();
    for (int32_t y = 0; y < height; y++) {
        const uint8_t* from = fFront.data() + size_t(y) * size_t(pitch);
        auto* to = reinterpret_cast<QRgb*>(fShown.scanLine(y));
        for (int32_t x = 0; x < width; x++)
            to[x] = palette[from[x]];
    }
    lock.unlock();
    painter.drawImage(QPoint(0, 0), fShown);
}
