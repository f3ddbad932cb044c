// The real program on a high-density screen: a 1920 x 1080 X server with the program and this
// test at the scale factor QT_SCALE_FACTOR gives them both (1, 1.5 or 2; see the app_x11_scale
// tests). Every window opened fits the screen with its frame; the 8-bit views are shown without
// blur: at 2 each of their pixels is a block of 2 x 2 identical pixels of the screen, at 1.5 every
// pixel of the screen is one of the palette's colours; a star hovered is named on the chart's
// strip and clicked is selected, and stars dragged onto a list's pads land on those pads.
//
// This process runs at the program's scale, so its widgets and its grabs of the screen (Grab,
// LabelReader) are in the same device-independent pixels as the program's; what comes from the
// X server (window areas, xwd dumps) and the places windows are moved to are in the screen's own
// pixels. Pointer positions given to xdotool are in this process's pixels (InScreenPixels).
#include "LabelReader.h"
#include "ProgramX11Support.h"
#include "ScaledPixels.h"

#include <QScreen>
#include <algorithm>
#include <cmath>
#include <optional>
#include <utility>
#include <vector>

namespace {

const QSize kFullHD(1920, 1080);

// Windows' insides as the program makes them, in its own pixels.
const QPoint kControlItems(0, 0); // the row of mouse controls and picture buttons, 32 high
constexpr int kControlRowWidth = 320;
const QRect kChartView(0, 0, kChartWidth, kChartHeight);
const QRect kChartStrip(0, kChartHeight, kChartWidth - 12, 12);
const QRect kHRDiagram(0, 0, 300, 295);
const QRect kStarInfoText(0, 0, 364, 185);
// The pads, short of the check box that reaches under the XOR pad's last row.
const QRect kListPads(0, 0, 148, 50);
// The control window's items, left to right, that open windows.
constexpr int kStarInfoItem = 6, kHRDItem = 7, kFindItem = 8, kListItem = 9;

// The data line of a hovered system of the small catalogue: its star count, its name, its first
// star's absolute magnitude and class.
const char* const kSunHovered = "1: The Sun ( 4.8 G2V )";
// The same line once the system is selected: each of its stars by letter.
const char* const kSunSelected = "A: The Sun ( 4.8 G2V )  ";

class ScaledScreen : public Program, public ::testing::WithParamInterface<bool> {
protected:
    bool WithWindowManager() const override { return GetParam(); }

    void SetUp() override
    {
        if (QGuiApplication::platformName() == "xcb") {
            const QScreen* screen = QGuiApplication::primaryScreen();
            const QSize pixels = (QSizeF(screen->size()) * screen->devicePixelRatio()).toSize();
            if (pixels != kFullHD)
                GTEST_SKIP() << "needs a screen of 1920 x 1080 pixels, not " << pixels.width()
                             << " x " << pixels.height();
        }
        Program::SetUp();
    }

    // The scale factor the program and this test run at.
    static double Scale() { return QGuiApplication::primaryScreen()->devicePixelRatio(); }
    // A point of the program's pixels as a pixel of the screen, for moving windows and for
    // pictures of the screen.
    static QPoint Device(QPointF logical)
    {
        return QPoint(
            int(std::floor(logical.x() * Scale())), int(std::floor(logical.y() * Scale())));
    }
    // Where a window's inside stands, in the program's pixels.
    static QPoint Inside(unsigned long window)
    {
        const QPointF device = ClientArea(window).topLeft();
        return QPoint(
            int(std::lround(device.x() / Scale())), int(std::lround(device.y() / Scale())));
    }
    // Opens a window with control window item `item`; 0 when none came.
    static unsigned long OpenScaled(unsigned long controls, int item, const char* title)
    {
        const QPoint inside = Inside(controls);
        return OpenAt(inside + kControlItems + QPoint(32 * item + 16, 16), title);
    }
};

// Whether window, frame included, lies on the screen; a failure names it otherwise.
void ExpectOnTheScreen(const char* name, unsigned long window)
{
    const QRect frame = FrameArea(window);
    EXPECT_FALSE(frame.isEmpty()) << "the " << name << " window is not shown";
    EXPECT_TRUE(QRect(QPoint(0, 0), kFullHD).contains(frame))
        << "the " << name << " window's frame stands at " << frame.x() << ", " << frame.y()
        << " and is " << frame.width() << " x " << frame.height() << " pixels";
}

// Expects `area` of window's inside, an 8-bit view, to be shown without blur: at a whole scale
// factor of 2 each of its pixels a block of 2 x 2 pixels of the screen; at any factor in the
// palette's colours only. The screen's own pixels are read, as xwd dumps them.
void ExpectUnblurred(const char* name, unsigned long window, QRect area, double scale)
{
    const QRect onScreen(ClientArea(window).topLeft()
            + QPoint(int(std::floor(area.x() * scale)), int(std::floor(area.y() * scale))),
        QSize(int(area.width() * scale), int(area.height() * scale)));
    QImage shown;
    const bool drawn = QTest::qWaitFor(
        [&] {
            shown = XwdRootImage().copy(onScreen);
            return Drawn(shown);
        },
        10000);
    ASSERT_TRUE(drawn) << "the " << name << " shows nothing";
    EXPECT_EQ(BlendedPixels(shown), 0) << "the " << name << " is blurred";
    if (scale == 2) {
        EXPECT_EQ(MixedBlocks(shown), 0)
            << "the " << name << "'s pixels are not blocks of 2 x 2 pixels of the screen";
    }
    if (const char* shots = std::getenv("ND_SCREENSHOTS"))
        shown.save(QString("%1/%2-at-%3.png").arg(shots, name).arg(scale));
}

} // namespace

// Every window the control window opens, and the help, fits the screen with its frame, and each
// 8-bit view is shown without blur. The screen is saved for the README's pictures.
TEST_P(ScaledScreen, EveryWindowFitsAndTheBitmapsAreShownWithoutBlur)
{
    const double scale = Scale();
    const unsigned long controls = ShownWindow("3D Nightdome");
    const unsigned long chart = ShownWindow("Nightdome");
    ASSERT_NE(controls, 0u) << "no control window";
    ASSERT_NE(chart, 0u) << "no chart";
    // The windows are the program's size times the scale.
    EXPECT_EQ(ClientArea(controls).size(), (QSizeF(320, 45) * scale).toSize());
    EXPECT_EQ(ClientArea(chart).size(), (QSizeF(329, 341) * scale).toSize());
    ExpectOnTheScreen("control", controls);
    ExpectOnTheScreen("chart", chart);
    ExpectUnblurred("controls", controls, QRect(kControlItems, QSize(kControlRowWidth, 32)), scale);
    ExpectUnblurred("chart", chart, kChartView, scale);

    const std::vector<std::pair<const char*, int>> others { { "Star Info", kStarInfoItem },
        { "H-R Diagram", kHRDItem }, { "Find Star", kFindItem }, { "Star List", kListItem } };
    std::vector<std::pair<const char*, unsigned long>> opened;
    for (const auto& [title, item] : others) {
        const unsigned long window = OpenScaled(controls, item, title);
        ASSERT_NE(window, 0u) << "no " << title << " window opened";
        ExpectOnTheScreen(title, window);
        opened.emplace_back(title, window);
        // The newest window is in front: its views show whole.
        if (item == kStarInfoItem)
            ExpectUnblurred("star-info", window, kStarInfoText, scale);
        if (item == kHRDItem)
            ExpectUnblurred("hr-diagram", window, kHRDiagram, scale);
        if (item == kListItem)
            ExpectUnblurred("list-pads", window, kListPads, scale);
    }

    // The help, from the control window's keys.
    RunXdotool({ WithWindowManager() ? "windowactivate" : "windowfocus", "--sync",
        QString::number(controls) });
    RunXdotool({ "key", "F1" });
    const unsigned long help = ShownWindow("Nightdome Help");
    ASSERT_NE(help, 0u) << "F1 opened no help window";
    ExpectOnTheScreen("help", help);

    const char* shots = std::getenv("ND_SCREENSHOTS");
    if (shots && WithWindowManager()) {
        // The picture of the desktop: the help and the find window closed, the other windows
        // side by side.
        AskToClose(help);
        AskToClose(opened[2].second);
        EXPECT_TRUE(QTest::qWaitFor(
            [] {
                return WindowsNamed("Nightdome Help").isEmpty()
                    && WindowsNamed("Find Star").isEmpty();
            },
            10000));
        // Columns of windows, each placed by its frame, top to bottom.
        const std::vector<std::vector<unsigned long>> columns { { controls, chart },
            { opened[1].second, opened[0].second }, { opened[3].second } };
        int left = 0;
        for (const std::vector<unsigned long>& column : columns) {
            int top = 0, width = 0;
            for (unsigned long window : column) {
                const QRect frame = FrameArea(window), inside = ClientArea(window);
                Move(window, QPoint(left, top) + inside.topLeft() - frame.topLeft());
                top += frame.height() + 4;
                width = std::max(width, frame.width());
            }
            left += width + 4;
        }
        const int s = int(std::lround(scale * 10));
        const QString name = s % 10 ? QString("scale-%1-%2.png").arg(s / 10).arg(s % 10)
                                    : QString("scale-%1.png").arg(s / 10);
        EXPECT_TRUE(XwdRootImage().save(QString(shots) + "/" + name));
    }
    EXPECT_EQ(fProgram.state(), QProcess::Running);
}

// At scale 2, the Sun hovered in the middle of the chart is named on its strip and, clicked, is
// selected; dragged onto a list window's Plus pad it is the list's one system, and every system
// shown, dragged from empty space of the chart onto the XOR pad, leaves all but the Sun: the
// pointer's place maps to the chart's and the list's own pixels. No other place of the list gives
// that count (Plus, Equals, OR and the list's other parts add, Minus and NOT leave none, AND
// leaves the Sun).
TEST_P(ScaledScreen, AHoverNamesTheStarAndDropsLandOnThePads)
{
    if (Scale() != 2)
        GTEST_SKIP() << "the hover and the drops are tried at scale 2";
    // A window manager's frame may put a window's inside at an odd pixel of the screen, half a
    // pixel of the program's; the reads of the lines below are made on the bare server.
    if (WithWindowManager())
        GTEST_SKIP() << "tried on the bare server";
    const std::vector<CatalogueSystem> catalogue = ReadCatalogue(fDir.filePath("stars.dat"));
    ASSERT_GT(catalogue.size(), 2u);
    ASSERT_EQ(catalogue.front().name, "The Sun");
    const unsigned long controls = ShownWindow("3D Nightdome");
    const unsigned long chart = ShownWindow("Nightdome");
    ASSERT_NE(controls, 0u);
    ASSERT_NE(chart, 0u);

    // A list, moved to the right of the chart.
    const unsigned long list = OpenScaled(controls, kListItem, "Star List");
    ASSERT_NE(list, 0u) << "no list window opened";
    Move(list, Device(QPoint(520, 140)));
    const QPoint listInside = Inside(list);
    ASSERT_TRUE(Apart({ { "chart", chart }, { "list", list }, { "controls", controls } }));
    QStringList counts;
    for (size_t n = 0; n <= catalogue.size(); n++)
        counts << QString("Star Systems: %1").arg(n);
    const LabelReader countLine(kCountLine, counts);
    ASSERT_EQ(countLine.WaitFor(listInside, 0), 0) << "the new list is not empty";

    // The Sun, the origin, stands in the middle of the chart whichever way it turns.
    const QPoint chartInside = Inside(chart);
    const QPointF middle = chartInside + QPointF(kChartWidth / 2.0, kChartHeight / 2.0);
    const LabelReader strip(kChartStrip, { "", kSunHovered, kSunSelected });
    // Brought in from the left in small steps, as a hand moves it.
    for (int step = 8; step >= 0; step--) {
        const QPoint at = (middle - QPointF(step * 4, 0)).toPoint();
        RunXdotool({ "mousemove", Number(at.x()), Number(at.y()), "sleep", "0.05" });
    }
    EXPECT_EQ(strip.WaitFor(chartInside, 1), 1)
        << "the strip does not read \"" << kSunHovered << "\" (" << strip.Difference(chartInside, 1)
        << " of its pixels differ)";
    // Clicked, it is picked: the selection.
    RunXdotool({ "click", "1" });
    EXPECT_EQ(strip.WaitFor(chartInside, 2), 2)
        << "the strip does not read \"" << kSunSelected << "\" ("
        << strip.Difference(chartInside, 2) << " of its pixels differ)";

    // The Sun onto Plus.
    Drag(middle.toPoint(), listInside + kPlusPad);
    EXPECT_EQ(countLine.WaitFor(listInside, 1), 1)
        << "the list does not hold the Sun (" << countLine.Difference(listInside, 1)
        << " pixels of its count line differ)";

    // Everything shown, from a place of the chart's upper half with no star near, onto XOR.
    // The grab holds the screen's pixels, two of them to each of the program's.
    const QImage stars = Grab(QRect(chartInside, QSize(kChartWidth, kChartHeight / 2)));
    std::optional<QPoint> empty;
    for (int x = 20; x < kChartWidth - 20 && !empty; x += 10) {
        const QRect around(x - 20, 0, 40, 40);
        if (StarPixels(stars.copy(QRect(Device(around.topLeft()), around.size() * 2))) == 0)
            empty = QPoint(x, 20);
    }
    ASSERT_TRUE(empty) << "no empty space along the top of the chart";
    Drag(chartInside + *empty, listInside + kXorPad);
    const int others = int(catalogue.size()) - 1;
    EXPECT_EQ(countLine.WaitFor(listInside, others), others)
        << "the list does not hold every system but the Sun ("
        << countLine.Difference(listInside, others) << " pixels of its count line differ)";
    EXPECT_EQ(fProgram.state(), QProcess::Running);
}

INSTANTIATE_TEST_SUITE_P(HighDensity, ScaledScreen, ::testing::Values(false, true),
    [](const ::testing::TestParamInfo<bool>& info) {
        return info.param ? "UnderOpenbox" : "OnTheBareServer";
    });
