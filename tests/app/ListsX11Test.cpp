// Sets of systems carried from window to window of the real program, with and without a window
// manager: the find window's distance panel dragged onto a list window's Equals pad and its
// spectral-class panel onto the AND pad; the list that results dragged onto the chart, which
// then shows only those systems, and onto a second list's NOT pad, which takes all the others.
// Each list's count line is read off the screen; what the chart shows is told by its lit pixels.
#include "ProgramX11Support.h"

#include "widgets/WidgetGeometry.h"

#include <QElapsedTimer>
#include <QLabel>
#include <QSet>
#include <cstring>
#include <memory>
#include <utility>
#include <vector>

namespace {

// The find window's panels in its column, and in a panel the middle of its handle and of its
// controls, all in the row under the panel's title.
const QPoint kSpectralPanel(10, 70);
const QPoint kDistancePanel(10, 310);
constexpr int kRow = 33;
const QPoint kHandle(322 + 16, kRow);
const QPoint kDistanceMode(10 + 55, kRow);
const QPoint kDistanceField(130 + 20, kRow);
const QPoint kSpectralMode(150 + 52, kRow);
const QPoint kHarvardClass(260 + 12, kRow);
const QPoint kDecimalClass(290 + 12, kRow);

// A list window's drop pads, its handle and its count line.
const QPoint kEqualsPad(40 + 16, 16);
const QPoint kNotPad(2 + 16, 34 + 8);
const QPoint kAndPad(42 + 16, 34 + 8);
const QPoint kStarDragger(188 + 16, 10 + 16);
const QRect kCountLine(0, 54, 101, 13);

// Where the windows are moved to, clear of each other and of the control window and the chart.
const QPoint kFindPlace(470, 160);
const QPoint kFirstListPlace(900, 160);
const QPoint kSecondListPlace(900, 580);

// Where sets are dropped on the chart: the middle of its view, well above the read-out.
const QPoint kDropPoint = kChartOrigin + QPoint(kChartWidth / 2, kChartHeight / 3);
// Where the pointer rests between gestures: over none of the program's windows.
const QPoint kRestPoint(1250, 1000);

// The choices made on the panels: systems nearer the Sun than this many parsecs...
constexpr double kNearerThan = 10;
// ... and with a star of a class before this one (hotter than F0).
constexpr int kHarvardF = 4, kDecimalZero = 0;
constexpr const char* kHarvardLetters = "WOBAFGKMRN";
// The mode menus' items: "is", "is less than", "is greater than".
constexpr int kModeCount = 3, kLessThan = 1;

// A system as the catalogue beside the program gives it: a run of records at one position.
struct CatalogueSystem {
    std::string name;
    double x = 0, y = 0, z = 0;
    std::vector<double> classes; // each star's class on the scale W0 = 0, O0 = 1, ... N9 = 9.9
};

// A class such as "G2V" on that scale; -1 for text that does not start with a known letter.
double ClassValue(const char* text)
{
    const char* letter = text[0] ? std::strchr(kHarvardLetters, text[0]) : nullptr;
    if (!letter)
        return -1;
    return double(letter - kHarvardLetters) + 0.1 * std::atof(text + 1);
}

std::vector<CatalogueSystem> ReadCatalogue(const QString& path)
{
    std::vector<CatalogueSystem> systems;
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly))
        return systems;
    const QList<QByteArray> lines = file.readAll().split('\n');
    for (qsizetype i = 0; i + 1 < lines.size(); i += 2) {
        char type[64] = "";
        double magnitude = 0, x = 0, y = 0, z = 0;
        if (std::sscanf(
                lines[i + 1].constData(), "%63s %lf %lf %lf %lf", type, &magnitude, &x, &y, &z)
            != 5)
            break;
        if (systems.empty() || systems.back().x != x || systems.back().y != y
            || systems.back().z != z)
            systems.push_back({ lines[i].toStdString(), x, y, z, {} });
        systems.back().classes.push_back(ClassValue(type));
    }
    return systems;
}

// Reads the count line of a list window off the screen: the line is matched against this
// process's own rendering of "Star Systems: n", drawn by a label like the window's on the
// windows' grey, for every n up to the number of systems.
class CountReader {
public:
    explicit CountReader(int most)
    {
        QWidget back;
        PaintWindowGrey(&back);
        back.resize(kCountLine.size());
        QLabel line(&back);
        line.setGeometry(QRect(QPoint(0, 0), kCountLine.size()));
        back.ensurePolished();
        line.ensurePolished();
        for (int n = 0; n <= most; n++) {
            line.setText(QString("Star Systems: %1").arg(n));
            fLines.push_back(back.grab().toImage().convertToFormat(QImage::Format_RGB32));
        }
    }

    // The number the line of the list window whose inside's top-left is at `list` shows; -1
    // when it shows none of them.
    int Read(QPoint list) const
    {
        const QImage shown = Grab(kCountLine.translated(list));
        for (size_t n = 0; n < fLines.size(); n++) {
            if (fLines[n] == shown)
                return int(n);
        }
        return -1;
    }

    // How many pixels of the line of the list at `list` are not those of the line for n.
    int Difference(QPoint list, int n) const
    {
        return DifferentPixels(Grab(kCountLine.translated(list)), fLines[size_t(n)]);
    }

private:
    std::vector<QImage> fLines;
};

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

    // The program's windows that are shown: its windows, and a pop-up menu while one is open.
    QList<unsigned long> ProgramWindows() const
    {
        QList<unsigned long> windows;
        for (const QString& id : RunXdotool(
                 { "search", "--onlyvisible", "--pid", QString::number(fProgram.processId()) })
                                     .split('\n', Qt::SkipEmptyParts))
            windows.append(id.toULong());
        return windows;
    }

    // Clicks control window item `item` and returns the window titled `title` that it opened;
    // 0 when none came.
    static unsigned long Open(int item, const char* title, const QList<unsigned long>& known = {})
    {
        RunXdotool(ClickAt(ControlCentre(item)));
        unsigned long opened = 0;
        (void)QTest::qWaitFor(
            [&] {
                for (unsigned long window : WindowsNamed(title)) {
                    if (!known.contains(window) && !ClientArea(window).isEmpty()) {
                        opened = window;
                        return true;
                    }
                }
                return false;
            },
            10000);
        return opened;
    }

    // Moves window to `place` and returns where its inside then stands, once it has left where
    // it stood; under a window manager the frame goes where asked, the inside a little below.
    static QPoint Move(unsigned long window, QPoint place)
    {
        const QPoint from = ClientArea(window).topLeft();
        RunXdotool({ "windowmove", QString::number(window), Number(place.x()), Number(place.y()) });
        QPoint at = from;
        (void)QTest::qWaitFor(
            [&] {
                at = ClientArea(window).topLeft();
                return at != from && (at - place).manhattanLength() < 60;
            },
            10000);
        return at;
    }

    // Opens the pop-up menu whose field's middle is at `field`, clicks item `index` of its
    // `count` and waits for it to close; false when no menu came up or it stayed.
    bool Choose(QPoint field, int index, int count) const
    {
        const QList<unsigned long> before = ProgramWindows();
        RunXdotool(ClickAt(field));
        unsigned long menu = 0;
        QRect area;
        const bool opened = QTest::qWaitFor(
            [&] {
                for (unsigned long window : ProgramWindows()) {
                    if (!before.contains(window)) {
                        menu = window;
                        area = ClientArea(window);
                        return area.height() > count * 8;
                    }
                }
                return false;
            },
            5000);
        if (!opened)
            return false;
        // The items are of one height, between a frame a few pixels thick.
        const QPoint item(
            area.center().x(), area.top() + area.height() * (2 * index + 1) / (2 * count));
        RunXdotool(ClickAt(item));
        return QTest::qWaitFor([&] { return !ProgramWindows().contains(menu); }, 5000);
    }

    // Drags from `from` to `to` as a hand does, then takes the pointer off every window.
    static void Drag(QPoint from, QPoint to)
    {
        RunXdotool(DragSteps(from, to));
        RunXdotool({ "mousemove", Number(kRestPoint.x()), Number(kRestPoint.y()) });
    }

    // Expects the count line of the list at `list` to come to read `expected`.
    void ExpectCount(QPoint list, int expected, const char* which) const
    {
        int read = -1;
        (void)QTest::qWaitFor([&] { return (read = fCounts->Read(list)) == expected; }, 10000);
        EXPECT_EQ(read, expected) << "the " << which << " list's count line (-1 when it shows no "
                                  << "number at all; " << fCounts->Difference(list, expected)
                                  << " of its pixels differ from what it should show)";
    }

    // The chart's stars once its picture differs from `before` and has stayed the same for
    // half a second.
    static QImage NewStars(const QImage& before)
    {
        QImage last;
        QElapsedTimer unchanged;
        QImage now;
        (void)QTest::qWaitFor(
            [&] {
                now = Grab(StarArea(kChartOrigin));
                if (now != last) {
                    last = now;
                    unchanged.start();
                }
                return now != before && unchanged.elapsed() >= 500;
            },
            10000);
        return now;
    }

    // The chart's stars once its picture has stayed the same for half a second.
    static QImage SteadyStars() { return NewStars(QImage()); }

    // Stops the chart's steady turn, so that pictures of it taken apart can be laid over each
    // other: the trackball held still eases the turn away, sample by sample. It is let go once
    // the picture has stayed the same for a second; false when it never did.
    static bool StopTheTurn()
    {
        const QPoint trackball = ControlCentre(0);
        RunXdotool({ "mousemove", Number(trackball.x()), Number(trackball.y()), "mousedown", "1" });
        QImage last;
        QElapsedTimer unchanged;
        const bool still = QTest::qWaitFor(
            [&] {
                const QImage now = Grab(StarArea(kChartOrigin));
                if (now != last) {
                    last = now;
                    unchanged.start();
                }
                return unchanged.elapsed() >= 1000;
            },
            15000);
        RunXdotool({ "mouseup", "1", "mousemove", Number(kRestPoint.x()), Number(kRestPoint.y()) });
        return still;
    }

    std::unique_ptr<CountReader> fCounts;
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
        const double distance = std::hypot(system.x - sun.x, system.y - sun.y, system.z - sun.z);
        if (distance >= kNearerThan)
            continue;
        near++;
        nearAndHot += std::any_of(system.classes.begin(), system.classes.end(),
            [&](double c) { return c >= 0 && c < hotterThan; });
    }
    const int others = total - nearAndHot;
    // The catalogue must make every step tell: AND takes some of the near systems and leaves
    // others, several are left so the list's handle drags a set, and the near systems are not
    // all of them.
    ASSERT_LT(near, total);
    ASSERT_GT(nearAndHot, 1);
    ASSERT_LT(nearAndHot, near);
    ASSERT_GT(others, 1);
    fCounts = std::make_unique<CountReader>(total);

    const std::string start = WaitForReadOut(
        kChartOrigin, [](const std::string& t) { return t.rfind("Origin: The Sun\n", 0) == 0; });
    ASSERT_EQ(start.rfind("Origin: The Sun\n", 0), 0u) << start;

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
    for (auto a = windows.begin(); a != windows.end(); ++a) {
        for (auto b = std::next(a); b != windows.end(); ++b) {
            ASSERT_FALSE(FrameArea(a->second).intersects(FrameArea(b->second)))
                << "the " << a->first << " window overlaps the " << b->first << " window";
        }
    }
    ASSERT_EQ(ClientArea(chartWindow).topLeft(), kChartOrigin);
    ExpectCount(first, 0, "first");
    ExpectCount(second, 0, "second");

    // The chart with every system, still, the pointer away from it.
    ASSERT_TRUE(StopTheTurn()) << "the chart kept turning";
    const QImage everything = SteadyStars();
    ASSERT_GT(StarPixels(everything), 20);

    // The near systems: "is less than" 10 on the distance panel, dragged onto Equals.
    ASSERT_TRUE(Choose(find + kDistancePanel + kDistanceMode, kLessThan, kModeCount))
        << "the distance panel's mode menu did not open and close";
    const QPoint field = find + kDistancePanel + kDistanceField;
    RunXdotool({ "mousemove", Number(field.x()), Number(field.y()), "click", "1", "sleep", "0.2",
        "key", "ctrl+a", "type", QString::number(kNearerThan) });
    Drag(find + kDistancePanel + kHandle, first + kEqualsPad);
    ExpectCount(first, near, "first");

    // Of those, the ones with a star hotter than F0: the spectral-class panel onto AND.
    ASSERT_TRUE(Choose(find + kSpectralPanel + kSpectralMode, kLessThan, kModeCount))
        << "the spectral class panel's mode menu did not open and close";
    ASSERT_TRUE(Choose(find + kSpectralPanel + kHarvardClass, kHarvardF, 10))
        << "the Harvard class menu did not open and close";
    ASSERT_TRUE(Choose(find + kSpectralPanel + kDecimalClass, kDecimalZero, 10))
        << "the decimal class menu did not open and close";
    Drag(find + kSpectralPanel + kHandle, first + kAndPad);
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

    if (const char* shots = std::getenv("ND_SCREENSHOTS")) {
        QRect around;
        for (const auto& window : windows)
            around |= FrameArea(window.second);
        EXPECT_TRUE(
            Grab(around.adjusted(-4, -4, 4, 4)).save(QString(shots) + "/lists-across-windows.png"));
    }
    EXPECT_EQ(fProgram.state(), QProcess::Running);
}

INSTANTIATE_TEST_SUITE_P(Desktop, ListsAcrossWindows, ::testing::Values(false, true),
    [](const ::testing::TestParamInfo<bool>& info) {
        return info.param ? "UnderOpenbox" : "OnTheBareServer";
    });
