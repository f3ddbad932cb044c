// Working the chart with the mouse, its texts, its broadcasts and the messages it takes.
#include "ChartFixture.h"

#include "core/MessageCodes.h"
#include "platform/qt/RecordingHandler.h"

#include <QTest>
#include <QWindow>

namespace {

// Three systems in a row across the middle of a 100 x 100 chart looking along z.
std::vector<TestSystem> Row()
{
    return {
        { "The Sun", 0, 0, 0.001, 4.83 }, // just in front of the camera
        { "Alpha", -10, 0, 25, 4.38, "G2V" },
        { "Beta", 10, 0, 25, 1.42, "A1V" },
    };
}

} // namespace

class PickingTest : public ChartTest {
protected:
    void SetUp() override
    {
        Universe* u = MakeUniverse(Row());
        view = MakeView(u);
        view->show();
        LookAlongZ(view);
        view->CalculateLumCache();
    }

    // A click that starts and ends on the same point, with `target` under the pointer.
    void ClickOn(int32_t target)
    {
        view->targetSystem = target;
        QTest::mouseClick(view, Qt::LeftButton, {}, QPoint(30, 30));
    }

    // Presses, then moves the pointer out of the 8 x 8 drag box and lets the timer see it.
    std::vector<Message> PressAndMove(int32_t target)
    {
        std::vector<Message> dragged;
        view->SetDragStarter([&](const Message& m) { dragged.push_back(m); });
        view->targetSystem = target;
        QCursor::setPos(view->mapToGlobal(QPoint(30, 30)));
        QTest::mousePress(view, Qt::LeftButton, {}, QPoint(30, 30));
        QCursor::setPos(view->mapToGlobal(QPoint(36, 30)));
        EXPECT_TRUE(QTest::qWaitFor([&] { return !dragged.empty(); }, 2000));
        QTest::mouseRelease(view, Qt::LeftButton, {}, QPoint(36, 30));
        return dragged;
    }

    UniverseView* view = nullptr;
};

TEST_F(PickingTest, PressingOnEmptySpaceAndMovingDragsEverythingShown)
{
    const auto dragged = PressAndMove(-1);
    ASSERT_EQ(dragged.size(), 1u);
    EXPECT_EQ(dragged[0].what, kStarArrayMessage);
    EXPECT_EQ(dragged[0].FindPointer(kSystemArrayPtrString), view->drawMask);
    EXPECT_EQ(view->GetSelectedSystem(), -1); // a drag is no click
}

TEST_F(PickingTest, PressingOnAStarAndMovingDragsThatStar)
{
    const auto dragged = PressAndMove(2);
    ASSERT_EQ(dragged.size(), 1u);
    EXPECT_EQ(dragged[0].what, kStarMessage);
    EXPECT_EQ(dragged[0].FindInt32(kSystemIndexString), 2);
}

TEST_F(PickingTest, AStillPressIsAClickNotADrag)
{
    std::vector<Message> dragged;
    view->SetDragStarter([&](const Message& m) { dragged.push_back(m); });
    view->targetSystem = 1;
    QCursor::setPos(view->mapToGlobal(QPoint(30, 30)));
    QTest::mousePress(view, Qt::LeftButton, {}, QPoint(30, 30));
    QCursor::setPos(view->mapToGlobal(QPoint(33, 27))); // inside the box
    QTest::qWait(120);
    QTest::mouseRelease(view, Qt::LeftButton, {}, QPoint(33, 27));
    EXPECT_TRUE(dragged.empty());
    EXPECT_EQ(view->GetSelectedSystem(), 1);
}

TEST_F(PickingTest, ThreeClicksSelectMakeOriginAndZoom)
{
    ClickOn(1);
    EXPECT_EQ(view->GetSelectedSystem(), 1);
    view->SetDataString(1, 1);
    EXPECT_STREQ(view->IGetInfo(), "Click star to change Origin");

    ClickOn(1);
    EXPECT_EQ(view->originSystem, 1);
    EXPECT_EQ(view->originOffset.x, 10);
    EXPECT_EQ(view->originOffset.z, -25);
    EXPECT_FALSE(view->zoomToOrigin);
    view->SetDataString(1, 1);
    EXPECT_STREQ(view->IGetInfo(), "Click star to zoom");

    ClickOn(1);
    EXPECT_TRUE(view->zoomToOrigin);
    EXPECT_EQ(view->GetSelectedSystem(), 1);
    int frames = 0;
    while (view->cameraDistance > 0.05 && frames++ < 100) {
        view->NextTransform();
        view->SetDataString(1, 1);
        if (view->cameraDistance > 0.05) {
            EXPECT_STREQ(view->IGetInfo(), "Click star to zoom");
        }
    }
    EXPECT_EQ(view->cameraDistance, 0.05);
    view->SetDataString(1, 1);
    EXPECT_STREQ(view->IGetInfo(), "Rotate to view constellations");
}

TEST_F(PickingTest, EmptySpaceReturnsToTheSunThenDeselects)
{
    view->originOffset.Set(10, 0, -25);
    view->originSystem = 1;
    view->userMask->SetStateSafe(2, false);
    ClickOn(-1);
    EXPECT_EQ(view->GetSelectedSystem(), 0);
    EXPECT_EQ(view->originSystem, 0);
    EXPECT_EQ(view->originOffset.x, 0);
    EXPECT_EQ(view->originOffset.z, 0);
    EXPECT_TRUE(view->userMask->GetStateSafe(2));
    EXPECT_EQ(view->drawMask->CountItems(true), 3);
    ClickOn(-1);
    EXPECT_EQ(view->GetSelectedSystem(), -1);
}

TEST_F(PickingTest, DataLinesAndHelpTextsLetterForLetter)
{
    view->SetDataString(-1, -1);
    EXPECT_STREQ(view->DataString(), "");
    EXPECT_STREQ(view->IGetInfo(), "Click to drag all visible stars to another view");

    view->SetDataString(-1, 2);
    EXPECT_STREQ(view->DataString(), "1: Beta ( 1.4 A1V )");
    EXPECT_STREQ(view->IGetInfo(), "Click star to make Selection or drag to another view");

    view->SetDataString(1, -1);
    EXPECT_STREQ(view->DataString(), "A: Alpha ( 4.4 G2V )  ");
    EXPECT_STREQ(view->IGetInfo(), "Click to deslect star");

    // Beta seen from Alpha, 20 pc away: 1.42 - 5 + 5 log10(20) = 2.925.
    view->SetDataString(1, 2);
    EXPECT_STREQ(view->DataString(),
        "Alpha --> 1: Beta ( 2.9 A1V )  ::  20.00 parsecs ( 65.20 light-years )");
    EXPECT_STREQ(view->IGetInfo(), "Click star to change Selection");

    view->originOffset.Set(1, 2, 3);
    view->SetDataString(-1, -1);
    EXPECT_STREQ(view->IGetInfo(), "Click to return Origin to the sun  [Home]");
}

TEST_F(PickingTest, TextsGoToTheirTargets)
{
    RecordingHandler help, strip;
    view->ISetTarget(&help);
    view->SetStarInfoTarget(&strip);
    view->mouseInside = true;
    view->UpdateData(-1, 2);
    DeliverPostedMessages();
    ASSERT_EQ(help.received.size(), 1u);
    EXPECT_STREQ(help.received[0].FindString(kInfoStringField),
        "Click star to make Selection or drag to another view");
    ASSERT_EQ(strip.received.size(), 1u);
    EXPECT_STREQ(strip.received[0].FindString(kInfoStringField), "1: Beta ( 1.4 A1V )");
    view->UpdateData(-1, 2); // nothing changed: nothing sent
    DeliverPostedMessages();
    EXPECT_EQ(strip.received.size(), 1u);
}

TEST_F(PickingTest, ASubscriberHearsOfTheTargetWithOnlyItsIndex)
{
    RecordingHandler subscriber;
    Message subscribe(kStarInfoSubscribe);
    subscribe.AddPointer(kSIHandlerPtrString, static_cast<QObject*>(&subscriber));
    subscribe.AddInt32(kSIFlagsString, kSITargetChanged | kSIWithTarget);
    view->MessageReceived(&subscribe);
    ASSERT_EQ(view->subscribers.CountItems(), 1);

    view->mouseInside = true;
    view->UpdateData(-1, 1);
    view->UpdateData(-1, 1);
    view->UpdateData(0, 1); // the selection changed, which it did not ask about
    view->UpdateData(0, 2);
    view->mouseInside = false;
    view->UpdateData(0, 1); // the pointer left the chart: nothing is published
    DeliverPostedMessages();
    ASSERT_EQ(subscriber.received.size(), 2u);
    for (const Message& m : subscriber.received) {
        EXPECT_EQ(m.what, kStarInfoBroadcast);
        EXPECT_EQ(m.CountFields(), 1);
    }
    EXPECT_EQ(subscriber.received[0].FindInt32(kSITargetIndexString), 1);
    EXPECT_EQ(subscriber.received[1].FindInt32(kSITargetIndexString), 2);

    Message unsubscribe(kStarInfoUnsubscribe);
    unsubscribe.AddPointer(kSIHandlerPtrString, static_cast<QObject*>(&subscriber));
    view->MessageReceived(&unsubscribe);
    EXPECT_EQ(view->subscribers.CountItems(), 0);
}

TEST_F(PickingTest, ADroppedStarIsSelectedShownAndMadeTheOrigin)
{
    view->userMask->SetStateSafe(2, false);
    view->HideGreaterThan(10000);
    Message star(kStarMessage);
    star.AddInt32(kSystemIndexString, 2);
    view->MessageReceived(&star);
    EXPECT_EQ(view->GetSelectedSystem(), 2);
    EXPECT_TRUE(view->drawMask->GetStateSafe(2));
    EXPECT_EQ(view->originSystem, 2);
    EXPECT_EQ(view->originOffset.x, -10);
}

TEST_F(PickingTest, WithControlHeldTheOriginStays)
{
    view->userMask->SetStateSafe(2, false);
    view->HideGreaterThan(10000);
    QWindow* window = view->window()->windowHandle();
    ASSERT_NE(window, nullptr);
    QTest::keyPress(window, Qt::Key_Control, Qt::ControlModifier);
    ASSERT_TRUE(QGuiApplication::keyboardModifiers() & Qt::ControlModifier);
    Message star(kStarMessage);
    star.AddInt32(kSystemIndexString, 2);
    view->MessageReceived(&star);
    QTest::keyRelease(window, Qt::Key_Control, Qt::NoModifier);
    EXPECT_EQ(view->GetSelectedSystem(), 2);
    EXPECT_TRUE(view->drawMask->GetStateSafe(2));
    EXPECT_EQ(view->originSystem, 0);
    EXPECT_EQ(view->originOffset.x, 0);
}

TEST_F(PickingTest, ADroppedSetReplacesWhatIsShown)
{
    StarSysMask only(3, false, 0);
    only.SetStateSafe(1, true);
    Message set(kStarArrayMessage);
    set.AddPointer(kSystemArrayPtrString, &only);
    view->MessageReceived(&set);
    EXPECT_EQ(view->drawMask->CountItems(true), 1);
    EXPECT_TRUE(view->drawMask->GetStateSafe(1));

    Message toggle(kClipToggle);
    EXPECT_TRUE(view->showClipSphere);
    view->MessageReceived(&toggle);
    EXPECT_FALSE(view->showClipSphere);
}

TEST_F(PickingTest, FindSystemTakesTheNearestUnderThePoint)
{
    // Alpha projects to (trunc(-10 x 99 / 25 + 49.5), 49) = (9, 49): its pick box runs from
    // 6 to 13 across and from 46 to 53 down.
    EXPECT_EQ(view->FindSystem(BPoint(9, 49)), 1);
    EXPECT_EQ(view->FindSystem(BPoint(6, 46)), 1);
    EXPECT_EQ(view->FindSystem(BPoint(13, 53)), 1);
    EXPECT_EQ(view->FindSystem(BPoint(14, 49)), -1);
    EXPECT_EQ(view->FindSystem(BPoint(9, 45)), -1);
    EXPECT_EQ(view->FindSystem(BPoint(50, 20)), -1);
}

TEST_F(PickingTest, ReturningToTheSunWithoutASystemAtTheOriginGoesBackToTheStart)
{
    // The Sun of this row stands 0.001 pc off the origin: no system is at (0, 0, 0).
    ClickOn(2);
    ClickOn(2);
    ASSERT_EQ(view->OriginSystem(), 2);
    ASSERT_EQ(view->originOffset.x, -10);
    view->ReturnOriginToSun();
    EXPECT_EQ(view->OriginSystem(), 0);
    EXPECT_EQ(view->originOffset.x, 0);
    EXPECT_EQ(view->originOffset.y, 0);
    EXPECT_EQ(view->originOffset.z, 0);
    // Nothing else of the click on empty space: the selection stays.
    EXPECT_EQ(view->GetSelectedSystem(), 2);
}

TEST_F(ChartTest, ReturningToTheSunFindsTheSystemAtTheOrigin)
{
    UniverseView* view = MakeView(MakeUniverse({
        { "Alpha", -10, 0, 25, 4.38 },
        { "The Sun", 0, 0, 0, 4.83 },
        { "Beta", 10, 0, 25, 1.42 },
    }));
    Message star(kStarMessage);
    star.AddInt32(kSystemIndexString, 2);
    view->MessageReceived(&star);
    ASSERT_EQ(view->OriginSystem(), 2);
    EXPECT_EQ(view->ReadOut().rfind("Origin: Beta\n", 0), 0u) << view->ReadOut();
    for (int i = 0; i < 200; i++)
        view->NextTransform();
    ASSERT_NEAR(view->cameraPosition.x, -10, 1e-9);
    view->ReturnOriginToSun();
    EXPECT_EQ(view->OriginSystem(), 1);
    EXPECT_EQ(view->originOffset.x, 0);
    EXPECT_EQ(view->originOffset.z, 0);
    EXPECT_EQ(view->ReadOut().rfind("Origin: The Sun\n", 0), 0u) << view->ReadOut();
    // The camera glides back over the next frames, as after any change of origin.
    for (int i = 0; i < 200; i++)
        view->NextTransform();
    EXPECT_NEAR(view->cameraPosition.x, 0, 1e-9);
    EXPECT_NEAR(view->cameraPosition.z, 0, 1e-9);
}
