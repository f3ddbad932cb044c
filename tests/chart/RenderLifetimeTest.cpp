// What the render threads hold on to while the interface thread frees things: a subscriber or
// help target deleted in the middle of a broadcast, and a worker still drawing after the frame
// stopped waiting for it while the window is resized.
#include "ChartFixture.h"

#include "core/MessageCodes.h"
#include "platform/qt/Messaging.h"

#include <QTest>
#include <atomic>
#include <future>
#include <thread>

using namespace std::chrono_literals;

namespace {

// A handler that counts what reaches it in a counter that outlives it.
class CountingHandler : public QObject, public BHandler {
public:
    explicit CountingHandler(std::atomic<int>* received)
        : fReceived(received)
    {
    }
    void MessageReceived(Message*) override { fReceived->fetch_add(1); }

private:
    std::atomic<int>* fReceived;
};

} // namespace

class RenderLifetimeTest : public ChartTest { };

TEST_F(RenderLifetimeTest, ASubscriberDeletedDuringABroadcastIsNeverWrittenTo)
{
    Universe* u = MakeUniverse({ { "Sol", 0, 0, 0, 4.7 }, { "Other", 3, 1, 2, 1.0 } });
    UniverseView* view = MakeView(u);
    std::atomic<int> received { 0 };
    auto* handler = new CountingHandler(&received);

    // The handler both subscribes to the broadcasts and shows the data line.
    Message subscribe(kStarInfoSubscribe);
    subscribe.AddPointer(kSIHandlerPtrString, handler);
    subscribe.AddInt32(kSIFlagsString, kSITargetChanged | kSIWithTarget);
    view->MessageReceived(&subscribe);
    view->SetStarInfoTarget(handler);

    // A render thread broadcasting as fast as it can, as the frame loop does, while this thread
    // deletes the handler; it goes on for as many rounds again afterwards.
    constexpr int kRoundsAfter = 4000;
    std::atomic<bool> deleted { false };
    std::atomic<bool> done { false };
    std::thread broadcaster([&] {
        for (int i = 0, after = 0; after < kRoundsAfter; i++) {
            const bool late = deleted.load();
            view->renderLock->Acquire();
            view->BroadcastSI(-1, i % 2);
            view->SetDataString(-1, i % 2);
            view->renderLock->Release();
            after += late;
        }
        done = true;
    });
    ASSERT_TRUE(QTest::qWaitFor(
        [&] {
            DeliverPostedMessages();
            return received.load() > 100;
        },
        10000));
    delete handler;
    deleted = true;
    const int beforeDeletion = received.load();
    while (!done.load())
        DeliverPostedMessages();
    broadcaster.join();
    DeliverPostedMessages();

    // Messages reached it while it lived, and nothing after.
    EXPECT_GT(beforeDeletion, 0);
    EXPECT_EQ(received.load(), beforeDeletion);
}

TEST_F(RenderLifetimeTest, ALateWorkerKeepsItsOffscreenUntilItHasDrawn)
{
    // A worker held back past the two-second wait of its frame while the window is resized: the
    // frame goes on without its share, but the offscreen it draws into is replaced only once
    // it is done.
    Universe* u = MakeGridUniverse();
    auto owned = MakeGridView(u, 2);
    UniverseView* view = owned.get();
    std::atomic<bool> holdNext { false };
    std::promise<void> held, letGo;
    std::shared_future<void> released = letGo.get_future().share();
    view->SetShareHook([&](int32_t) {
        if (holdNext.exchange(false)) {
            held.set_value();
            released.wait();
        }
    });
    view->show(); // a hidden widget hears of its resizes only when shown
    view->AttachedToWindow();
    ASSERT_TRUE(QTest::qWaitFor([&] { return view->FramesRendered() >= 2; }, 20000));
    ASSERT_EQ(view->FrontImage().width(), kGridView);

    holdNext = true;
    ASSERT_EQ(held.get_future().wait_for(20s), std::future_status::ready);
    view->resize(160, 120);
    // The frame whose share is missing is shown after its two-second wait.
    const int64_t frames = view->FramesRendered();
    ASSERT_TRUE(QTest::qWaitFor([&] { return view->FramesRendered() > frames; }, 20000));
    EXPECT_EQ(view->FrontImage().width(), kGridView);
    letGo.set_value();

    // Once the late share is in, the resize takes effect and frames go on at the new size.
    EXPECT_TRUE(QTest::qWaitFor([&] { return view->FrontImage().width() == 160; }, 20000));
    EXPECT_EQ(view->FrontImage().height(), 120);
    const int64_t later = view->FramesRendered();
    EXPECT_TRUE(QTest::qWaitFor([&] { return view->FramesRendered() >= later + 3; }, 20000));
    view->DetachedFromWindow();
}
