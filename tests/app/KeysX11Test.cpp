// The real program's keys on a real X server, typed with xdotool, with and without a window
// manager: the arrow keys turn the chart that has the keyboard and Space stops it, Ctrl+N opens
// a second chart, F1 opens the help window once.
#include "ProgramX11Support.h"

#include <cmath>

namespace {

class Keys : public Program, public ::testing::WithParamInterface<bool> {
protected:
    bool WithWindowManager() const override { return GetParam(); }

    // Gives window the keyboard: through the window manager when one runs, directly otherwise.
    void Focus(unsigned long window) const
    {
        RunXdotool({ WithWindowManager() ? "windowactivate" : "windowfocus", "--sync",
            QString::number(window) });
    }

    // Whether the chart's stars stay exactly as they are for a second.
    static bool StandsStill()
    {
        const QImage now = SteadyStars();
        QTest::qWait(1000);
        return DifferentPixels(now, Grab(StarArea(kChartOrigin))) == 0;
    }
};

} // namespace

TEST_P(Keys, ArrowsTurnTheChartSpaceStopsItCtrlNOpensAChartF1ShowsHelp)
{
    ASSERT_TRUE(StartedAtTheSun());
    const unsigned long chart = WindowNamed("Nightdome");
    ASSERT_NE(chart, 0u);
    RestThePointer();
    Focus(chart);

    // Space stops the chart's steady turn at the start.
    RunXdotool({ "key", "space" });
    ASSERT_TRUE(StandsStill()) << "Space did not stop the chart";
    const double dec = Settled(kChartOrigin, "DEC: ");
    ASSERT_GT(dec, -1e8);

    // Right, three times: the chart pitches as the trackball dragged right makes it, so its
    // declination changes, by about 0.6 radian, and stays once the turn has died away.
    const QImage before = SteadyStars();
    RunXdotool({ "key", "--delay", "100", "Right", "Right", "Right" });
    const QImage turned = NewStars(before);
    EXPECT_GT(DifferentPixels(before, turned), 50);
    const std::string readOut = WaitForReadOut(kChartOrigin, [dec](const std::string& t) {
        return std::abs(Field(t, "DEC: ") - dec) > 5 && t.find('?') == std::string::npos;
    });
    const double pitched = Settled(kChartOrigin, "DEC: ");
    EXPECT_GT(std::abs(pitched - dec), 5) << readOut;

    // Up, three times: a turn that goes on, as after a drag up; Space stops it.
    RunXdotool({ "key", "--delay", "100", "Up", "Up", "Up" });
    const QImage spinning = Grab(StarArea(kChartOrigin));
    EXPECT_TRUE(QTest::qWaitFor(
        [&] { return DifferentPixels(spinning, Grab(StarArea(kChartOrigin))) > 50; }, 5000))
        << "Up did not turn the chart";
    QTest::qWait(500);
    EXPECT_FALSE(StandsStill()) << "the turn Up gave died away by itself";
    RunXdotool({ "key", "space" });
    EXPECT_TRUE(StandsStill()) << "Space did not stop the turn";

    // Ctrl+N: a second chart.
    RunXdotool({ "key", "ctrl+n" });
    EXPECT_TRUE(QTest::qWaitFor([] { return WindowsNamed("Nightdome").size() == 2; }, 10000))
        << WindowsNamed("Nightdome").size() << " charts";

    // F1: the help window, one however often it is pressed.
    RunXdotool({ "key", "F1" });
    unsigned long help = 0;
    ASSERT_TRUE(QTest::qWaitFor(
        [&] { return (help = WindowNamed("Nightdome Help")) != 0 && !ClientArea(help).isEmpty(); },
        10000))
        << "F1 opened no help window";
    RunXdotool({ "key", "F1" });
    QTest::qWait(500);
    EXPECT_EQ(WindowsNamed("Nightdome Help").size(), 1);
    if (const char* shots = std::getenv("ND_SCREENSHOTS")) {
        Grab(FrameArea(help).adjusted(-4, -4, 4, 4))
            .save(QString(shots) + (WithWindowManager() ? "/help-openbox.png" : "/help-bare.png"));
    }

    // Ctrl+Q ends the program.
    RunXdotool({ "key", "ctrl+q" });
    ASSERT_TRUE(fProgram.waitForFinished(10000)) << "Ctrl+Q did not end the program";
    EXPECT_EQ(fProgram.exitStatus(), QProcess::NormalExit);
    EXPECT_EQ(fProgram.exitCode(), 0);
}

INSTANTIATE_TEST_SUITE_P(
    Desktop, Keys, ::testing::Values(false, true), [](const ::testing::TestParamInfo<bool>& info) {
        return info.param ? "UnderOpenbox" : "OnTheBareServer";
    });
