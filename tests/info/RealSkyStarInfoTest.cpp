// The star information terminal on the real sky: Alpha Centauri as seen from Sirius, and Proxima
// beside Alpha Centauri. Every figure on the screen is checked against one worked out here from
// the catalogue's positions: x toward right ascension 0 h, z toward 6 h, y toward the north
// celestial pole, parsecs.
#include "info/StarInfoScreen.h"

#include "catalog/Star.h"
#include "catalog/Universe.h"
#include "core/MessageCodes.h"
#include "info/StarIView.h"
#include "info/StarInfoWindow.h"
#include "platform/qt/RecordingHandler.h"
#include "resources/ResourceData.h"

#include <QTest>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <gtest/gtest.h>
#include <string>

namespace {

constexpr double kPi = 3.14159265358979323846;
constexpr double kAUPerParsec = 206264.806;

// The index of the first system that has a member named name, or -1.
int32_t SystemWithMember(const Universe& sky, const char* name)
{
    for (int32_t i = 0; i < sky.CountItems(); i++) {
        const StarSystem* system = sky.SystemAt(i);
        for (int32_t j = 0; j < system->CountItems(); j++) {
            if (std::strcmp(system->StarAt(j)->GetName(), name) == 0)
                return i;
        }
    }
    return -1;
}

// Where system to lies seen from system from: distance in parsecs, right ascension in hours
// (0 to 24), declination in degrees.
struct Sighting {
    double distance, hours, degrees;
};
Sighting Sight(const StarSystem* from, const StarSystem* to)
{
    const double dx = to->position.x - from->position.x;
    const double dy = to->position.y - from->position.y;
    const double dz = to->position.z - from->position.z;
    const double d = std::sqrt(dx * dx + dy * dy + dz * dz);
    double ra = std::atan2(dz, dx);
    if (ra < 0)
        ra += 2 * kPi;
    return { d, ra * 12 / kPi, std::asin(dy / d) * 180 / kPi };
}

// A number read from the screen at (row, col): the first figure of the text there.
double NumberAt(const StarIView& view, int32_t row, int32_t col)
{
    const std::string text = ScreenText(view, row, col, size_t(view.Cols() - col));
    double value = NAN;
    EXPECT_EQ(std::sscanf(text.c_str(), "%lf", &value), 1) << "row " << row << ": " << text;
    return value;
}

class RealSkyStarInfo : public ::testing::Test {
protected:
    static void SetUpTestSuite()
    {
        const std::string file = std::string(ND_APP_DIR) + "/stars.dat";
        ASSERT_TRUE(std::filesystem::exists(file)) << "run scripts/setup, then build";
        InitResources();
        sky = new Universe(file.c_str(), 1000000, 5000);
    }
    static void TearDownTestSuite()
    {
        delete sky;
        sky = nullptr;
    }

    void SetUp() override
    {
        ASSERT_NE(sky, nullptr);
        sirius = SystemWithMember(*sky, "Sirius");
        alphaCentauri = SystemWithMember(*sky, "Rigil Kentaurus");
        if (alphaCentauri < 0)
            alphaCentauri = SystemWithMember(*sky, "Alpha Centauri");
        proxima = SystemWithMember(*sky, "Proxima Centauri");
        ASSERT_GE(sirius, 0);
        ASSERT_GE(alphaCentauri, 0);
        ASSERT_GE(proxima, 0);
        ASSERT_NE(proxima, alphaCentauri) << "Proxima lies apart from the pair";
    }

    static void SendUniverse(StarIView& view)
    {
        Message message(kUniversePointer);
        message.AddPointer(kUniversePtrString, sky);
        view.MessageReceived(&message);
    }

    static void Drop(StarIView& view, int32_t index, int y)
    {
        Message message(kStarMessage);
        message.AddInt32(kSystemIndexString, index);
        const QPoint screen = view.mapToGlobal(QPoint(100, y));
        message.SetDropped(BPoint(float(screen.x()), float(screen.y())));
        view.MessageReceived(&message);
    }

    // The distance line's two figures against d parsecs.
    static void ExpectDistance(const StarIView& view, double d)
    {
        double parsecs = 0, lightYears = 0;
        const std::string line = ScreenText(view, 6, 12, 40);
        ASSERT_EQ(
            std::sscanf(line.c_str(), "%lf parsecs ( %lf light-years )", &parsecs, &lightYears), 2)
            << line;
        EXPECT_NEAR(parsecs, d, 0.0051);
        EXPECT_NEAR(lightYears, d * 3.26, 0.0051);
    }

    static inline Universe* sky = nullptr;
    int32_t sirius = -1, alphaCentauri = -1, proxima = -1;
};

} // namespace

TEST_F(RealSkyStarInfo, AlphaCentauriSeenFromSirius)
{
    StarIView view(BPoint(0, 0), "Star Info View");
    SendUniverse(view);
    Drop(view, sirius, 20);
    Drop(view, alphaCentauri, 150);
    TypeAll(view);

    const StarSystem* from = sky->SystemAt(sirius);
    const StarSystem* to = sky->SystemAt(alphaCentauri);
    const Sighting seen = Sight(from, to);
    std::printf("Alpha Centauri from Sirius: %.4f pc, RA %.4f h, Dec %+.4f deg; the screen: %s / "
                "%s\n",
        seen.distance, seen.hours, seen.degrees, ScreenRow(view, 10).c_str(),
        ScreenRow(view, 11).c_str());
    EXPECT_EQ(ScreenText(view, 2, 4, 23), "Sirius");
    ExpectDistance(view, seen.distance);

    // Each member's brightness as it would look from Sirius: the inverse-square law in
    // magnitudes, m = M + 5 log10(d / 10 pc). Shown to a tenth.
    for (int32_t i = 0; i < to->CountItems() && i < 3; i++) {
        const Star* star = to->StarAt(i);
        EXPECT_EQ(ScreenText(view, 10 + i, 4, 23), std::string(star->GetName()).substr(0, 23));
        const double apparent = star->GetMagnitude() + 5 * std::log10(seen.distance / 10);
        EXPECT_NEAR(NumberAt(view, 10 + i, 28), apparent, 0.051) << star->GetName();
    }

    // The direction: whole hours and minutes, whole degrees (signed) and arc-minutes.
    const std::string hours = ScreenText(view, 10, 41, 3);
    const std::string minutes = ScreenText(view, 10, 45, 5);
    ASSERT_EQ(hours.back(), 'h');
    ASSERT_EQ(minutes.back(), 'm');
    const double shownHours = std::stod(hours) + std::stod(minutes) / 60;
    EXPECT_NEAR(shownHours, seen.hours, 0.051 / 60);
    const std::string degrees = ScreenText(view, 11, 40, 4);
    const std::string arcMinutes = ScreenText(view, 11, 45, 5);
    ASSERT_EQ(degrees.back(), 'd');
    ASSERT_EQ(arcMinutes.back(), '\'');
    const double sign = degrees[0] == '-' ? -1 : 1;
    const double shownDegrees = sign * (std::abs(std::stod(degrees)) + std::stod(arcMinutes) / 60);
    EXPECT_NEAR(shownDegrees, seen.degrees, 0.051 / 60);
    // Seen from Sirius the pair lies far south of Sirius's own equator (our sky's south, shifted
    // by the 2.6 pc between us and Sirius): the Sun's neighbour is no neighbour of Sirius.
    EXPECT_LT(seen.degrees, 0);
}

TEST_F(RealSkyStarInfo, ProximaLiesSome13000AstronomicalUnitsFromAlphaCentauri)
{
    StarIView view(BPoint(0, 0), "Star Info View");
    SendUniverse(view);
    Drop(view, alphaCentauri, 20);
    Drop(view, proxima, 150);
    TypeAll(view);
    const Sighting seen = Sight(sky->SystemAt(alphaCentauri), sky->SystemAt(proxima));
    std::printf("Proxima from Alpha Centauri: %.4f pc = %.0f AU; the screen: %s\n", seen.distance,
        seen.distance * kAUPerParsec, ScreenRow(view, 6).c_str());
    EXPECT_GT(seen.distance * kAUPerParsec, 8000);
    EXPECT_LT(seen.distance * kAUPerParsec, 18000);
    ExpectDistance(view, seen.distance);
    // From so near, Proxima is a star of the fifth magnitude, not the eleventh it is from here.
    const Star* star = sky->SystemAt(proxima)->StarAt(0);
    EXPECT_NEAR(
        NumberAt(view, 10, 28), star->GetMagnitude() + 5 * std::log10(seen.distance / 10), 0.051);
}

TEST_F(RealSkyStarInfo, APictureOfTheWindow)
{
    const char* shots = std::getenv("ND_SCREENSHOTS");
    if (!shots)
        GTEST_SKIP() << "set ND_SCREENSHOTS to a directory for the picture";
    RecordingHandler help;
    StarInfoWindow window(BPoint(120, 150), "Star Info", &help);
    window.setAttribute(Qt::WA_DeleteOnClose, false);
    StarIView* view = window.View();
    SendUniverse(*view);
    Drop(*view, sirius, 20);
    Drop(*view, alphaCentauri, 150);
    // Typed by the terminal's own thread at 60 characters a second, then left to settle.
    ASSERT_TRUE(
        QTest::qWaitFor([view] { return view->HWTIsDone() && view->IsSuspended(); }, 120000));
    DeliverPostedMessages();
    EXPECT_TRUE(window.grab().save(QString(shots) + "/star-info.png"));
}

namespace {

// The rows of the screen that no system's members write: the headers, untouched.
void ExpectHeadersIntact(const StarIView& view)
{
    EXPECT_EQ(ScreenText(view, 0, 0, 52),
        RowOf({ { 0, "STAR 1" }, { 28, "SPECTRAL" }, { 40, "VISUAL" } }));
    EXPECT_EQ(ScreenText(view, 1, 0, 52),
        RowOf({ { 0, "NAME" }, { 28, "CLASS" }, { 40, "LUMINOSITY" } }));
    EXPECT_EQ(ScreenRow(view, 5), "");
    EXPECT_EQ(ScreenText(view, 6, 0, 12), "  DISTANCE:");
    EXPECT_EQ(ScreenRow(view, 7), "");
    EXPECT_EQ(ScreenText(view, 8, 0, 52),
        RowOf({ { 0, "STAR 2" }, { 28, "SPECTRAL" }, { 40, "R ASCENSION" } }));
    EXPECT_EQ(ScreenText(view, 9, 0, 52),
        RowOf({ { 0, "NAME" }, { 28, "CLASS" }, { 40, "DECLINATION" } }));
}

// A block's three rows from row first: each member's name after its letter, the third
// followed by how many more there are; rows without a member hold just their letter.
void ExpectMembers(const StarIView& view, int32_t first, const StarSystem* system)
{
    for (int32_t i = 0; i < 3; i++) {
        const std::string label = std::string(" ") + char('A' + i) + ":";
        if (i >= system->CountItems()) {
            EXPECT_EQ(ScreenRow(view, first + i), label) << "row " << first + i;
            continue;
        }
        std::string name = system->StarAt(i)->GetName();
        if (i == 2 && system->CountItems() > 3) {
            const std::string mark = "  +" + std::to_string(system->CountItems() - 3);
            name = name.substr(0, 23 - mark.size()) + mark;
        }
        EXPECT_EQ(ScreenText(view, first + i, 0, 28), RowOf({ { 0, label }, { 4, name } }))
            << "row " << first + i;
    }
}

} // namespace

TEST_F(RealSkyStarInfo, Wolf630ListsThreeMembersCountsTheRestAndLeavesTheScreenClean)
{
    const int32_t wolf = SystemWithMember(*sky, "Wolf 630 A");
    const int32_t alula = SystemWithMember(*sky, "Alula Australis");
    ASSERT_GE(wolf, 0);
    ASSERT_GE(alula, 0);
    ASSERT_GE(sky->SystemAt(wolf)->CountItems(), 4) << "Wolf 630 is no longer a system of many";
    ASSERT_GE(sky->SystemAt(alula)->CountItems(), 4);
    StarIView view(BPoint(0, 0), "Star Info View");
    SendUniverse(view);
    Drop(view, wolf, 20);
    Drop(view, alula, 150);
    TypeAll(view);
    std::printf("Wolf 630 over Alula Australis:\n%s\n%s\n%s\n%s\n%s\n%s\n",
        ScreenRow(view, 2).c_str(), ScreenRow(view, 3).c_str(), ScreenRow(view, 4).c_str(),
        ScreenRow(view, 10).c_str(), ScreenRow(view, 11).c_str(), ScreenRow(view, 12).c_str());
    ExpectHeadersIntact(view);
    ExpectMembers(view, 2, sky->SystemAt(wolf));
    ExpectMembers(view, 10, sky->SystemAt(alula));

    // Sirius after them, on each half in turn: every row clean.
    Drop(view, sirius, 20);
    TypeAll(view);
    ExpectHeadersIntact(view);
    ExpectMembers(view, 2, sky->SystemAt(sirius));
    ExpectMembers(view, 10, sky->SystemAt(alula));
    Drop(view, wolf, 150);
    TypeAll(view);
    ExpectMembers(view, 10, sky->SystemAt(wolf));
    Drop(view, alphaCentauri, 20);
    Drop(view, sirius, 150);
    TypeAll(view);
    ExpectHeadersIntact(view);
    ExpectMembers(view, 2, sky->SystemAt(alphaCentauri));
    ExpectMembers(view, 10, sky->SystemAt(sirius));
}

TEST_F(RealSkyStarInfo, PicturesOfWolf630AndOfSiriusAfterIt)
{
    const char* shots = std::getenv("ND_SCREENSHOTS");
    if (!shots)
        GTEST_SKIP() << "set ND_SCREENSHOTS to a directory for the pictures";
    const int32_t wolf = SystemWithMember(*sky, "Wolf 630 A");
    const int32_t alula = SystemWithMember(*sky, "Alula Australis");
    ASSERT_GE(wolf, 0);
    ASSERT_GE(alula, 0);
    RecordingHandler help;
    StarInfoWindow window(BPoint(120, 150), "Star Info", &help);
    window.setAttribute(Qt::WA_DeleteOnClose, false);
    StarIView* view = window.View();
    const auto settled = [view] { return view->HWTIsDone() && view->IsSuspended(); };
    SendUniverse(*view);
    Drop(*view, wolf, 20);
    Drop(*view, alula, 150);
    ASSERT_TRUE(QTest::qWaitFor(settled, 120000));
    DeliverPostedMessages();
    EXPECT_TRUE(window.grab().save(QString(shots) + "/star-info-wolf630.png"));
    Drop(*view, sirius, 20);
    ASSERT_TRUE(QTest::qWaitFor(settled, 120000));
    DeliverPostedMessages();
    EXPECT_TRUE(window.grab().save(QString(shots) + "/star-info-after.png"));
}
