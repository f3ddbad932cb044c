// The star map: every system of a universe projected through a moving camera into an 8-bit
// offscreen, drawn additively in its spectral colours, with an overlay for the clipping cube,
// the origin read-out and the selection and hover markers.
//
// Threads. The GUI thread owns the widget and handles the mouse and messages; a "Main Render
// Thread" runs the frame loop and up to seven "Render Thread" workers draw interleaved shares of
// the systems. Everything the frame reads or writes is guarded by renderLock (the "render
// benaphore"): the main render thread holds it from the camera step through the foreground, and
// the GUI thread takes it whenever a click or a message changes the chart. The settings the
// mouse controls write (velocities, brightness, contrast, clipping radius) are relaxed atomics
// read once per frame without a lock; so are the mouse position and the hover fields that the
// workers update concurrently (a race there may leave a slightly farther system as target for
// one frame). A finished frame is handed to the GUI thread through a FrameHandOver, which paints
// the newest one; a frame that cannot get its lock within 0.1 s is not shown.
#pragma once

#include "catalog/Universe.h"
#include "chart/SISubscriber.h"
#include "core/Benaphore.h"
#include "core/SMatrix.h"
#include "platform/BList.h"
#include "platform/BPoint.h"
#include "platform/BRect.h"
#include "platform/ThreadPark.h"
#include "platform/qt/FrameHandOver.h"
#include "platform/qt/Messaging.h"
#include "platform/qt/TransitView.h"
#include "query/StarSysMask.h"
#include "render/RBMFont8.h"
#include "render/RBitmap8.h"
#include "widgets/IBroadcaster.h"

#include <QImage>
#include <QTimer>
#include <algorithm>
#include <atomic>
#include <functional>
#include <memory>
#include <mutex>
#include <string>
#include <thread>
#include <vector>

class UniverseView : public TransitView<QWidget>, public BHandler, public IBroadcaster {
public:
    static constexpr int32_t kMaxRenderThreads = 8;

    // threadCount render threads in all (the main one included), 1 to 8.
    UniverseView(BRect frame, const char* name, Universe* universe, int32_t threadCount,
        QWidget* parent = nullptr);
    // Stops the render threads if they still run, then frees everything the view owns.
    ~UniverseView() override;

    // The settings the mouse controls write while the render thread reads them.
    std::atomic<double>* GetRadialVelocityX() { return &radialVelocityX; }
    std::atomic<double>* GetRadialVelocityY() { return &radialVelocityY; }
    std::atomic<double>* GetCameraVelocityZ() { return &cameraVelocityZ; }
    std::atomic<double>* GetLumFactor() { return &lumFactor; }
    std::atomic<double>* GetStellarContrast() { return &stellarContrast; }
    std::atomic<double>* GetDistanceFilter() { return &distanceFilter; }
    int32_t GetSelectedSystem() const { return selectedSystem.load(std::memory_order_relaxed); }
    int32_t Target() const { return targetSystem.load(std::memory_order_relaxed); }

    // The handler that shows the data line (normally the window's strip); a BHandler.
    void SetStarInfoTarget(QObject* target) { starInfo.ISetTarget(target); }

    // One frame's steps; the frame loop runs them, tests may too.
    void CalculateLumCache();
    void NextTransform();
    // Systems start, start + stride, start + 2 stride, ...
    void RenderStars(int32_t stride, int32_t start);
    // Share `share` of `shares` as the frame loop draws it: blocks of kShareBlock systems dealt
    // out in turn, so that the threads work on separate stretches of memory.
    void RenderShare(int32_t shares, int32_t share);
    static constexpr int32_t kShareBlock = 4096;
    // Whether shares are blocks (the default) or single systems dealt out in turn, as
    // RenderStars(shares, share) draws them; the two give the same picture.
    bool interleaveBlocks = true;
    void RenderBackground();
    void RenderForeground();
    // A whole frame without moving the camera or showing it: under renderLock the background,
    // the star pass split over the render threads, and the foreground. For tests, benchmarks and
    // tools, while the frame loop does not run (it would draw every share itself then).
    void Render();
    // Keeps only systems within radius parsecs of the origin system (inclusive) and rebuilds
    // drawMask.
    void HideGreaterThan(double radius);
    // (Re)creates the offscreen at the view's current size.
    void InitOffscreen();

    // Starting and stopping the frame loop (when the view joins or leaves its window), and
    // pausing it while the chart cannot be seen.
    void AttachedToWindow();
    void DetachedFromWindow();
    // Tells the frame loop to end after the frame it is drawing, waking it from a pause or from
    // its wait for the next frame, and returns at once; DetachedFromWindow then waits for it.
    // A program closing many charts tells them all first, so that they finish side by side.
    void StopRendering();
    void Resume();
    void Suspend();
    bool IsRunning() const { return running.load(); }
    // True while the frame loop is paused, waiting to be resumed.
    bool IsSuspended() const { return fSuspended.load(); }
    // Frames finished since the loop started; for tests and measurements.
    int64_t FramesRendered() const { return framesRendered.load(); }
    // The shortest time from the start of one frame to the next, in microseconds: 15000, about
    // 66 frames a second. Tests lengthen it.
    void SetFramePeriod(bigtime_t period) { fFramePeriod = period; }

    // Where system index stands on the screen now, or (-1, -1) when it is not drawn there.
    BPoint ScreenPointOf(int32_t index);
    // The origin read-out as the overlay shows it now.
    std::string ReadOut();

    // Makes the Sun, the system at (0, 0, 0), the origin as a click on a selected system makes
    // that system the origin; the camera glides back over the next frames. Without a system
    // there, the origin goes back to (0, 0, 0) as the chart starts, on system 0.
    void ReturnOriginToSun();
    // The system the read-out names as origin.
    int32_t OriginSystem();

    // The nearest drawn system whose pick box holds where, or -1.
    int32_t FindSystem(BPoint where);
    void BroadcastSI(int32_t selection, int32_t target);
    void SetDataString(int32_t selection, int32_t target);
    void UpdateData(int32_t selection, int32_t target);

    void MessageReceived(Message* message) override;

    // The finished frame as the view paints it (a copy), for tests and screenshots.
    QImage FrontImage() const { return fFrames.FrontImage(); }
    // Where finished frames are handed to the GUI thread; tests hold its lock.
    FrameHandOver& Frames() { return fFrames; }
    // The offscreen itself; only while renderLock is not contended (tests).
    RBitmap8* Offscreen() { return offscreen; }
    // What the star pass reads of every system, for benchmarks that hold a frame against the
    // least work it must do; valid while the view and its universe live.
    struct StarPassData {
        const double *x, *y, *z; // positions in parsecs
        const uint8_t* shown; // the draw mask's states
        int32_t count;
    };
    StarPassData PassData() const
    {
        return { fPositionX.data(), fPositionY.data(), fPositionZ.data(), drawMask->states,
            std::min(int32_t(fPositionX.size()), drawMask->GetSystemCount()) };
    }
    const BRect& Frame() const { return frame; }
    // The colour table system i is drawn with.
    const ColorTable* TableOf(int32_t i) const
    {
        return fWideTables.empty() ? fTableList[fTableOf[size_t(i)]] : fWideTables[size_t(i)];
    }
    const char* DataString() const { return starInfo.IGetInfo(); }
    // Replaces the real drag (which runs until the button is let go) with a function that gets
    // the message the drag would carry; for tests.
    void SetDragStarter(std::function<void(const Message&)> starter)
    {
        fDragStarter = std::move(starter);
    }
    // Called by every worker thread as it begins its share of a frame, with the share's index,
    // once it holds the bitmap it draws into; for tests that hold a worker back. Set it before
    // the render threads start.
    void SetShareHook(std::function<void(int32_t)> hook) { fShareHook = std::move(hook); }

protected:
    void MouseMoved(QPoint where, Transit transit) override;
    bool PassesTransitsOn() const override { return false; }
    void mousePressEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;
    void paintEvent(QPaintEvent* event) override;
    void resizeEvent(QResizeEvent* event) override;
    void dragEnterEvent(QDragEnterEvent* event) override;
    void dragMoveEvent(QDragMoveEvent* event) override;
    void dropEvent(QDropEvent* event) override;

private:
    friend class UniverseViewTest;

    struct ScreenPoint {
        int32_t x, y;
        double z;
    };
    // The point's place on the screen and its depth; visible only with z > 0.
    ScreenPoint Project(const SVector& point) const;
    void RebuildDrawMask();
    // The star pass over begin, begin + step, ... below end: a transform-and-cull pass the
    // compiler vectorises, then the drawing of what is on screen.
    void RenderSpan(RBitmap8* target, int32_t begin, int32_t end, int32_t step);
    void RenderShareInto(RBitmap8* target, int32_t shares, int32_t share);
    void DrawClipCube();
    void DrawReadout();
    std::string FormatReadout() const;
    void DrawSelectionMarker();
    void ApplyClick(int32_t target);
    void StartDrag(int32_t target);
    void SamplePress();

    void MainRenderLoop();
    void RenderLoop(int32_t index);
    // The worker threads and renderSync, started once and kept until the view stops.
    void StartWorkers();
    void StopWorkers();
    void DrawShares();
    // After a frame whose wait for the shares timed out: waits for the late shares, so that
    // nothing a worker may still draw into is erased, replaced or freed.
    void CollectMissingShares();
    void Blit();
    void ReplaceOffscreen();

public:
    // The view's state, fields in their long-standing order. Owned unless said otherwise.
    RBitmap8* offscreen = nullptr; // exactly the view's size
    RBitmap8* starSprite; // the 64 x 64 glow, 'Raw8' 5
    RBMFont8* font; // 'FONT' 0
    IBroadcaster starInfo; // the data line
    Universe* universe; // not owned
    BList subscribers; // SISubscriber*, owned
    SMatrix transform;
    SMatrix pitch;
    SMatrix zoomTranslation;
    SMatrix yaw;
    SMatrix originTranslation;
    SVector cameraPosition; // parsecs
    SVector originOffset; // minus the origin system's position
    double cameraDistance = 25.0; // parsecs
    bool zoomToOrigin = false;
    std::atomic<double> radialVelocityX { 0.0 }; // radians a frame
    std::atomic<double> radialVelocityY { -0.01 };
    std::atomic<double> cameraVelocityZ { 0.0 }; // parsecs a frame
    double focalLength = 0; // pixels
    std::atomic<double> lumFactor { 2000.0 };
    std::vector<double> lumCache; // one per system
    std::atomic<double> stellarContrast { 1.0 };
    BRect frame { 0, 0, -1, -1 };
    std::atomic<double> distanceFilter { 10000.0 }; // parsecs
    StarSysMask* userMask;
    StarSysMask* distanceMask;
    StarSysMask* drawMask;
    std::atomic<bool> showClipSphere { true };
    std::atomic<bool> frameResized { false };
    std::atomic<int32_t> selectedSystem { -1 };
    std::atomic<int32_t> targetSystem { -1 };
    std::atomic<int32_t> lastSelection { -2 };
    std::atomic<int32_t> lastTarget { -2 };
    int32_t originSystem = 0;
    std::atomic<bool> targetFound { false };
    std::atomic<bool> mouseInside { false };
    std::atomic<float> selectedPointX { -1 }, selectedPointY { -1 };
    std::atomic<float> mousePointX { 0 }, mousePointY { 0 };
    std::atomic<float> targetPointX { -1 }, targetPointY { -1 };
    std::atomic<double> targetDepth { 1e50 };
    int32_t markerSystem = -1;
    int32_t markerFrames = 0;
    float markerScale = 1.0f;

    // Render threads.
    int32_t threadCount;
    std::thread mainRenderThread;
    std::thread renderThreads[kMaxRenderThreads];
    ThreadPark workerParks[kMaxRenderThreads];
    sem_id renderSync = nullptr; // "Render Sync Semaphore", made by the main render thread
    Benaphore* renderLock; // "render benaphore"
    std::atomic<bool> suspendRequested { false };
    std::atomic<int16_t> running { 0 };
    bool workersStarted = false; // touched only by whoever draws frames, under renderLock

private:
    std::mutex fSuspendLock; // with fSuspendChanged: where the main render thread pauses
    std::condition_variable fSuspendChanged;
    std::atomic<bool> fSuspended { false };
    std::atomic<bigtime_t> fFramePeriod { 15000 }; // microseconds
    // A share of the last frame was still being drawn when its wait timed out; only whoever
    // draws frames touches it.
    bool fSharesMissing = false;
    // Workers' shares of this frame drawn so far: what the main render thread watches for a
    // moment before it sleeps on renderSync, which alone decides when the frame goes on.
    std::atomic<int32_t> fSharesDrawn { 0 };
    // How long a render thread that waits for the others, or for the next frame, watches before
    // it sleeps: 0 where the threads outnumber the processors, since the thread waited for may
    // need this very processor.
    int64_t fSpinMicros = 0;
    static constexpr int64_t kSpinMicros = 250;
    std::function<void(int32_t)> fShareHook;
    std::atomic<int64_t> framesRendered { 0 };
    std::atomic<int32_t> fViewWidth { 0 }, fViewHeight { 0 }; // the widget's size, for resizes
    // What the star pass reads of each system, packed: the universe never changes, and reading
    // three arrays costs far less than visiting a million heap objects every frame.
    std::vector<double> fPositionX, fPositionY, fPositionZ; // parsecs
    // Each system's colour table, as its place in fTableList: a byte a system, so the few
    // systems a frame draws find their tables in an array an eighth the size of one of pointers,
    // which stays in the cache. A universe of more than 256 tables keeps a pointer a system in
    // fWideTables instead.
    std::vector<uint8_t> fTableOf;
    // What the star pass's coarse test reads of each system in place of its draw-mask state
    // and its brightness, half the bytes: kPassHidden, kPassDark when the brightness can draw
    // nothing (negative, or not a number), else the brightness as a float never below it.
    // Kept by RebuildDrawMask and CalculateLumCache.
    std::vector<float> fPassLum;
    static constexpr float kPassHidden = -1.0f, kPassDark = -0.5f;
    void RebuildPassLum();
    std::vector<const ColorTable*> fTableList; // not owned
    std::vector<const ColorTable*> fWideTables; // not owned; empty while fTableOf serves
    // The glow scaled to each side from 0 to 64 (RBitmap8::ScaledSamples), and the tables of
    // fTableList in the additive form: a glow is then drawn without scaling or converting
    // anything. No spreads while fWideTables serves; no samples without the glow's resource.
    std::vector<std::vector<uint8_t>> fGlowSamples;
    std::vector<std::array<uint32_t, 256>> fSpreads;
    FrameHandOver fFrames { this }; // finished frames on their way to the GUI thread
    // A press in progress: the target it began on and where, sampled every 50 ms.
    QTimer fPressTimer;
    int32_t fPressTarget = -1;
    QPoint fPressPoint;
    bool fPressed = false;
    std::function<void(const Message&)> fDragStarter;
};
