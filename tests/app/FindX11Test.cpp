// The find window of the real program, with and without a window manager: opened from the
// control window where it belongs, a name typed into its name panel, and the panel's handle
// dragged onto the chart, which takes the one system found as its origin. A name that finds
// nothing drags nothing. A system is found by the other names of its stars in the names file
// beside the catalogue, and shown by its own.
#include "NamedSky.h"
#include "ProgramX11Support.h"

namespace {

// Where the find window's inside stands and how big it is.
const QRect kFindArea(170, 140, 395, 371);
// The name panel in the window's column, and in it the middle of the name field, in the row of
// controls under the panel's title where the panel's handle stands too.
const QPoint kNamePanel(10, 10);
const QPoint kStarNameField(220, kPanelRow);
// Where the find window goes to leave the chart and its read-out in sight.
const QPoint kAside(600, 140);
// The grey of the column behind the panels.
const QRgb kColumnGrey = qRgb(220, 220, 220);
// Around the middle of the chart's view, where its origin shows and, once a dropped system has
// been made the origin, the brackets that mark it as selected.
const QRect kMiddle(
    kChartOrigin + QPoint(kChartWidth / 2 - 10, kChartHeight / 2 - 10), QSize(21, 21));

bool ShowsTheSun(const std::string& text)
{
    return text.rfind("Origin: The Sun\nDistance: 25.00\n", 0) == 0;
}

bool ShowsSirius(const std::string& text)
{
    return text.rfind("Origin: Sirius\n", 0) == 0;
}

// Pixels of the markers' red around the middle of the chart.
int MarkerPixelsInTheMiddle()
{
    const rgb_color red = system_colors()->color_list[42];
    const QImage image = Grab(kMiddle);
    int marked = 0;
    for (int y = 0; y < image.height(); y++) {
        for (int x = 0; x < image.width(); x++)
            marked += image.pixel(x, y) == qRgb(red.red, red.green, red.blue);
    }
    return marked;
}

class FindStar : public Program, public ::testing::WithParamInterface<bool> {
protected:
    bool WithWindowManager() const override { return GetParam(); }

    // Clicks the control window's find button and returns the find window once it shows; 0
    // when none came.
    static unsigned long OpenFindWindow()
    {
        unsigned long window = 0;
        // A click the window manager takes for itself, on a machine busy enough (a sanitizer
        // build beside other tests) that the program's windows are still settling, opens
        // nothing: then the button is clicked once more.
        for (int attempt = 0; attempt < 2; attempt++) {
            RunXdotool({ "mousemove", Number(ControlCentre(8).x()), Number(ControlCentre(8).y()),
                "click", "1" });
            if (QTest::qWaitFor(
                    [&] {
                        return (window = WindowNamed("Find Star")) != 0
                            && !ClientArea(window).isEmpty();
                    },
                    attempt == 0 ? 10000 : 30000))
                return window;
        }
        return 0;
    }

    // A picture of area once the window there has drawn its column and stopped changing.
    static QImage Drawn(QRect area, QPoint column)
    {
        QImage last, now;
        (void)QTest::qWaitFor(
            [&] {
                now = Grab(area);
                const bool done = now == last && now.pixel(column - area.topLeft()) == kColumnGrey;
                last = now;
                return done;
            },
            10000);
        return now;
    }

    // Moves the find window aside and returns where its inside then stands (where it stood if
    // it did not move).
    static QPoint MoveAside(unsigned long window)
    {
        RunXdotool(
            { "windowmove", QString::number(window), Number(kAside.x()), Number(kAside.y()) });
        QPoint at;
        (void)QTest::qWaitFor(
            [&] {
                at = ClientArea(window).topLeft();
                return at.x() >= kAside.x() - 10;
            },
            10000);
        return at;
    }

    // Replaces the name in the name panel of the find window whose inside stands at `find`.
    static void TypeName(QPoint find, const char* name)
    {
        const QPoint field = find + kNamePanel + kStarNameField;
        RunXdotool({ "mousemove", Number(field.x()), Number(field.y()), "click", "1", "sleep",
            "0.2", "key", "ctrl+a", "type", name });
    }

    // Presses the name panel's handle, moves in steps to `to` and lets go there.
    static void DragTheResult(QPoint find, QPoint to)
    {
        RunXdotool(DragSteps(find + kNamePanel + kPanelHandle, to));
    }
};

} // namespace

TEST_P(FindStar, OpensInPlaceAndTheSystemFoundBecomesTheChartsOrigin)
{
    const std::string start = WaitForReadOut(kChartOrigin, ShowsTheSun);
    ASSERT_TRUE(ShowsTheSun(start)) << start;
    ASSERT_EQ(MarkerPixelsInTheMiddle(), 0) << "a system is selected from the start";

    const unsigned long find = OpenFindWindow();
    ASSERT_NE(find, 0u) << "no find window opened";
    EXPECT_EQ(ClientArea(find), kFindArea);
    if (const char* shots = std::getenv("ND_SCREENSHOTS")) {
        const QRect around = WithWindowManager() ? FrameArea(find) : ClientArea(find);
        const QImage shot
            = Drawn(around.adjusted(-4, -4, 4, 4), ClientArea(find).topLeft() + QPoint(5, 5));
        EXPECT_TRUE(shot.save(QString(shots) + "/find-window.png"));
    }

    const QPoint aside = MoveAside(find);
    ASSERT_GE(aside.x(), kAside.x() - 10) << "the find window did not move";
    TypeName(aside, "Sirius");
    DragTheResult(aside, kDropPoint);
    const std::string found = WaitForReadOut(kChartOrigin, ShowsSirius);
    EXPECT_TRUE(ShowsSirius(found)) << found;
    // Sirius is selected as well: its brackets close in on the middle, where it now stands.
    EXPECT_TRUE(QTest::qWaitFor([] { return MarkerPixelsInTheMiddle() > 0; }, 10000))
        << "no selection marked in the middle of the chart";
    EXPECT_EQ(fProgram.state(), QProcess::Running);
}

TEST_P(FindStar, ANameThatMatchesNothingDragsNothing)
{
    const std::string start = WaitForReadOut(kChartOrigin, ShowsTheSun);
    ASSERT_TRUE(ShowsTheSun(start)) << start;
    ASSERT_EQ(MarkerPixelsInTheMiddle(), 0) << "a system is selected from the start";
    const unsigned long find = OpenFindWindow();
    ASSERT_NE(find, 0u) << "no find window opened";
    const QPoint aside = MoveAside(find);
    ASSERT_GE(aside.x(), kAside.x() - 10) << "the find window did not move";

    TypeName(aside, "Nowhere");
    DragTheResult(aside, kDropPoint);
    // The camera moved out afterwards: once the read-out shows that, whatever the release over
    // the chart did shows too. The origin is still the Sun, and nothing is selected (a drop of
    // any system, even of the Sun that the field first held, would have marked it there).
    DragControl(ControlCentre(1), 8, 0, 5);
    const std::string after = WaitForReadOut(kChartOrigin, [](const std::string& t) {
        return Field(t, "Distance: ") > 26 && t.find('?') == std::string::npos;
    });
    EXPECT_GT(Field(after, "Distance: "), 26) << after;
    EXPECT_EQ(after.rfind("Origin: The Sun\n", 0), 0u) << after;
    EXPECT_EQ(MarkerPixelsInTheMiddle(), 0) << "something was dropped on the chart";

    // The same gesture with a name that is found does reach the chart.
    TypeName(aside, "Sirius");
    DragTheResult(aside, kDropPoint);
    const std::string found = WaitForReadOut(kChartOrigin, ShowsSirius);
    EXPECT_TRUE(ShowsSirius(found)) << found;
    EXPECT_TRUE(QTest::qWaitFor([] { return MarkerPixelsInTheMiddle() > 0; }, 10000));
}

namespace {

// The program started with --catalogue on a sky whose stars go by other names too, given in the
// names file beside it.
class FindStarByOtherNames : public FindStar {
protected:
    void PrepareProgram() override
    {
        QFile catalogue(fDir.filePath("sky.dat"));
        ASSERT_TRUE(catalogue.open(QIODevice::WriteOnly));
        catalogue.write(kNamedSky);
        catalogue.close();
        QFile names(fDir.filePath("sky.names"));
        ASSERT_TRUE(names.open(QIODevice::WriteOnly));
        names.write((NamesHeader() + kOtherNames).c_str());
        names.close();
        fProgram.setProgram(ND_PROGRAM);
        fProgram.setArguments({ "--catalogue=" + fDir.filePath("sky.dat") });
    }
};

} // namespace

TEST_P(FindStarByOtherNames, ASystemFoundByAnotherNameShowsByItsOwn)
{
    const std::string start = WaitForReadOut(kChartOrigin, ShowsTheSun);
    ASSERT_TRUE(ShowsTheSun(start)) << start;
    const unsigned long find = OpenFindWindow();
    ASSERT_NE(find, 0u) << "no find window opened";
    const QPoint aside = MoveAside(find);
    ASSERT_GE(aside.x(), kAside.x() - 10) << "the find window did not move";

    // alpha Centauri's system by the Hipparcos number of its first star, then Proxima by its
    // Gliese number: the chart names each by its own name.
    const std::pair<const char*, const char*> searches[]
        = { { "HIP 71683", "Origin: Rigil Kentaurus\n" },
              { "GJ 551", "Origin: Proxima Centauri\n" },
              { "Gaia DR3 4472832130942575872", "Origin: Barnard's Star\n" } };
    for (const auto& [name, shown] : searches) {
        TypeName(aside, name);
        DragTheResult(aside, kDropPoint);
        const std::string found = WaitForReadOut(kChartOrigin,
            [shown = std::string(shown)](const std::string& t) { return t.rfind(shown, 0) == 0; });
        EXPECT_EQ(found.rfind(shown, 0), 0u) << name << ":\n" << found;
    }
    EXPECT_EQ(fProgram.state(), QProcess::Running);
}

INSTANTIATE_TEST_SUITE_P(Desktop, FindStarByOtherNames, ::testing::Values(false),
    [](const ::testing::TestParamInfo<bool>&) { return "OnTheBareServer"; });

INSTANTIATE_TEST_SUITE_P(Desktop, FindStar, ::testing::Values(false, true),
    [](const ::testing::TestParamInfo<bool>& info) {
        return info.param ? "UnderOpenbox" : "OnTheBareServer";
    });
