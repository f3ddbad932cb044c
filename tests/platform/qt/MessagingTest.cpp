#include "platform/qt/RecordingHandler.h"

#include "core/MessageCodes.h"
#include "platform/qt/ThreadMailbox.h"

#include <QApplication>
#include <QPointer>
#include <atomic>
#include <chrono>
#include <functional>
#include <gtest/gtest.h>
#include <memory>
#include <thread>

TEST(Messaging, PostedMessagesArriveLaterThroughTheEventLoop)
{
    RecordingHandler handler;
    Message message(kStarMessage);
    message.AddInt32(kSystemIndexString, 5);
    ASSERT_TRUE(PostMessage(&handler, message));
    EXPECT_TRUE(handler.received.empty()); // posting is not calling
    message.AddInt32(kSystemIndexString, 6); // the posted copy is not the caller's message
    DeliverPostedMessages();
    ASSERT_EQ(handler.received.size(), 1u);
    EXPECT_EQ(handler.received[0].what, kStarMessage);
    EXPECT_EQ(handler.received[0].FindInt32(kSystemIndexString), 5);
    EXPECT_FALSE(handler.received[0].HasInt32(kSystemIndexString, 1));
}

TEST(Messaging, MessagesArriveInTheOrderPosted)
{
    RecordingHandler handler;
    for (int32_t i = 0; i < 5; i++) {
        Message message(kStarMessage);
        message.AddInt32(kSystemIndexString, i);
        PostMessage(&handler, message);
    }
    DeliverPostedMessages();
    ASSERT_EQ(handler.received.size(), 5u);
    for (int32_t i = 0; i < 5; i++)
        EXPECT_EQ(handler.received[i].FindInt32(kSystemIndexString), i);
}

TEST(Messaging, ToAViewOfAWindowByItsName)
{
    QWidget window;
    auto* view = new RecordingHandler(&window);
    view->setObjectName("HRView");
    EXPECT_TRUE(PostMessageToView(&window, "HRView", Message(kUniversePointer)));
    EXPECT_FALSE(PostMessageToView(&window, "Star Info View", Message(kUniversePointer)));
    EXPECT_FALSE(PostMessageToView(nullptr, "HRView", Message(kUniversePointer)));
    DeliverPostedMessages();
    ASSERT_EQ(view->received.size(), 1u);
    EXPECT_EQ(view->received[0].what, kUniversePointer);
}

TEST(Messaging, PostingToAClosedWindowDoesNothing)
{
    auto* window = new RecordingHandler;
    window->setAttribute(Qt::WA_DeleteOnClose);
    window->show();
    QPointer<QObject> target = window;
    window->close();
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    ASSERT_TRUE(target.isNull());
    EXPECT_FALSE(PostMessage(target, Message(kClipToggle)));
    DeliverPostedMessages(); // nothing to deliver, nothing to crash
}

TEST(Messaging, AHandlerDeletedBeforeDeliveryNeverReceives)
{
    auto* handler = new RecordingHandler;
    ASSERT_TRUE(PostMessage(handler, Message(kClipToggle)));
    delete handler; // Qt drops the events still queued for it
    DeliverPostedMessages();
    SUCCEED();
}

TEST(Messaging, ObjectsThatAreNoHandlersIgnoreMessages)
{
    QObject plain;
    EXPECT_TRUE(PostMessage(&plain, Message(kClipToggle)));
    DeliverPostedMessages();
    SUCCEED();
}

TEST(Messaging, MessagesPostedFromOtherThreadsArriveOnTheHandlersThread)
{
    RecordingHandler handler;
    std::thread poster([&] {
        for (int32_t i = 0; i < 3; i++) {
            Message message(kStarMessage);
            message.AddInt32(kSystemIndexString, i);
            PostMessage(&handler, message);
        }
    });
    poster.join();
    DeliverPostedMessages();
    ASSERT_EQ(handler.received.size(), 3u);
    EXPECT_EQ(handler.received[2].FindInt32(kSystemIndexString), 2);
}

// A chart hands its next frame to the application's thread as soon as the last one was taken,
// for as long as it runs. Delivering what is posted must end while such a thread goes on, and
// must still run every chain of work that the work itself posts on the application's thread.
TEST(Messaging, DeliveringEndsWhileAnotherThreadKeepsHandingOverWork)
{
    ThreadMailbox& mailbox = ThreadMailbox::Instance();
    std::atomic<bool> stop { false };
    std::atomic<int> posted { 0 };
    constexpr int kGiveUp = 3000; // hand-overs before the poster stops by itself
    std::thread poster([&] {
        while (!stop.load() && posted.load() < kGiveUp) {
            auto taken = std::make_shared<std::atomic<bool>>(false);
            mailbox.Post([taken] {
                taken->store(true);
                // Showing a frame takes a while; the next one is handed over meanwhile.
                std::this_thread::sleep_for(std::chrono::milliseconds(1));
            });
            posted++;
            while (!taken->load() && !stop.load())
                std::this_thread::yield();
        }
    });
    while (posted.load() == 0)
        std::this_thread::yield();

    int chain = 0;
    std::function<void()> link = [&] {
        if (++chain < 5)
            mailbox.Post(link);
    };
    mailbox.Post(link);
    DeliverPostedMessages();
    const bool posterStillRunning = posted.load() < kGiveUp;
    stop = true;
    poster.join();
    DeliverPostedMessages();
    EXPECT_TRUE(posterStillRunning) << "delivering went on until the poster gave up";
    EXPECT_EQ(chain, 5);
}
