// The H-R diagram window of the real program, with and without a window manager: the systems
// nearer the Sun than 10 pc, found by the find window and gathered in a list, dragged from the
// list onto the diagram, which plots a marker for each of their stars where its class and
// magnitude put it and none for the stars farther out; a marker hovered names its star on the
// plot-name line, read off the screen; the marker dragged onto the chart makes its system the
// chart's origin.
#include "LabelReader.h"
#include "ProgramX11Support.h"

#include <QPointF>
#include <QRegion>
#include <algorithm>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <utility>
#include <vector>

namespace {

// The H-R window's inside: the diagram at its top-left, the plot-name line under it.
const QSize kHRDSize(300, 308);
const QRect kDiagram(0, 0, 300, 295);
const QRect kPlotNameLine(0, 296, 288, 12);
// A point of the diagram far from every star of the catalogue: magnitude +14.
const QPoint kEmptySpace(150, 250);

// Where the windows are moved to, clear of each other and of the control window and the chart.
const QPoint kFindPlace(470, 160);
const QPoint kListPlace(900, 160);
const QPoint kHRDPlace(470, 600);

// The systems plotted: those nearer the Sun than this many parsecs.
constexpr double kNearerThan = 10;
// The star whose marker is hovered and dragged to the chart.
constexpr const char* kNamedStar = "Procyon";
// A marker drawn covers at least this many of its 8 x 8 pixels.
constexpr int kMarkerInk = 16;

// Where the diagram centres a star's marker: 40 pixels a Harvard class from O at x = 20 (O0
// itself half a class in), 11.2 pixels a magnitude down from magnitude -7 at y = 15.
QPointF MarkerCentre(const CatalogueStar& star)
{
    double v = star.classValue - 1;
    if (v == 0)
        v = 0.5;
    return QPointF(v * 40 + 20, (star.magnitude + 7) * 11.2 + 15);
}

// The pixels a star's marker may cover: the 8 x 8 marker is drawn from 3 pixels before its
// centre, taken to whole pixels, to 4 after it, and a pixel more each way allows for rounding.
QRect MarkerBox(const CatalogueStar& star)
{
    const QPointF centre = MarkerCentre(star);
    return QRect(int(std::floor(centre.x())) - 4, int(std::floor(centre.y())) - 4, 10, 10);
}

// The diagram's pixel nearest a marker's centre, where the mouse finds that marker.
QPoint MarkerPoint(const CatalogueStar& star)
{
    const QPointF centre = MarkerCentre(star);
    return QPoint(int(std::lround(centre.x())), int(std::lround(centre.y())));
}

// What the plot-name line says of a star: its name, its magnitude and its class as a letter and
// a subclass with one decimal.
QString PlotName(const CatalogueStar& star)
{
    char text[256];
    std::snprintf(text, sizeof text, "%s ( %.1f %c%1.1f )", star.name.c_str(), star.magnitude,
        star.type[0], std::atof(star.type.c_str() + 1));
    return QString::fromUtf8(text);
}

// How many pixels inside box differ between two pictures of one area.
int DifferentPixelsIn(const QImage& a, const QImage& b, QRect box)
{
    return DifferentPixels(a.copy(box), b.copy(box));
}

class HRDiagram : public Program, public ::testing::WithParamInterface<bool> {
protected:
    bool WithWindowManager() const override { return GetParam(); }
};

} // namespace

TEST_P(HRDiagram, PlotsTheNearStarsNamesOneAndDragsItToTheChart)
{
    // The stars of the systems nearer the Sun than 10 pc, which the diagram should plot, and
    // the others, which it should not.
    const std::vector<CatalogueSystem> catalogue = ReadCatalogue(fDir.filePath("stars.dat"));
    ASSERT_FALSE(catalogue.empty());
    ASSERT_EQ(catalogue.front().name, "The Sun") << "distances are measured from system 0";
    std::vector<CatalogueStar> near, far;
    for (const CatalogueSystem& system : catalogue) {
        for (const CatalogueStar& star : system.stars)
            (system.DistanceFrom(catalogue.front()) < kNearerThan ? near : far).push_back(star);
    }
    ASSERT_GT(near.size(), 1u);
    ASSERT_FALSE(far.empty()) << "every star is near: nothing would tell the set from all";
    const auto named = std::find_if(near.begin(), near.end(),
        [](const CatalogueStar& star) { return star.name == kNamedStar; });
    ASSERT_NE(named, near.end()) << kNamedStar << " is not among the near stars";
    const CatalogueStar& star = *named;
    // The named star's marker stands alone, so that the mouse finds it and no other, and every
    // star's marker stands clear of the empty space.
    std::vector<CatalogueStar> all = near;
    all.insert(all.end(), far.begin(), far.end());
    for (const CatalogueStar& other : all) {
        if (other.name != star.name) {
            ASSERT_FALSE(MarkerBox(other).intersects(MarkerBox(star)))
                << other.name << "'s marker overlaps " << star.name << "'s";
        }
        ASSERT_FALSE(MarkerBox(other).adjusted(-10, -10, 10, 10).contains(kEmptySpace))
            << other.name << "'s marker is near the empty space";
    }
    // Every marker the set brings stands clear of the places where no marker should come.
    for (const CatalogueStar& out : far) {
        for (const CatalogueStar& in : near)
            ASSERT_FALSE(MarkerBox(out).intersects(MarkerBox(in))) << out.name << ", " << in.name;
    }

    QStringList counts;
    for (size_t n = 0; n <= catalogue.size(); n++)
        counts << QString("Star Systems: %1").arg(n);
    const LabelReader countLine(kCountLine, counts);
    const LabelReader plotName(kPlotNameLine, { QString(), PlotName(star) });

    ASSERT_TRUE(StartedAtTheSun());

    // The find window, a list and the H-R diagram, each opened from the control window and
    // moved aside.
    const unsigned long findWindow = Open(8, "Find Star");
    ASSERT_NE(findWindow, 0u) << "no find window opened";
    const QPoint find = Move(findWindow, kFindPlace);
    const unsigned long listWindow = Open(9, "Star List");
    ASSERT_NE(listWindow, 0u) << "no list window opened";
    const QPoint list = Move(listWindow, kListPlace);
    const unsigned long hrdWindow = Open(7, "H-R Diagram");
    ASSERT_NE(hrdWindow, 0u) << "no H-R diagram window opened";
    EXPECT_EQ(ClientArea(hrdWindow).size(), kHRDSize);
    const QPoint hrd = Move(hrdWindow, kHRDPlace);
    const unsigned long controlWindow = WindowNamed("3D Nightdome");
    const unsigned long chartWindow = WindowNamed("Nightdome");
    ASSERT_NE(controlWindow, 0u);
    ASSERT_NE(chartWindow, 0u);
    const std::vector<std::pair<const char*, unsigned long>> windows {
        { "controls", controlWindow }, { "chart", chartWindow }, { "find", findWindow },
        { "list", listWindow }, { "H-R diagram", hrdWindow }
    };
    ASSERT_TRUE(Apart(windows));
    ASSERT_EQ(ClientArea(chartWindow).topLeft(), kChartOrigin);

    // The empty diagram, its plot-name line blank.
    const QRect diagram = kDiagram.translated(hrd);
    const QImage empty = NewPicture(diagram, QImage());
    EXPECT_EQ(plotName.WaitFor(hrd, 0), 0) << "the plot-name line is not blank at first";

    // The near systems into the list: "is less than" 10 on the distance panel onto Equals.
    ASSERT_TRUE(ChooseNearerThan(find, kNearerThan))
        << "the distance panel's mode menu did not open and close";
    Drag(find + kDistancePanel + kPanelHandle, list + kEqualsPad);
    const int nearSystems = int(std::count_if(catalogue.begin(), catalogue.end(),
        [&](const CatalogueSystem& s) { return s.DistanceFrom(catalogue.front()) < kNearerThan; }));
    ASSERT_EQ(countLine.WaitFor(list, nearSystems), nearSystems)
        << "the list did not take the near systems (" << countLine.Difference(list, nearSystems)
        << " pixels of its count line differ)";

    // The list onto the diagram: a marker comes for every near star, none for the others, and
    // nothing else of the diagram changes.
    Drag(list + kStarDragger, hrd + kEmptySpace);
    const QImage plotted = NewPicture(diagram, empty);
    QRegion marked;
    for (const CatalogueStar& in : near) {
        EXPECT_GE(DifferentPixelsIn(empty, plotted, MarkerBox(in)), kMarkerInk)
            << "no marker for " << in.name << " around " << MarkerPoint(in).x() << ", "
            << MarkerPoint(in).y();
        marked += MarkerBox(in);
    }
    for (const CatalogueStar& out : far) {
        EXPECT_EQ(DifferentPixelsIn(empty, plotted, MarkerBox(out)), 0)
            << "a marker for " << out.name << ", farther than " << kNearerThan << " pc";
    }
    int strays = 0;
    for (int y = 0; y < diagram.height(); y++) {
        for (int x = 0; x < diagram.width(); x++)
            strays += empty.pixel(x, y) != plotted.pixel(x, y) && !marked.contains(QPoint(x, y));
    }
    EXPECT_EQ(strays, 0) << "pixels changed away from every near star's marker";

    // The named star's marker hovered: the plot-name line names it; moved off to empty space of
    // the diagram, the line is blank again.
    const QPoint marker = hrd + MarkerPoint(star);
    RunXdotool({ "mousemove", Number(marker.x() - 1), Number(marker.y()), "sleep", "0.1",
        "mousemove", Number(marker.x()), Number(marker.y()) });
    EXPECT_EQ(plotName.WaitFor(hrd, 1), 1)
        << "the plot-name line does not read \"" << PlotName(star).toStdString() << "\" ("
        << plotName.Difference(hrd, 1) << " of its pixels differ)";
    RunXdotool(
        { "mousemove", Number(hrd.x() + kEmptySpace.x()), Number(hrd.y() + kEmptySpace.y()) });
    EXPECT_EQ(plotName.WaitFor(hrd, 0), 0)
        << "the plot-name line is not blank over empty space (" << plotName.Difference(hrd, 0)
        << " of its pixels differ)";
    RestThePointer();

    // The marker dragged onto the chart: its system becomes the chart's origin.
    Drag(marker, kDropPoint);
    const std::string origin = "Origin: " + star.name + "\n";
    const std::string after = WaitForReadOut(
        kChartOrigin, [&](const std::string& t) { return t.rfind(origin, 0) == 0; });
    EXPECT_EQ(after.rfind(origin, 0), 0u) << after;

    SaveScreenshot(windows, "hr-across-windows.png");
    EXPECT_EQ(fProgram.state(), QProcess::Running);
}

INSTANTIATE_TEST_SUITE_P(Desktop, HRDiagram, ::testing::Values(false, true),
    [](const ::testing::TestParamInfo<bool>& info) {
        return info.param ? "UnderOpenbox" : "OnTheBareServer";
    });
