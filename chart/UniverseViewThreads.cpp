// The render threads: the frame loop, the workers' shares, pausing and the hand-over of finished
// frames to the GUI thread.
#include "chart/UniverseView.h"

#include "chart/FrameLog.h"
#include "platform/Kernel.h"

#include <chrono>
#include <pthread.h>
#include <string>

namespace {

// Thread names as the system shows them; Linux keeps 15 characters, so the kernel sees
// "Main Render Thr" and "Render Thread".
void NameThread(const char* name)
{
    const std::string shortName = std::string(name).substr(0, 15);
    pthread_setname_np(pthread_self(), shortName.c_str());
}

} // namespace

void UniverseView::AttachedToWindow()
{
    if (running)
        return;
    InitOffscreen();
    suspendRequested = false;
    running = 1;
    mainRenderThread = std::thread([this] {
        NameThread("Main Render Thread");
        MainRenderLoop();
    });
}

void UniverseView::DetachedFromWindow()
{
    if (!mainRenderThread.joinable())
        return;
    StopRendering();
    mainRenderThread.join();
}

void UniverseView::StopRendering()
{
    if (!mainRenderThread.joinable())
        return;
    Resume();
    {
        // Under the pause lock, so a thread about to pause or to wait for its next frame sees
        // that it is to end instead.
        std::lock_guard lock(fSuspendLock);
        running = 0;
    }
    fSuspendChanged.notify_all();
}

void UniverseView::Resume()
{
    if (!running)
        return;
    {
        std::lock_guard lock(fSuspendLock);
        suspendRequested = false;
    }
    fSuspendChanged.notify_all();
}

void UniverseView::Suspend()
{
    if (running)
        suspendRequested = true;
}

void UniverseView::InitOffscreen()
{
    Resume();
    renderLock->Acquire();
    ReplaceOffscreen();
    renderLock->Release();
}

void UniverseView::ReplaceOffscreen()
{
    delete offscreen;
    frame = BRect(0, 0, float(fViewWidth.load() - 1), float(fViewHeight.load() - 1));
    offscreen = new RBitmap8(frame, false, false);
    offscreen->SetBMFont(font);
    focalLength = frame.right;
}

void UniverseView::DrawShares()
{
    // The workers draw their shares while this thread draws its own; one unit of renderSync for
    // each share, the wait bounded at two seconds. After a time-out the frame goes on with what
    // is drawn, and the units still to come are collected before the next frame.
    fSharesDrawn.store(0, std::memory_order_relaxed);
    for (int32_t k = 1; k < threadCount; k++)
        workerParks[k].Resume();
    RenderShare(threadCount, 0);
    // The workers' shares are as long as this one and usually end within moments of it.
    SpinUntil(fSpinMicros,
        [&] { return fSharesDrawn.load(std::memory_order_acquire) >= threadCount - 1; });
    release_sem(renderSync);
    fSharesMissing
        = acquire_sem_etc(renderSync, threadCount, B_RELATIVE_TIMEOUT, 2000000) == B_TIMED_OUT;
}

void UniverseView::CollectMissingShares()
{
    // A timed-out acquisition takes nothing, so every share of that frame still owes its unit.
    if (!fSharesMissing)
        return;
    acquire_sem_etc(renderSync, threadCount, 0, 0);
    fSharesMissing = false;
}

void UniverseView::Render()
{
    CollectMissingShares();
    renderLock->Acquire();
    RenderBackground();
    if (running) {
        for (int32_t k = 0; k < threadCount; k++)
            RenderShare(threadCount, k);
    } else {
        StartWorkers();
        DrawShares();
    }
    RenderForeground();
    renderLock->Release();
}

void UniverseView::StartWorkers()
{
    if (workersStarted)
        return;
    renderSync = create_sem(0, "Render Sync Semaphore");
    fSpinMicros = unsigned(threadCount) <= std::thread::hardware_concurrency() ? kSpinMicros : 0;
    for (int32_t k = 1; k < threadCount; k++) {
        workerParks[k].Reset();
        workerParks[k].SetSpin(fSpinMicros);
        renderThreads[k - 1] = std::thread([this, k] {
            NameThread("Render Thread");
            RenderLoop(k);
        });
    }
    workersStarted = true;
}

void UniverseView::StopWorkers()
{
    if (!workersStarted)
        return;
    CollectMissingShares();
    for (int32_t k = 1; k < threadCount; k++) {
        workerParks[k].Release();
        renderThreads[k - 1].join();
    }
    delete_sem(renderSync);
    renderSync = nullptr;
    workersStarted = false;
}

void UniverseView::RenderLoop(int32_t index)
{
    while (workerParks[index].Park()) {
        RBitmap8* target = offscreen;
        if (fShareHook)
            fShareHook(index);
        RenderShareInto(target, threadCount, index);
        fSharesDrawn.fetch_add(1, std::memory_order_release);
        release_sem(renderSync);
    }
}

void UniverseView::Blit()
{
    // A frame that cannot be handed over within 0.1 s is not shown, and a resize waits for a
    // frame that is; so does it while a late worker may still draw into the offscreen.
    if (!fFrames.HandOver(*offscreen) || fSharesMissing || !frameResized.exchange(false))
        return;
    // A resize takes effect after a frame was shown: until then the old offscreen is drawn.
    renderLock->Acquire();
    ReplaceOffscreen();
    renderLock->Release();
}

void UniverseView::MainRenderLoop()
{
    double shownFilter = distanceFilter.load();
    double shownContrast = stellarContrast.load();
    double shownFactor = lumFactor.load();
    renderLock->Acquire();
    StartWorkers();
    HideGreaterThan(shownFilter);
    CalculateLumCache();
    renderLock->Release();

    while (running) {
        const bigtime_t t0 = system_time();
        FrameLog::Note("render", this);
        CollectMissingShares();
        renderLock->Acquire();
        // The settings the controls write are read once a frame.
        const double filter = distanceFilter.load(std::memory_order_relaxed);
        if (filter != shownFilter) {
            HideGreaterThan(filter);
            shownFilter = filter;
        }
        const double factor = lumFactor.load(std::memory_order_relaxed);
        const double contrast = stellarContrast.load(std::memory_order_relaxed);
        if (factor != shownFactor || contrast != shownContrast) {
            CalculateLumCache();
            shownFactor = factor;
            shownContrast = contrast;
        }
        NextTransform();
        RenderBackground();
        DrawShares();
        RenderForeground();
        renderLock->Release();

        Blit();
        framesRendered++;

        renderLock->Acquire();
        UpdateData(selectedSystem.load(), targetSystem.load());
        renderLock->Release();

        // At most one frame a period; the wait ends early when the loop is to end.
        std::unique_lock lock(fSuspendLock);
        const bigtime_t dt = system_time() - t0;
        const bigtime_t period = fFramePeriod.load(std::memory_order_relaxed);
        if (dt < period) {
            fSuspendChanged.wait_for(
                lock, std::chrono::microseconds(period - dt), [&] { return !running; });
        }
        if (suspendRequested) {
            fSuspended = true;
            fSuspendChanged.wait(lock, [&] { return !suspendRequested || !running; });
            fSuspended = false;
        }
    }

    renderLock->Acquire();
    StopWorkers();
    renderLock->Release();
}
