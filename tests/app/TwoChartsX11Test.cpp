// Two charts of the real program opened from its control window, with and without a window
// manager: the new one exactly over the first, the first raised over it again, then the two side
// by side. Each shows its own stars and its own read-out where it stands, on the screen and in a
// screenshot as xwd takes one.
#include "ProgramX11Support.h"

namespace {

// The read-out of a chart at its start, and of one whose camera has moved out.
bool IsFresh(const std::string& text)
{
    return text.rfind("Origin: The Sun", 0) == 0 && Field(text, "Distance: ") == 25.0;
}

bool IsMovedOut(const std::string& text)
{
    return text.rfind("Origin: The Sun", 0) == 0 && Field(text, "Distance: ") > 26;
}

class TwoCharts : public Program, public ::testing::WithParamInterface<bool> {
protected:
    bool WithWindowManager() const override { return GetParam(); }

    // Puts window over the others: through the window manager when one runs (it stacks the
    // frame), by the window itself otherwise.
    void Raise(unsigned long window) const
    {
        RunXdotool(
            { WithWindowManager() ? "windowactivate" : "windowraise", QString::number(window) });
    }

    // Checks what the chart whose view's top-left is at `view` shows, on the screen and in a
    // dump of the screen by xwd: stars, a read-out that `expected` accepts, and in the dump the
    // same strip under the view as on the screen. A read spoilt by a cube edge crossing the text
    // is read again, from a new picture.
    void ExpectShown(QPoint view, const std::function<bool(const std::string&)>& expected)
    {
        const std::string onScreen = WaitForReadOut(view, expected);
        EXPECT_TRUE(expected(onScreen)) << onScreen;
        EXPECT_GT(StarPixels(view), 20);
        QImage dump;
        std::string dumped;
        (void)QTest::qWaitFor(
            [&] {
                dump = XwdRootImage();
                dumped = dump.isNull() ? std::string()
                                       : fReader.Read(dump, ReadOutReader::Area(view).topLeft());
                return expected(dumped);
            },
            10000);
        ASSERT_FALSE(dump.isNull()) << "xwd wrote nothing readable";
        EXPECT_TRUE(expected(dumped)) << dumped;
        EXPECT_GT(StarPixels(dump.copy(StarArea(view))), 20);
        const QRect strip(view + QPoint(0, kChartHeight), QSize(kChartWidth - 12, 12));
        EXPECT_EQ(DifferentPixels(dump.copy(strip), Grab(strip)), 0);
    }
};

} // namespace

TEST_P(TwoCharts, EachShowsItsOwnStarsOverTheOtherAndBesideIt)
{
    const std::string start = WaitForReadOut(kChartOrigin, IsFresh);
    ASSERT_TRUE(IsFresh(start)) << start;
    ASSERT_EQ(ClientArea(WindowNamed("3D Nightdome")).topLeft(), kControls.topLeft());
    const unsigned long first = WindowNamed("Nightdome");
    ASSERT_EQ(ClientArea(first).topLeft(), kChartOrigin);

    // The first chart's camera moved out, so that its read-out tells it from a new chart's.
    DragControl(ControlCentre(1), 8, 0, 5);
    const std::string movedOut = WaitForReadOut(kChartOrigin, IsMovedOut);
    ASSERT_TRUE(IsMovedOut(movedOut)) << movedOut;

    // A second chart from the control window opens exactly where the first stands, over it.
    RunXdotool(
        { "mousemove", Number(ControlCentre(5).x()), Number(ControlCentre(5).y()), "click", "1" });
    unsigned long second = 0;
    ASSERT_TRUE(QTest::qWaitFor(
        [&] {
            for (unsigned long window : WindowsNamed("Nightdome"))
                second = window != first ? window : second;
            return second != 0;
        },
        10000))
        << "no second chart opened";
    EXPECT_EQ(ClientArea(second), ClientArea(first));

    // The area shows the new chart's own frame, not the first one's.
    ExpectShown(kChartOrigin, IsFresh);

    // The first chart raised over the second, at the same place: now its own frame shows.
    Raise(first);
    ExpectShown(kChartOrigin, IsMovedOut);

    // The second moved aside: the two side by side, each with its own stars and read-out.
    RunXdotool({ "windowmove", QString::number(second), "600", "140" });
    QPoint secondView;
    ASSERT_TRUE(QTest::qWaitFor(
        [&] {
            secondView = ClientArea(second).topLeft();
            return secondView.x() >= 500;
        },
        10000))
        << "the second chart did not move";
    ExpectShown(kChartOrigin, IsMovedOut);
    ExpectShown(secondView, IsFresh);
}

INSTANTIATE_TEST_SUITE_P(Desktop, TwoCharts, ::testing::Values(false, true),
    [](const ::testing::TestParamInfo<bool>& info) {
        return info.param ? "UnderOpenbox" : "OnTheBareServer";
    });
