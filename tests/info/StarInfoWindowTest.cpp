// The star information window: its frame and view, the terminal thread typing the headers for
// real, closing, and the control window's button that opens it.
#include "catalog/TempCatalogue.h"
#include "info/StarInfoScreen.h"

#include "controls/ControlWindow.h"
#include "controls/ControlsOnTwoStars.h"
#include "core/MessageCodes.h"
#include "info/StarIView.h"
#include "info/StarInfoWindow.h"
#include "platform/qt/RecordingHandler.h"
#include "render/SpectralTables.h"
#include "resources/ResourceData.h"
#include "widgets/InfoView.h"

#include <QPointer>
#include <QTest>
#include <gtest/gtest.h>
#include <memory>

namespace {

class StarInfoWindowTest : public ::testing::Test {
protected:
    static void SetUpTestSuite() { InitResources(); }

    void SendUniverse(StarInfoWindow* window)
    {
        Message message(kUniversePointer);
        message.AddPointer(kUniversePtrString, &universe);
        ASSERT_TRUE(PostMessageToView(window, "Star Info View", message));
        DeliverPostedMessages();
    }

    Universe universe { 4 };
    RecordingHandler help;
};

// The headers' first and last rows as they read on the screen.
std::string FirstHeader()
{
    return RowOf({ { 0, "STAR 1" }, { 28, "SPECTRAL" }, { 40, "VISUAL" } });
}
std::string LastHeader()
{
    return RowOf({ { 0, "NAME" }, { 28, "CLASS" }, { 40, "DECLINATION" } });
}

} // namespace

TEST_F(StarInfoWindowTest, AFixedWindowHoldingOneTerminal)
{
    auto* window = new StarInfoWindow(BPoint(120, 150), "Star Info", &help);
    const std::unique_ptr<StarInfoWindow> owner(window);
    EXPECT_TRUE(window->isVisible());
    EXPECT_EQ(window->windowTitle(), "Star Info");
    EXPECT_EQ(window->geometry(), QRect(120, 150, 364, 185));
    EXPECT_EQ(window->minimumSize(), window->maximumSize()) << "the window is of fixed size";
    EXPECT_FALSE(window->windowFlags() & Qt::WindowMaximizeButtonHint);
    EXPECT_TRUE(window->testAttribute(Qt::WA_DeleteOnClose));

    StarIView* view = window->View();
    EXPECT_EQ(window->findChild<StarIView*>("Star Info View"), view);
    EXPECT_EQ(view->parentWidget(), window);
    // The view's frame is one pixel wider and taller than the window's.
    EXPECT_EQ(view->geometry(), QRect(0, 0, 365, 186));
    EXPECT_EQ(view->IGetTarget(), &help);
    EXPECT_STREQ(view->IGetInfo(), "Drop star here");
    EXPECT_TRUE(view->acceptDrops());
    // Shown, the terminal runs its thread; the screen waits for the universe.
    EXPECT_TRUE(view->IsRunning());
    EXPECT_EQ(view->Systems(), nullptr);
}

TEST_F(StarInfoWindowTest, TheTerminalThreadTypesTheHeadersOnceTheUniverseArrives)
{
    StarInfoWindow window(BPoint(120, 150), "Star Info", &help);
    window.setAttribute(Qt::WA_DeleteOnClose, false);
    StarIView* view = window.View();
    SendUniverse(&window);
    EXPECT_EQ(view->Systems(), &universe);
    // 60 characters a second: some three seconds of typing, then the trails fade and the thread
    // goes idle.
    EXPECT_TRUE(
        QTest::qWaitFor([view] { return view->HWTIsDone() && view->IsSuspended(); }, 60000));
    EXPECT_EQ(ScreenRow(*view, 0), FirstHeader());
    EXPECT_EQ(ScreenRow(*view, 9), LastHeader());
    EXPECT_EQ(ScreenRow(*view, 12), " C:");
    EXPECT_EQ(view->IntensityAt(0, 0), 0) << "the trail did not settle";
    EXPECT_GT(view->FramesShown(), 0);
    EXPECT_FALSE(view->FrontImage().isNull());
}

TEST_F(StarInfoWindowTest, ClosingDeletesTheWindowAndStopsItsThread)
{
    QPointer<StarInfoWindow> window = new StarInfoWindow(BPoint(120, 150), "Star Info", &help);
    SendUniverse(window);
    ASSERT_TRUE(window->View()->IsRunning());
    EXPECT_TRUE(window->close());
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    EXPECT_TRUE(window.isNull());
}

TEST(StarInfoFromControlWindow, TheButtonOpensAWindowOnTheUniverse)
{
    ControlsOnTwoStars program;
    ControlWindow& controls = program.controls;
    auto* window = program.Open<StarInfoWindow>("Show Info Window Button");
    ASSERT_NE(window, nullptr);
    EXPECT_EQ(controls.OtherWindows().size(), 1);
    EXPECT_EQ(window->windowTitle(), "Star Info");
    EXPECT_EQ(window->geometry(), QRect(120, 150, 364, 185));
    StarIView* view = window->View();
    EXPECT_EQ(view->IGetTarget(), controls.GetInfoView());
    // The universe came to the view by message, and with it the headers.
    EXPECT_EQ(view->Systems(), controls.GetUniverse());
    EXPECT_EQ(view->Count(), 2);
    view->DetachedFromWindow();
    TypeAll(*view);
    EXPECT_EQ(ScreenRow(*view, 0), FirstHeader());
    EXPECT_EQ(ScreenRow(*view, 9), LastHeader());

    // A second press opens a second window.
    auto* second = program.Open<StarInfoWindow>("Show Info Window Button");
    EXPECT_NE(second, nullptr);
    EXPECT_NE(second, window);
    EXPECT_EQ(controls.OtherWindows().size(), 2);
}
