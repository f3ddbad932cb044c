// The application object: the spectral tables it builds and the end of the program.
#include "app/ThreeDNightdomeApp.h"
#include "chart/UniverseWindow.h"
#include "controls/ControlWindow.h"
#include "core/MessageCodes.h"
#include "render/SpectralTables.h"

#include <QPointer>
#include <QTimer>
#include <QWindow>
#include <gtest/gtest.h>

TEST(ThreeDNightdomeApp, BuildsTheSpectralTablesAndOpensTheControls)
{
    int argc = 1;
    char name[] = "nightdome";
    char* argv[] = { name, nullptr };
    auto* application = new ThreeDNightdomeApp(argc, argv);
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
    int argc = 1;
    char name[] = "nightdome";
    char* argv[] = { name, nullptr };
    auto* application = new ThreeDNightdomeApp(argc, argv);
    ControlWindow* controls = application->GetControlWindow();
    ASSERT_EQ(controls->UniverseWindows().size(), 1);
    bool timedOut = false;
    QTimer::singleShot(100, controls, [controls] { controls->close(); });
    QTimer guard; // ends a run that would not end, and goes away with this test
    guard.setSingleShot(true);
    QObject::connect(&guard, &QTimer::timeout, [&] {
        timedOut = true;
        QCoreApplication::quit();
    });
    guard.start(10000);
    EXPECT_EQ(application->Run(), 0);
    EXPECT_FALSE(timedOut) << "the program did not end";
    delete application;
}

TEST(ThreeDNightdomeApp, ClosingTheOnlyChartLeavesTheProgramRunning)
{
    int argc = 1;
    char name[] = "nightdome";
    char* argv[] = { name, nullptr };
    auto* application = new ThreeDNightdomeApp(argc, argv);
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
    bool timedOut = false;
    QTimer guard; // ends a run that would not end, and goes away with this test
    guard.setSingleShot(true);
    QObject::connect(&guard, &QTimer::timeout, [&] {
        timedOut = true;
        QCoreApplication::quit();
    });
    guard.start(10000);
    EXPECT_EQ(application->Run(), 0);
    EXPECT_TRUE(stillRunning) << "closing the only chart ended the program";
    EXPECT_EQ(chartsAfter, 1);
    EXPECT_FALSE(timedOut) << "closing the controls did not end the program";
    delete application;
}
