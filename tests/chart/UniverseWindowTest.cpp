// The chart's window: its layout, pausing while it cannot be seen, and what it tells the
// controlling window.
#include "ChartFixture.h"

#include "chart/UniverseWindow.h"
#include "core/MessageCodes.h"
#include "platform/qt/RecordingHandler.h"
#include "widgets/IToggleButton.h"
#include "widgets/InfoView.h"

#include <QPointer>
#include <QTest>

namespace {

// The chart finished its frame and its main render thread waits to be resumed.
bool FramesStop(UniverseView* view)
{
    return QTest::qWaitFor([&] { return view->IsSuspended(); }, 5000);
}

double CameraDistance(UniverseView* view)
{
    view->renderLock->Acquire();
    const double distance = view->cameraDistance;
    view->renderLock->Release();
    return distance;
}

bool FramesRun(UniverseView* view)
{
    const int64_t now = view->FramesRendered();
    return QTest::qWaitFor([&] { return view->FramesRendered() >= now + 3; }, 5000);
}

std::vector<const Message*> WithCode(const RecordingHandler& handler, uint32_t what)
{
    std::vector<const Message*> found;
    for (const Message& m : handler.received) {
        if (m.what == what)
            found.push_back(&m);
    }
    return found;
}

} // namespace

class UniverseWindowTest : public ChartTest {
protected:
    void SetUp() override
    {
        universe = MakeUniverse(
            { { "The Sun", 0, 0, 0, 4.83 }, { "Sirius", -0.49, -0.76, 2.48, 1.45 } });
        controller.setWindowTitle("controls");
    }

    Universe* universe = nullptr;
    RecordingHandler controller;
};

TEST_F(UniverseWindowTest, TheStripAndToggleKeepTheirPlacesAsTheWindowResizes)
{
    auto* window
        = new UniverseWindow(BPoint(90, 140), 328, 340, "Nightdome", &controller, universe);
    QPointer<UniverseWindow> alive = window;
    EXPECT_EQ(window->windowTitle(), "Nightdome");
    EXPECT_EQ(window->width(), 329);
    auto* strip = window->findChild<InfoView*>("SystemName");
    auto* toggle = window->findChild<IToggleButton*>("Toggle Button");
    auto* view = window->findChild<UniverseView*>("UniverseView");
    ASSERT_TRUE(strip && toggle && view);
    EXPECT_EQ(view, window->View());
    EXPECT_STREQ(toggle->IGetInfo(), "Toggle Clipping Sphere");
    EXPECT_STREQ(strip->IGetInfo(), "Star Information");

    window->resize(500, 400);
    EXPECT_EQ(view->geometry(), QRect(0, 0, 500, 388));
    EXPECT_EQ(strip->geometry(), QRect(0, 388, 488, 12));
    EXPECT_EQ(toggle->geometry(), QRect(488, 388, 12, 12));
    window->resize(200, 150);
    EXPECT_EQ(view->geometry(), QRect(0, 0, 200, 138));
    EXPECT_EQ(strip->geometry(), QRect(0, 138, 188, 12));
    EXPECT_EQ(toggle->geometry(), QRect(188, 138, 12, 12));

    // The toggle works the chart's overlay.
    EXPECT_TRUE(view->showClipSphere);
    QTest::mouseClick(toggle, Qt::LeftButton, {}, QPoint(5, 5));
    DeliverPostedMessages();
    EXPECT_FALSE(view->showClipSphere);
    window->close();
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    EXPECT_TRUE(alive.isNull());
}

TEST_F(UniverseWindowTest, MinimisingStopsTheChartAndRestoringGoesOn)
{
    auto* window
        = new UniverseWindow(BPoint(90, 140), 328, 340, "Nightdome", &controller, universe);
    UniverseView* view = window->View();
    ASSERT_TRUE(FramesRun(view));
    view->renderLock->Acquire();
    view->cameraDistance = 12.5;
    view->renderLock->Release();
    window->showMinimized();
    ASSERT_TRUE(FramesStop(view));
    const int64_t frames = view->FramesRendered();
    EXPECT_EQ(CameraDistance(view), 12.5);
    EXPECT_EQ(view->FramesRendered(), frames); // no frame while it waits
    window->showNormal();
    EXPECT_TRUE(FramesRun(view));
    EXPECT_FALSE(view->IsSuspended());
    EXPECT_EQ(CameraDistance(view), 12.5); // nothing moves it: the camera is where it was

    window->hide();
    EXPECT_TRUE(FramesStop(view));
    window->show();
    EXPECT_TRUE(FramesRun(view));
    window->close();
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
}

TEST_F(UniverseWindowTest, ActivationAndClosingAreReportedToTheController)
{
    auto* first = new UniverseWindow(BPoint(90, 140), 328, 340, "Nightdome", &controller, universe);
    auto* second
        = new UniverseWindow(BPoint(450, 140), 328, 340, "Nightdome", &controller, universe);
    second->activateWindow();
    ASSERT_TRUE(QTest::qWaitForWindowActive(second));
    first->activateWindow();
    ASSERT_TRUE(QTest::qWaitForWindowActive(first));
    DeliverPostedMessages();
    const auto activated = WithCode(controller, kUniverseWindowActivated);
    ASSERT_GE(activated.size(), 2u);
    EXPECT_EQ(activated[activated.size() - 2]->FindPointer(kUWPointerString), second);
    EXPECT_EQ(activated.back()->FindPointer(kUWPointerString), first);

    second->close();
    DeliverPostedMessages();
    const auto closed = WithCode(controller, kUniverseWindowQuitting);
    ASSERT_EQ(closed.size(), 1u);
    EXPECT_EQ(closed[0]->FindPointer(kUWPointerString), second);
    first->close();
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
}

TEST_F(UniverseWindowTest, FiftyChartsOpenedPausedAndClosed)
{
    for (int round = 0; round < 50; round++) {
        auto* window
            = new UniverseWindow(BPoint(90, 140), 160, 120, "Nightdome", &controller, universe);
        UniverseView* view = window->View();
        ASSERT_TRUE(QTest::qWaitFor([&] { return view->FramesRendered() >= 1; }, 5000)) << round;
        if (round % 2) {
            view->Suspend();
            view->Resume();
        }
        if (round % 3 == 0)
            window->showMinimized();
        window->close();
        QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    }
    DeliverPostedMessages();
    EXPECT_EQ(WithCode(controller, kUniverseWindowQuitting).size(), 50u);
}
