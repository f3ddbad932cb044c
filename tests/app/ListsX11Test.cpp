// Sets of systems carried from window to window of the real program, with and without a window
// manager: the find window's distance panel dragged onto a list window's Equals pad and its
// spectral-class panel onto the AND pad; the list that results dragged onto the chart, which
// then shows only those systems, and onto a second list's NOT pad, which takes all the others.
// Each list's count line is read off the screen; what the chart shows is told by its lit pixels.
#include "LabelReader.h"
#include "ProgramX11Support.h"

#include <QSet>
#include <memory>
#include <utility>
#include <vector>

namespace {

// The find window's spectral-class panel in its column, and the middle of its controls.
const QPoint kSpectralPanel(10, 70);
const QPoint kSpectralMode(150 + 52, kPanelRow);
const QPoint kHarvardClass(260 + 12, kPanelRow);
const QPoint kDecimalClass(290 + 12, kPanelRow);

// Where the windows are moved to, clear of each other and of the control window and the chart.
const QPoint kFindPlace(470, 160);
const QPoint kFirstListPlace(900, 160);
const QPoint kSecondListPlace(900, 580);

// The choices made on the panels: systems nearer the Sun than this many parsecs...
constexpr double kNearerThan = 10;
// ... and with a star of a class before this one (hotter than F0).
constexpr int kHarvardF = 4, kDecimalZero = 0;

// The pixels of a picture of a chart that show stars, as StarPixels counts them.
QSet<int> LitPixels(const QImage& image)
{
    QSet<int> lit;
    for (int y = 0; y < image.height(); y++) {
        for (int x = 0; x < image.width(); x++) {
            if (IsStarPixel(image.pixel(x, y)))
                lit.insert(y * image.width() + x);
        }
    }
    return lit;
}

class ListsAcrossWindows : public Program, public ::testing::WithParamInterface<bool> {
protected:
    bool WithWindowManager() const override { return GetParam(); }

    // Expects the count line of the list at `list` to come to read `expected`.
    void ExpectCount(QPoint list, int expected, const char* which) const
    {
        const int read = fCounts->WaitFor(list, expected);
        EXPECT_EQ(read, expected) << "the " << which << " list's count line (-1 when it shows no "
                                  << "number at all; " << fCounts->Difference(list, expected)
                                  << " of its pixels differ from what it should show)";
    }

    // The count line read as "Star Systems: n" for every n up to the number of systems.
    std::unique_ptr<LabelReader> fCounts;
};

} // namespace

TEST_P(ListsAcrossWindows, TheNearHotStarsAndAllTheOthers)
{
    // What the panels' choices find in the catalogue: the systems nearer the Sun than 10 pc,
    // those of them with a star hotter than F0, and all the other systems.
    const std::vector<CatalogueSystem> catalogue = ReadCatalogue(fDir.filePath("stars.dat"));
    ASSERT_FALSE(catalogue.empty());
    ASSERT_EQ(catalogue.front().name, "The Sun") << "distances are measured from system 0";
    const CatalogueSystem& sun = catalogue.front();
    const double hotterThan = kHarvardF + 0.1 * kDecimalZero;
    const int total = int(catalogue.size());
    int near = 0, nearAndHot = 0;
    for (const CatalogueSystem& system : catalogue) {
        if (system.DistanceFrom(sun) >= kNearerThan)
            continue;
        near++;
        nearAndHot += std::any_of(system.stars.begin(), system.stars.end(),
            [&](const CatalogueStar& s) { return s.classValue >= 0 && s.classValue < hotterThan; });
    }
    const int others = total - nearAndHot;
    // The catalogue must make every step tell: AND takes some of the near systems and leaves
    // others, several are left so the list's handle drags a set, and the near systems are not
    // all of them.
    ASSERT_LT(near, total);
    ASSERT_GT(nearAndHot, 1);
    ASSERT_LT(nearAndHot, near);
    ASSERT_GT(others, 1);
    QStringList counts;
    for (int n = 0; n <= total; n++)
        counts << QString("Star Systems: %1").arg(n);
    fCounts = std::make_unique<LabelReader>(kCountLine, counts);

    ASSERT_TRUE(StartedAtTheSun());

    // The find window and two lists, each opened from the control window and moved aside.
    const unsigned long findWindow = Open(8, "Find Star");
    ASSERT_NE(findWindow, 0u) << "no find window opened";
    const QPoint find = Move(findWindow, kFindPlace);
    const unsigned long firstWindow = Open(9, "Star List");
    ASSERT_NE(firstWindow, 0u) << "no list window opened";
    const QPoint first = Move(firstWindow, kFirstListPlace);
    const unsigned long secondWindow = Open(9, "Star List", { firstWindow });
    ASSERT_NE(secondWindow, 0u) << "no second list window opened";
    const QPoint second = Move(secondWindow, kSecondListPlace);
    const unsigned long controlWindow = WindowNamed("3D Nightdome");
    const unsigned long chartWindow = WindowNamed("Nightdome");
    ASSERT_NE(controlWindow, 0u);
    ASSERT_NE(chartWindow, 0u);
    const std::vector<std::pair<const char*, unsigned long>> windows {
        { "controls", controlWindow }, { "chart", chartWindow }, { "find", findWindow },
        { "first list", firstWindow }, { "second list", secondWindow }
    };
    ASSERT_TRUE(Apart(windows));
    ASSERT_EQ(ClientArea(chartWindow).topLeft(), kChartOrigin);
    ExpectCount(first, 0, "first");
    ExpectCount(second, 0, "second");

    // The chart with every system, still, the pointer away from it.
    ASSERT_TRUE(StopTheTurn()) << "the chart kept turning";
    const QImage everything = SteadyStars();
    ASSERT_GT(StarPixels(everything), 20);

    // The near systems: "is less than" 10 on the distance panel, dragged onto Equals.
    ASSERT_TRUE(ChooseNearerThan(find, kNearerThan))
        << "the distance panel's mode menu did not open and close";
    Drag(find + kDistancePanel + kPanelHandle, first + kEqualsPad);
    ExpectCount(first, near, "first");

    // Of those, the ones with a star hotter than F0: the spectral-class panel onto AND.
    ASSERT_TRUE(Choose(find + kSpectralPanel + kSpectralMode, kLessThan, kModeCount))
        << "the spectral class panel's mode menu did not open and close";
    ASSERT_TRUE(Choose(find + kSpectralPanel + kHarvardClass, kHarvardF, 10))
        << "the Harvard class menu did not open and close";
    ASSERT_TRUE(Choose(find + kSpectralPanel + kDecimalClass, kDecimalZero, 10))
        << "the decimal class menu did not open and close";
    Drag(find + kSpectralPanel + kPanelHandle, first + kAndPad);
    ExpectCount(first, nearAndHot, "first");

    // The list onto the chart: only its systems are left there, all of them stars that were
    // there before, and fewer than before.
    Drag(first + kStarDragger, kDropPoint);
    const QImage hot = NewStars(everything);
    const QSet<int> all = LitPixels(everything), shownHot = LitPixels(hot);
    EXPECT_GT(shownHot.size(), 0) << "none of the list's systems shows";
    EXPECT_LT(shownHot.size(), all.size()) << "the chart still shows every system";

    // The list onto the second list's NOT: it takes every other system, and the first keeps its
    // own.
    Drag(first + kStarDragger, second + kNotPad);
    ExpectCount(second, others, "second");
    ExpectCount(first, nearAndHot, "first");

    // The second list onto the chart: the systems the first took away come back and those it
    // brought go. Between them the two pictures show what the chart showed at first.
    Drag(second + kStarDragger, kDropPoint);
    const QImage rest = NewStars(hot);
    const QSet<int> shownRest = LitPixels(rest);
    EXPECT_GT(shownRest.size(), 0) << "none of the other systems shows";
    EXPECT_LT(shownRest.size(), all.size()) << "the chart still shows every system";
    // A star drawn over another may change a few pixels at their edges.
    const int slack = std::max(4, int(all.size()) / 50);
    EXPECT_LE((QSet<int>(shownHot) - all).size(), slack) << "stars where there were none";
    EXPECT_LE((QSet<int>(shownRest) - all).size(), slack) << "stars where there were none";
    EXPECT_LE((QSet<int>(all) - shownHot - shownRest).size(), slack)
        << "stars of the whole chart that neither list shows";
    EXPECT_LE((QSet<int>(shownHot) & shownRest).size(), slack) << "stars both lists show";

    SaveScreenshot(windows, "lists-across-windows.png");
    EXPECT_EQ(fProgram.state(), QProcess::Running);
}

INSTANTIATE_TEST_SUITE_P(Desktop, ListsAcrossWindows, ::testing::Values(false, true),
    [](const ::testing::TestParamInfo<bool>& info) {
        return info.param ? "UnderOpenbox" : "OnTheBareServer";
    });
