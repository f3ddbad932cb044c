// The frame loop on its threads: workers, pausing, resizing and stopping.
#include "ChartFixture.h"
#include "ShownPixels.h"
#include "ThreadNames.h"

#include <QTest>
#include <algorithm>
#include <chrono>
#include <future>
#include <thread>

using namespace std::chrono_literals;

namespace {

bool WaitForFrames(UniverseView* view, int64_t frames)
{
    return QTest::qWaitFor([&] { return view->FramesRendered() >= frames; }, 10000);
}

} // namespace

class UniverseViewTest : public ChartTest {
protected:
    static TimedLock& HandOver(UniverseView* view) { return view->Frames().Lock(); }
    static int32_t FrontWidth(UniverseView* view)
    {
        return view->Frames().FrontImageUnderLock().width();
    }
};

TEST_F(UniverseViewTest, OneThreadDrawsEverySystemWithoutWorkers)
{
    Universe* u = MakeUniverse({ { "Sol", 0, 0, 0, 4.7 }, { "Other", 3, 1, 2, 1.0 } });
    UniverseView* view = MakeView(u, 1);
    view->AttachedToWindow();
    ASSERT_TRUE(WaitForFrames(view, 3));
    const auto during = ThreadNames();
    EXPECT_EQ(Count(during, "Main Render Thr"), 1); // "Main Render Thread", cut to 15
    EXPECT_EQ(Count(during, "Render Thread"), 0);
    // Frames follow each other at the 15 ms pace: the one unit the main thread releases is the
    // one it waits for, never the two-second time-out.
    const int64_t start = view->FramesRendered();
    EXPECT_TRUE(QTest::qWaitFor([&] { return view->FramesRendered() >= start + 10; }, 1900));
    view->DetachedFromWindow();
    EXPECT_EQ(Count(ThreadNames(), "Main Render Thr"), 0);
    // The frames were shown: the centre cross is in the front buffer.
    EXPECT_EQ(view->FrontImage().pixelIndex(40, 49), 55);
}

TEST_F(UniverseViewTest, WorkersShareTheFrameAndEndWithTheView)
{
    Universe* u = MakeUniverse({ { "Sol", 0, 0, 0, 4.7 }, { "Other", 3, 1, 2, 1.0 } });
    UniverseView* view = MakeView(u, 3);
    view->AttachedToWindow();
    ASSERT_TRUE(WaitForFrames(view, 3));
    const auto during = ThreadNames();
    EXPECT_EQ(Count(during, "Main Render Thr"), 1);
    EXPECT_EQ(Count(during, "Render Thread"), 2);
    view->DetachedFromWindow();
    EXPECT_EQ(Count(ThreadNames(), "Main Render Thr"), 0);
    EXPECT_EQ(Count(ThreadNames(), "Render Thread"), 0);
}

TEST_F(UniverseViewTest, SuspendAndResumeOutsideTheLoopDoNothing)
{
    Universe* u = MakeUniverse({ { "Sol", 0, 0, 0, 4.7 } });
    UniverseView* view = MakeView(u);
    view->Suspend();
    EXPECT_FALSE(view->suspendRequested);
    view->AttachedToWindow();
    ASSERT_TRUE(WaitForFrames(view, 1));
    view->DetachedFromWindow();
    EXPECT_FALSE(view->IsRunning());
    view->suspendRequested = true;
    view->Resume(); // after the loop ended: nothing
    EXPECT_TRUE(view->suspendRequested);
}

TEST_F(UniverseViewTest, ASuspendedChartDrawsNothingUntilResumed)
{
    Universe* u = MakeUniverse({ { "Sol", 0, 0, 0, 4.7 } });
    UniverseView* view = MakeView(u);
    view->AttachedToWindow();
    ASSERT_TRUE(WaitForFrames(view, 2));
    view->cameraVelocityZ = 0.5; // the camera moves out a little every frame
    const int64_t moving = view->FramesRendered();
    ASSERT_TRUE(WaitForFrames(view, moving + 2));
    view->Suspend();
    // It finishes the frame it is in, then waits.
    ASSERT_TRUE(QTest::qWaitFor([&] { return view->IsSuspended(); }, 5000));
    const int64_t settled = view->FramesRendered();
    view->renderLock->Acquire();
    const double distance = view->cameraDistance;
    view->renderLock->Release();
    ASSERT_GT(distance, 25.0);
    // Paused: the main render thread waits to be resumed, so no frame can follow.
    EXPECT_TRUE(view->IsSuspended());
    EXPECT_EQ(view->FramesRendered(), settled);
    view->Resume();
    EXPECT_TRUE(WaitForFrames(view, settled + 3));
    EXPECT_FALSE(view->IsSuspended());
    view->DetachedFromWindow();
    // The camera went on from where it stood, still moving out a little.
    EXPECT_GT(view->cameraDistance, distance);
    view->DetachedFromWindow();
}

TEST_F(UniverseViewTest, ClosingASuspendedChartEndsAllItsThreads)
{
    Universe* u = MakeUniverse({ { "Sol", 0, 0, 0, 4.7 } });
    UniverseView* view = MakeView(u, 2);
    view->AttachedToWindow();
    ASSERT_TRUE(WaitForFrames(view, 2));
    view->Suspend();
    ASSERT_TRUE(QTest::qWaitFor([&] { return view->IsSuspended(); }, 5000));
    auto stopped = std::async(std::launch::async, [&] { view->DetachedFromWindow(); });
    ASSERT_EQ(stopped.wait_for(5s), std::future_status::ready);
    EXPECT_EQ(Count(ThreadNames(), "Main Render Thr"), 0);
    EXPECT_EQ(Count(ThreadNames(), "Render Thread"), 0);
}

TEST_F(UniverseViewTest, StoppingWakesTheLoopWaitingForItsNextFrame)
{
    Universe* u = MakeUniverse({ { "Sol", 0, 0, 0, 4.7 } });
    UniverseView* view = MakeView(u, 2);
    // A minute between frames: after its first frame the loop waits for the next one, far
    // longer than the bounded wait below, unless the stop wakes it.
    view->SetFramePeriod(60000000);
    view->AttachedToWindow();
    ASSERT_TRUE(WaitForFrames(view, 1));
    auto stopped = std::async(std::launch::async, [&] { view->DetachedFromWindow(); });
    const bool ended = stopped.wait_for(20s) == std::future_status::ready;
    EXPECT_TRUE(ended) << "the frame loop slept through the stop";
    stopped.wait();
    EXPECT_EQ(view->FramesRendered(), 1);
    EXPECT_EQ(Count(ThreadNames(), "Main Render Thr"), 0);
    EXPECT_EQ(Count(ThreadNames(), "Render Thread"), 0);
}

TEST_F(UniverseViewTest, AResizeShowsOnlyAfterAFrameIsHandedOver)
{
    Universe* u = MakeUniverse({ { "Sol", 0, 0, 0, 4.7 } });
    UniverseView* view = MakeView(u);
    view->show(); // a hidden widget hears of its resizes only when shown
    view->AttachedToWindow();
    ASSERT_TRUE(WaitForFrames(view, 2));
    ASSERT_EQ(view->FrontImage().width(), 100);

    // Another thread holds the hand-over lock, as a busy window would: frames are drawn but
    // not shown.
    TimedLock& handOver = HandOver(view);
    std::promise<void> held, letGo;
    std::thread holder([&] {
        handOver.lock();
        held.set_value();
        letGo.get_future().wait();
        handOver.unlock();
    });
    held.get_future().wait();
    view->resize(60, 50);
    const int64_t frames = view->FramesRendered();
    EXPECT_TRUE(QTest::qWaitFor([&] { return view->FramesRendered() >= frames + 3; }, 10000));
    EXPECT_EQ(FrontWidth(view), 100); // read while the holder keeps the lock
    letGo.set_value();
    holder.join();

    EXPECT_TRUE(QTest::qWaitFor([&] { return view->FrontImage().width() == 60; }, 10000));
    EXPECT_EQ(view->FrontImage().height(), 50);
    view->DetachedFromWindow();
    EXPECT_EQ(view->Frame().right, 59);
    EXPECT_EQ(view->Frame().bottom, 49);
}

TEST_F(UniverseViewTest, AStillChartIsPaintedThoughItsPaintFoundTheHandOverBusy)
{
    Universe* u = MakeUniverse({ { "Sol", 0, 0, 0, 4.7 } });
    UniverseView* view = MakeView(u);
    // One frame, then the loop waits an hour for the next: nothing more is handed over.
    view->SetFramePeriod(3600000000);
    view->show();
    ASSERT_TRUE(QTest::qWaitForWindowExposed(view));
    view->AttachedToWindow();
    ASSERT_TRUE(WaitForFrames(view, 1));
    const QImage frame = view->FrontImage().convertToFormat(QImage::Format_RGB32);
    ASSERT_TRUE(QTest::qWaitFor([&] { return ShownPixels(view) == frame; }, 10000));

    {
        // The window is uncovered while the hand-over lock is held.
        std::lock_guard hold(view->Frames().Lock());
        view->repaint();
    }
    EXPECT_TRUE(QTest::qWaitFor([&] { return ShownPixels(view) == frame; }, 10000));
    EXPECT_EQ(view->FramesRendered(), 1);
    view->DetachedFromWindow();
}
