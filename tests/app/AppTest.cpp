// The application object: the spectral tables it builds and the end of the program.
#include "ThreadNames.h"
#include "app/ThreeDNightdomeApp.h"
#include "chart/UniverseWindow.h"
#include "controls/ControlWindow.h"
#include "core/MessageCodes.h"
#include "platform/qt/Messaging.h"
#include "render/SpectralTables.h"

#include <QIcon>
#include <QImage>
#include <QPointer>
#include <QTest>
#include <QTimer>
#include <QWindow>
#include <gtest/gtest.h>

namespace {

// The application object as main makes it, with no options.
ThreeDNightdomeApp* NewApplication()
{
    // The test's own QApplication exists, so these are not kept.
    int argc = 1;
    char name[] = "nightdome";
    char* argv[] = { name, nullptr };
    return new ThreeDNightdomeApp(argc, argv);
}

// Runs the program's event loop; false when it had not ended after ten seconds and was stopped.
bool RunsToItsEnd(ThreeDNightdomeApp* application)
{
    bool timedOut = false;
    QTimer guard; // ends a run that would not end
    guard.setSingleShot(true);
    QObject::connect(&guard, &QTimer::timeout, [&] {
        timedOut = true;
        QCoreApplication::quit();
    });
    guard.start(10000);
    EXPECT_EQ(application->Run(), 0);
    return !timedOut;
}

} // namespace

TEST(ThreeDNightdomeApp, BuildsTheSpectralTablesAndOpensTheControls)
{
    auto* application = NewApplication();
    ASSERT_NE(gSpectralCTable, nullptr);
    // Entry 127 of the M table is its class colour one step short; entry 255 of every table is
    // grey 225 one step short.
    const rgb_color m127 = gSpectralCTable[6].colors[127];
    EXPECT_EQ(m127.red, 223);
    EXPECT_EQ(m127.green, 124);
    EXPECT_EQ(m127.blue, 124);
    for (int t = 0; t < 7; t++) {
        const rgb_color last = gSpectralCTable[t].colors[255];
        EXPECT_GE(last.red, 224) << t;
        EXPECT_LE(last.red, 225) << t;
    }
    // The F table runs from black to grey, then stays grey.
    EXPECT_EQ(gSpectralCTable[3].colors[0].red, 0);
    EXPECT_EQ(gSpectralCTable[3].colors[128].red, 225);
    EXPECT_EQ(gSpectralCTable[3].colors[200].green, 225);
    ControlWindow* controls = application->GetControlWindow();
    ASSERT_NE(controls, nullptr);
    EXPECT_EQ(controls->windowTitle(), "3D Nightdome");
    EXPECT_EQ(controls->geometry().topLeft(), QPoint(90, 60));
    delete application;
    EXPECT_EQ(gSpectralCTable, nullptr);
}

TEST(ThreeDNightdomeApp, ClosingTheControlsEndsTheProgramWithChartsOpen)
{
    auto* application = NewApplication();
    ControlWindow* controls = application->GetControlWindow();
    ASSERT_EQ(controls->UniverseWindows().size(), 1);
    QTimer::singleShot(100, controls, [controls] { controls->close(); });
    const bool ended = RunsToItsEnd(application);
    EXPECT_TRUE(ended) << "the program did not end";
    delete application;
}

TEST(ThreeDNightdomeApp, QuittingWithWindowsOpenEndsEveryThreadItStarted)
{
    auto* application = NewApplication();
    ControlWindow* controls = application->GetControlWindow();
    bool opened = false;
    QTimer::singleShot(100, controls, [&] {
        // Three charts more, a star information window (its terminal thread) and a diagram.
        for (const char* button : { "New Nightdome Button", "New Nightdome Button",
                 "New Nightdome Button", "Show Info Window Button", "Show H-R Window Button" }) {
            auto* widget = controls->findChild<QWidget*>(button);
            if (!widget)
                return;
            QTest::mouseClick(widget, Qt::LeftButton, Qt::NoModifier, QPoint(16, 16));
            DeliverPostedMessages(); // the button's command
        }
        opened = QTest::qWaitFor(
            [&] {
                const auto names = ThreadNames();
                return Count(names, "Main Render Thr") == 4 && Count(names, "Terminal Thread") == 1;
            },
            5000);
        controls->close();
    });
    const bool ended = RunsToItsEnd(application);
    EXPECT_TRUE(opened) << "the windows did not open, or their threads did not start";
    EXPECT_TRUE(ended) << "the program did not end";
    delete application;
    const auto names = ThreadNames();
    EXPECT_EQ(Count(names, "Main Render Thr"), 0);
    EXPECT_EQ(Count(names, "Render Thread"), 0);
    EXPECT_EQ(Count(names, "Terminal Thread"), 0);
}

TEST(ThreeDNightdomeApp, ClosingTheOnlyChartLeavesTheProgramRunning)
{
    auto* application = NewApplication();
    ControlWindow* controls = application->GetControlWindow();
    ASSERT_EQ(controls->UniverseWindows().size(), 1);
    QPointer<UniverseWindow> chart = controls->UniverseWindows().first().data();
    bool stillRunning = false;
    qsizetype chartsAfter = -1;
    // Closed as a window manager closes it.
    QTimer::singleShot(100, controls, [&] { chart->windowHandle()->close(); });
    // Once the chart has been deleted, which follows its close, a quit the close asked for has
    // been delivered too. Only then does a new chart open: showing a window calls off a quit
    // still waiting to be delivered.
    QTimer poll;
    QObject::connect(&poll, &QTimer::timeout, [&] {
        if (!chart.isNull())
            return;
        poll.stop();
        stillRunning = true;
        Message open(kNewUniverseWindow);
        controls->MessageReceived(&open);
        chartsAfter = controls->UniverseWindows().size();
        controls->close();
    });
    poll.start(10);
    const bool ended = RunsToItsEnd(application);
    EXPECT_TRUE(stillRunning) << "closing the only chart ended the program";
    EXPECT_EQ(chartsAfter, 1);
    EXPECT_TRUE(ended) << "closing the controls did not end the program";
    delete application;
}

TEST(ThreeDNightdomeApp, CtrlQInAChartEndsTheProgram)
{
    auto* application = NewApplication();
    ControlWindow* controls = application->GetControlWindow();
    ASSERT_EQ(controls->UniverseWindows().size(), 1);
    QPointer<UniverseWindow> chart = controls->UniverseWindows().first().data();
    bool typed = false;
    QTimer::singleShot(100, controls, [&] {
        chart->activateWindow();
        if (!QTest::qWaitForWindowActive(chart))
            return;
        typed = true;
        QTest::keyClick(chart->windowHandle(), Qt::Key_Q, Qt::ControlModifier);
    });
    const bool ended = RunsToItsEnd(application);
    EXPECT_TRUE(typed) << "the chart never became the active window";
    EXPECT_TRUE(ended) << "Ctrl+Q did not end the program";
    EXPECT_FALSE(controls->isVisible());
    delete application;
}

TEST(ThreeDNightdomeApp, NamesItselfToTheDesktopAndCarriesItsIcons)
{
    auto* application = NewApplication();
    // The desktop entry and the icons are installed under this name.
    EXPECT_EQ(QGuiApplication::desktopFileName(), ND_DESKTOP_ID);
    EXPECT_STREQ(kDesktopFileId, ND_DESKTOP_ID);
    EXPECT_EQ(QCoreApplication::applicationVersion(), ND_VERSION);
    const QIcon icon = QGuiApplication::windowIcon();
    for (int size : { 16, 32, 48, 64, 128, 256 }) {
        EXPECT_TRUE(icon.availableSizes().contains(QSize(size, size))) << size;
        const QImage image = icon.pixmap(QSize(size, size)).toImage();
        ASSERT_EQ(image.size(), QSize(size, size));
        // A round dome: clear corners, an opaque middle.
        EXPECT_EQ(qAlpha(image.pixel(0, 0)), 0) << size;
        EXPECT_EQ(qAlpha(image.pixel(size / 2, size / 2)), 255) << size;
    }
    delete application;
}
