// Handing finished frames from a render thread to the interface thread: the newest frame is the
// one painted, one paint request waits at a time, a paint that finds the lock busy is made up
// for, a busy lock drops a frame after its time-out, the render side allocates nothing per
// frame, and a view may go while its paint request still waits.
#include "platform/qt/FrameHandOver.h"
#include "platform/qt/BitmapImage.h"
#include "platform/qt/ThreadMailbox.h"
#include "render/RBitmap8.h"

#include "ShownPixels.h"

#include <QPainter>
#include <QTest>
#include <QWidget>
#include <atomic>
#include <chrono>
#include <cstdlib>
#include <future>
#include <gtest/gtest.h>
#include <memory>
#include <mutex>
#include <new>
#include <thread>

// Allocations made by each thread, counted for the test of the render side.
namespace {
thread_local int64_t tAllocations = 0;
}

void* operator new(std::size_t size)
{
    tAllocations++;
    if (void* memory = std::malloc(size ? size : 1))
        return memory;
    throw std::bad_alloc();
}
void operator delete(void* memory) noexcept
{
    std::free(memory);
}
void operator delete(void* memory, std::size_t) noexcept
{
    std::free(memory);
}

namespace {

using namespace std::chrono_literals;

constexpr int kWidth = 30, kHeight = 20; // pixels

// A view that paints what is handed over to it, and counts its paints.
class HandOverView : public QWidget {
public:
    HandOverView()
    {
        resize(kWidth, kHeight);
        // Whatever a paint leaves out shows in this colour, not in a frame's.
        QPalette palette;
        palette.setColor(QPalette::Window, QColor(255, 0, 255));
        setPalette(palette);
    }
    FrameHandOver frames { this };
    int paints = 0;

protected:
    void paintEvent(QPaintEvent*) override
    {
        paints++;
        QPainter painter(this);
        frames.Paint(painter);
    }
};

// A frame filled with one palette index.
std::unique_ptr<RBitmap8> FrameOf(uint8_t index)
{
    auto frame = std::make_unique<RBitmap8>(BRect(0, 0, kWidth - 1, kHeight - 1));
    frame->EraseMap(index);
    return frame;
}

// A picture of the view's size in the colour palette index shows as.
QImage Filled(uint8_t index)
{
    QImage image(kWidth, kHeight, QImage::Format_RGB32);
    image.fill(SystemColorTable()[index] | 0xff000000u);
    return image;
}

// The view shown, its first frame (index 1) on the screen and no paint request waiting.
void ShowWithFirstFrame(HandOverView& view)
{
    view.show();
    ASSERT_TRUE(QTest::qWaitForWindowExposed(&view));
    ASSERT_TRUE(view.frames.HandOver(*FrameOf(1)));
    ASSERT_TRUE(QTest::qWaitFor([&] { return ShownPixels(&view) == Filled(1); }, 5000));
}

} // namespace

TEST(FrameHandOver, TheNewestFrameIsPaintedAndTheOthersAreNeverConverted)
{
    HandOverView view;
    ShowWithFirstFrame(view);
    // Three frames handed over before the interface thread gets to them: only the last shows.
    for (uint8_t index : { 2, 3, 4 })
        ASSERT_TRUE(view.frames.HandOver(*FrameOf(index)));
    EXPECT_EQ(view.frames.FramesHandedOver(), 4);
    EXPECT_EQ(view.frames.FrontImage().pixelIndex(5, 5), 4);
    EXPECT_TRUE(QTest::qWaitFor([&] { return ShownPixels(&view) == Filled(4); }, 5000));
    // Painted again with nothing new, it shows the same frame.
    view.repaint();
    EXPECT_EQ(ShownPixels(&view), Filled(4));
}

TEST(FrameHandOver, OnePaintRequestWaitsAtATime)
{
    QWidget view;
    FrameHandOver frames(&view);
    ThreadMailbox::Instance().Deliver();
    auto frame = FrameOf(7);
    for (int i = 0; i < 5; i++)
        ASSERT_TRUE(frames.HandOver(*frame));
    EXPECT_EQ(ThreadMailbox::Instance().Deliver(), 1);
    // Once it is taken, the next frame asks again.
    ASSERT_TRUE(frames.HandOver(*frame));
    EXPECT_EQ(ThreadMailbox::Instance().Deliver(), 1);
}

TEST(FrameHandOver, APaintThatFindsTheLockBusyIsMadeUpForWithoutAnotherFrame)
{
    HandOverView view;
    ShowWithFirstFrame(view);
    ASSERT_TRUE(view.frames.HandOver(*FrameOf(2)));
    {
        // The paint the hand-over asked for comes while the lock is held (by a reader of the
        // front image, say).
        std::lock_guard hold(view.frames.Lock());
        const int paints = view.paints;
        ASSERT_TRUE(QTest::qWaitFor([&] { return view.paints > paints; }, 5000));
        EXPECT_NE(ShownPixels(&view), Filled(2));
    }
    // Nothing more is handed over, yet the frame is shown soon after the lock is let go.
    EXPECT_TRUE(QTest::qWaitFor([&] { return ShownPixels(&view) == Filled(2); }, 5000));
    EXPECT_EQ(view.frames.FramesHandedOver(), 2);
}

TEST(FrameHandOver, AFrameWaitsForTheLockOnlyUntilItsTimeOut)
{
    QWidget view;
    FrameHandOver frames(&view);
    ASSERT_TRUE(frames.HandOver(*FrameOf(1)));
    std::promise<void> held, letGo;
    std::thread holder([&] {
        frames.Lock().lock();
        held.set_value();
        letGo.get_future().wait();
        frames.Lock().unlock();
    });
    held.get_future().wait();
    // Given up after its time-out: the frame before it stays the newest.
    EXPECT_FALSE(frames.HandOver(*FrameOf(2), nullptr, 20ms));
    EXPECT_EQ(frames.FramesHandedOver(), 1);
    letGo.set_value();
    holder.join();
    EXPECT_EQ(frames.FrontImage().pixelIndex(0, 0), 1);
    ASSERT_TRUE(frames.HandOver(*FrameOf(3)));
    EXPECT_EQ(frames.FrontImage().pixelIndex(0, 0), 3);
    ThreadMailbox::Instance().Deliver();
}

TEST(FrameHandOver, FramesComeWithTheirOwnPalette)
{
    QList<QRgb> greys;
    for (int i = 0; i < 256; i++)
        greys.push_back(qRgb(i, i, i));
    HandOverView view;
    ShowWithFirstFrame(view);
    ASSERT_TRUE(view.frames.HandOver(*FrameOf(100), &greys));
    QImage grey(kWidth, kHeight, QImage::Format_RGB32);
    grey.fill(qRgb(100, 100, 100));
    EXPECT_TRUE(QTest::qWaitFor([&] { return ShownPixels(&view) == grey; }, 5000));
    EXPECT_EQ(view.frames.FrontImage().color(100), qRgb(100, 100, 100));
}

TEST(FrameHandOver, TheRenderSideAllocatesNothingPerFrame)
{
    HandOverView view;
    ShowWithFirstFrame(view);
    auto frame = FrameOf(5);
    // Each of the three buffers takes the frame's size once.
    for (int i = 0; i < 3; i++) {
        ASSERT_TRUE(view.frames.HandOver(*frame));
        ThreadMailbox::Instance().Deliver();
        view.repaint();
    }
    int64_t allocations = 0;
    for (int i = 0; i < 20; i++) {
        const int64_t before = tAllocations;
        ASSERT_TRUE(view.frames.HandOver(*frame)); // posts a paint request every time
        allocations += tAllocations - before;
        // The interface thread takes the request and paints, as between two frames.
        ThreadMailbox::Instance().Deliver();
        view.repaint();
    }
    EXPECT_EQ(allocations, 0);
}

TEST(FrameHandOver, AViewMayGoWhileItsPaintRequestWaits)
{
    auto view = std::make_unique<HandOverView>();
    ASSERT_TRUE(view->frames.HandOver(*FrameOf(1)));
    view.reset();
    // The request finds its hand-over gone and does nothing.
    EXPECT_EQ(ThreadMailbox::Instance().Deliver(), 1);
}
