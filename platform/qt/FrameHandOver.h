// FrameHandOver.h: how a view that renders on a thread of its own (a chart's frame loop, a
// terminal's thread) gets its finished 8-bit frames painted on the interface thread.
//
// Three frame buffers take turns: the render thread copies a finished frame into the one it owns,
// then, under the hand-over lock, swaps it with the newest frame waiting to be painted; the
// interface thread, under the same lock, swaps that one with the frame it paints from, and turns
// it into colour through the frame's palette with the lock released. So the lock is only ever
// held for swapping two pointers, neither thread copies or converts pixels under it, and a frame
// that is handed over before the last one was painted simply replaces it: the interface thread
// always paints the newest frame, and converts each frame at most once however often it paints.
//
// A hand-over that cannot get the lock within its time-out (0.1 s) is dropped, as a render loop
// that could not lock its window would skip showing that frame. A paint that finds the lock busy
// shows the last frame it converted and asks for another paint shortly after, so that the newest
// frame is shown even when no further frame follows. At most one paint request from the render
// thread is waiting in the application's mailbox at any time.
//
// Nothing is allocated per frame: each buffer grows when the frame size does, and a paint request
// carries only a number.
#pragma once

#include "platform/TimedLock.h"

#include <QImage>
#include <QList>
#include <QTimer>
#include <array>
#include <atomic>
#include <chrono>
#include <cstdint>
#include <vector>

class QPainter;
class QWidget;
class RBitmap8;

class FrameHandOver {
public:
    // How long a hand-over waits for the lock before it gives the frame up.
    static constexpr std::chrono::milliseconds kHandOverTimeout { 100 };

    // Paints go to view (not owned; may be null for no paints). Made on the interface thread.
    explicit FrameHandOver(QWidget* view);
    ~FrameHandOver();
    FrameHandOver(const FrameHandOver&) = delete;
    FrameHandOver& operator=(const FrameHandOver&) = delete;

    // Render thread. Hands over a copy of frame's pixels with the 256 colours of palette (the
    // system palette unless given) and asks for a paint; false when the lock stayed busy for
    // longer than timeout and the frame was given up. One thread at a time.
    bool HandOver(const RBitmap8& frame, const QList<QRgb>* palette = nullptr,
        std::chrono::milliseconds timeout = kHandOverTimeout);

    // Interface thread. Paints the newest frame at (0, 0); false when there is none to paint yet
    // (nothing handed over, or the lock busy before the first frame was taken).
    bool Paint(QPainter& painter);
    // Interface thread. The newest frame in colour (Format_RGB32), as Paint draws it; null before
    // the first frame. Valid until the next call of Paint or NewestImage.
    const QImage& NewestImage();

    // Any thread. The newest frame handed over, indexed with its palette (a copy); null before the
    // first.
    QImage FrontImage() const;
    // FrontImage for a caller on whose behalf the lock is held already (by itself, or by a thread
    // it waits for).
    QImage FrontImageUnderLock() const;
    // Frames handed over so far.
    int64_t FramesHandedOver() const { return fHandedOver.load(); }
    // The hand-over lock, for tests that hold it to see what a busy lock does.
    TimedLock& Lock() { return fLock; }

private:
    struct Frame {
        std::vector<uint8_t> pixels; // rows of pitch bytes
        int32_t width = 0, height = 0, pitch = 0; // pixels, pixels, bytes
        std::array<QRgb, 256> palette {};
        uint64_t serial = 0; // 0: empty
    };

    // Takes the newest frame for painting if there is a new one; false when the lock was busy.
    bool TakeNewest();
    // Runs a paint request posted by the render thread, if the hand-over it is for still lives.
    static void PaintRequested(uint64_t id);

    QWidget* fView;
    const uint64_t fId; // names this hand-over in paint requests; never reused
    mutable TimedLock fLock; // guards fReady, fFresh and the frame fReady points to
    Frame fFrames[3];
    Frame* fWriting = &fFrames[0]; // the render thread's own
    Frame* fReady = &fFrames[1]; // the newest frame handed over, once there is one
    Frame* fPainting = &fFrames[2]; // the interface thread's own; swapped only under fLock
    bool fFresh = false; // fReady holds a frame not yet taken for painting
    uint64_t fSerial = 0; // frames written; the render thread's own
    std::atomic<int64_t> fHandedOver { 0 };
    std::atomic<bool> fPaintRequested { false }; // a paint request waits in the mailbox
    QImage fShown; // fPainting in colour; the interface thread's own
    uint64_t fShownSerial = 0; // which frame fShown holds
    QTimer fRetry; // a paint that found the lock busy asks again
};
