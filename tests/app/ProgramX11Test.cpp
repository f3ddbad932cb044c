// The real program on a real X server (Xvfb), worked with xdotool as a person would: the
// trackball, the camera and clipping controls, a second chart, closing windows and quitting.
#include "ProgramX11Support.h"

TEST_F(Program, ControlsDriveTheActiveChartAndClosingTheControlsEndsTheProgram)
{
    const std::string first = WaitForReadOut(kChartOrigin,
        [](const std::string& t) { return t.rfind("Origin: The Sun\nDistance: 25.00\n", 0) == 0; });
    ASSERT_EQ(first.rfind("Origin: The Sun\nDistance: 25.00\n", 0), 0u) << first;
    EXPECT_NE(first.find("DEC: -29d 47.6'"), std::string::npos) << first;
    if (const char* shots = std::getenv("ND_SCREENSHOTS")) {
        Grab(kControls.adjusted(-4, -4, 4, 4)).save(QString(shots) + "/control-window.png");
    }

    // The trackball, dragged sideways: the chart pitches (horizontal drags drive the turn about
    // the screen's horizontal axis), so its declination changes, and stays once the turn dies.
    DragControl(ControlCentre(0), 8, 5, 0);
    const std::string pitched = WaitForReadOut(kChartOrigin, [](const std::string& t) {
        return t.find("DEC: -29d 47.6'") == std::string::npos && t.find('?') == std::string::npos;
    });
    EXPECT_NE(pitched.find("DEC: "), std::string::npos) << pitched;
    const double dec = Settled(kChartOrigin, "DEC: ");
    EXPECT_GT(std::abs(dec + 29.79), 1) << pitched; // turned by more than a degree
    QTest::qWait(300);
    // The turn died away: a tenth of a degree at most is left of a turn of several degrees.
    EXPECT_NEAR(Settled(kChartOrigin, "DEC: "), dec, 0.1);

    // The camera control, dragged downward: the camera moves out.
    DragControl(ControlCentre(1), 8, 0, 5);
    const std::string zoomed = WaitForReadOut(
        kChartOrigin, [](const std::string& t) { return Field(t, "Distance: ") > 26; });
    EXPECT_GT(Field(zoomed, "Distance: "), 26) << zoomed;
    if (const char* shots = std::getenv("ND_SCREENSHOTS"))
        Grab(QRect(kChartOrigin, QSize(kChartWidth, kChartHeight + 12)))
            .save(QString(shots) + "/chart-turned.png");

    // The clipping sphere, dragged far to the right: the radius falls to its minimum of half a
    // parsec, and the stars around the Sun go out.
    const int before = StarPixels(kChartOrigin);
    ASSERT_GT(before, 20);
    DragControl(ControlCentre(4), 20, 45, 0);
    EXPECT_TRUE(QTest::qWaitFor([&] { return StarPixels(kChartOrigin) < before / 4; }, 10000))
        << StarPixels(kChartOrigin) << " of " << before;

    // A second chart, moved aside; the controls follow whichever chart was activated last.
    RunXdotool(
        { "mousemove", Number(ControlCentre(5).x()), Number(ControlCentre(5).y()), "click", "1" });
    unsigned long second = 0;
    ASSERT_TRUE(
        QTest::qWaitFor([&] { return (second = WindowNamed("Nightdome", 1)) != 0; }, 10000));
    const unsigned long firstWindow = WindowNamed("Nightdome", 0);
    RunXdotool({ "windowmove", QString::number(second), "600", "140" });
    const QPoint secondOrigin(600, 140);
    const std::string fresh = WaitForReadOut(secondOrigin,
        [](const std::string& t) { return t.rfind("Origin: The Sun\nDistance: 25.00\n", 0) == 0; });
    ASSERT_EQ(fresh.rfind("Origin: The Sun\nDistance: 25.00\n", 0), 0u) << fresh;

    RunXdotool({ "windowfocus", QString::number(second) });
    const double firstDistance = Settled(kChartOrigin, "Distance: ");
    DragControl(ControlCentre(1), 8, 0, 5);
    EXPECT_TRUE(QTest::qWaitFor(
        [&] { return Field(fReader.Read(secondOrigin), "Distance: ") > 26; }, 10000));
    EXPECT_NEAR(Settled(kChartOrigin, "Distance: "), firstDistance, 0.1);

    RunXdotool({ "windowfocus", QString::number(firstWindow) });
    const double secondDistance = Settled(secondOrigin, "Distance: ");
    DragControl(ControlCentre(1), 8, 0, 5);
    EXPECT_TRUE(QTest::qWaitFor(
        [&] { return Field(fReader.Read(kChartOrigin), "Distance: ") > firstDistance + 1; },
        10000));
    EXPECT_NEAR(Settled(secondOrigin, "Distance: "), secondDistance, 0.1);

    // Closing the active chart, then working a control: nothing breaks.
    AskToClose(firstWindow);
    EXPECT_TRUE(QTest::qWaitFor([&] { return WindowNamed("Nightdome", 1) == 0; }, 10000));
    DragControl(ControlCentre(0), 6, 5, 0);
    DragControl(ControlCentre(2), 6, 5, 0);
    QTest::qWait(300);
    EXPECT_EQ(fProgram.state(), QProcess::Running);

    // Closing the control window ends the program, the other chart still open.
    AskToClose(WindowNamed("3D Nightdome"));
    ASSERT_TRUE(fProgram.waitForFinished(10000));
    EXPECT_EQ(fProgram.exitStatus(), QProcess::NormalExit);
    EXPECT_EQ(fProgram.exitCode(), 0);
}

TEST_F(Program, ClosingTheOnlyChartLeavesTheControlsWorking)
{
    const std::string first = WaitForReadOut(kChartOrigin,
        [](const std::string& t) { return t.rfind("Origin: The Sun\nDistance: 25.00\n", 0) == 0; });
    ASSERT_EQ(first.rfind("Origin: The Sun\nDistance: 25.00\n", 0), 0u) << first;
    const unsigned long chart = WindowNamed("Nightdome");
    ASSERT_NE(chart, 0u);

    // The chart's window is destroyed once the program has handled the close; a quit asked for
    // on the way has been delivered by then, and the program would be on its way out.
    AskToClose(chart);
    ASSERT_TRUE(QTest::qWaitFor([&] { return ClientArea(chart).isEmpty(); }, 10000));

    // The control window stays and opens a new chart, where the first one stood.
    const unsigned long controls = WindowNamed("3D Nightdome");
    ASSERT_NE(controls, 0u) << "the control window went with the chart";
    RunXdotool(
        { "mousemove", Number(ControlCentre(5).x()), Number(ControlCentre(5).y()), "click", "1" });
    unsigned long fresh = 0;
    ASSERT_TRUE(QTest::qWaitFor([&] { return (fresh = WindowNamed("Nightdome")) != 0; }, 10000))
        << "no new chart opened";
    EXPECT_EQ(ClientArea(fresh).topLeft(), kChartOrigin);
    const std::string start = WaitForReadOut(kChartOrigin,
        [](const std::string& t) { return t.rfind("Origin: The Sun\nDistance: 25.00\n", 0) == 0; });
    ASSERT_EQ(start.rfind("Origin: The Sun\nDistance: 25.00\n", 0), 0u) << start;
    const double dec = Settled(kChartOrigin, "DEC: ");

    // The trackball, dragged sideways, turns the new chart: its declination changes.
    DragControl(ControlCentre(0), 8, 5, 0);
    EXPECT_TRUE(QTest::qWaitFor(
        [&] {
            const double now = Field(fReader.Read(kChartOrigin), "DEC: ");
            return now > -1e8 && std::abs(now - dec) > 1;
        },
        10000))
        << fReader.Read(kChartOrigin);

    // Closing the control window still ends the program, and well.
    EXPECT_EQ(fProgram.state(), QProcess::Running);
    AskToClose(controls);
    ASSERT_TRUE(fProgram.waitForFinished(10000));
    EXPECT_EQ(fProgram.exitStatus(), QProcess::NormalExit);
    EXPECT_EQ(fProgram.exitCode(), 0);
}
