// The queries over a catalogue of real stars, written by the test in the catalogue's format
// with each star's position from its right ascension, declination and distance (J2000,
// parsecs): x = d cos(dec) cos(ra), y = d sin(dec), z = d cos(dec) sin(ra).
#include "QueryMatches.h"
#include "catalog/TempCatalogue.h"

#include "catalog/SpectralClass.h"
#include "catalog/Universe.h"
#include "core/Constants.h"
#include "query/DECQuery.h"
#include "query/DistanceQuery.h"
#include "query/MGQuery.h"
#include "query/RAQuery.h"
#include "query/SCQuery.h"
#include "query/StarNameQuery.h"
#include "query/StarSysMask.h"

#include <gtest/gtest.h>

#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <set>
#include <string>
#include <vector>

namespace {

struct NearbyStar {
    const char* name;
    const char* spectralClass;
    double magnitude; // absolute
};

struct NearbySystem {
    double raHours, raMinutes, raSeconds;
    int decSign;
    double decDegrees, decMinutes, decSeconds;
    double distance; // parsecs; 0 for the Sun
    std::vector<NearbyStar> stars;
};

const std::vector<NearbySystem> kSystems = {
    { 0, 0, 0, 1, 0, 0, 0, 0, { { "Sun", "G2V", 4.83 } } },
    { 14, 39, 36.49, -1, 60, 50, 2.4, 1.3475,
        { { "Alpha Centauri A", "G2V", 4.38 }, { "Alpha Centauri B", "K1V", 5.71 } } },
    { 14, 29, 42.95, -1, 62, 40, 46.2, 1.3020, { { "Proxima Centauri", "M5.5Ve", 15.53 } } },
    { 17, 57, 48.50, 1, 4, 41, 36.2, 1.8282, { { "Barnard's Star", "M4Ve", 13.21 } } },
    { 10, 56, 29.20, 1, 7, 0, 53.0, 2.4086, { { "Wolf 359", "M6V", 16.55 } } },
    { 11, 3, 20.19, 1, 35, 58, 11.6, 2.5468, { { "Lalande 21185", "M2V", 10.48 } } },
    { 6, 45, 8.92, -1, 16, 42, 58.0, 2.6371,
        { { "Sirius", "A1V", 1.42 }, { "Sirius B", "DA2", 11.18 } } },
    { 1, 39, 1.3, -1, 17, 57, 1.0, 2.68,
        { { "Luyten 726-8 A", "M5.5V", 15.4 }, { "UV Ceti", "M6V", 15.9 } } },
    { 18, 49, 49.36, -1, 23, 50, 10.4, 2.9730, { { "Ross 154", "M3.5V", 13.07 } } },
    { 3, 32, 55.84, -1, 9, 27, 29.7, 3.2028, { { "Epsilon Eridani", "K2V", 6.19 } } },
    { 23, 5, 52.04, -1, 35, 51, 11.1, 3.29, { { "Lacaille 9352", "M0.5V", 9.75 } } },
    { 21, 6, 53.94, 1, 38, 44, 57.9, 3.4965,
        { { "61 Cygni A", "K5V", 7.49 }, { "61 Cygni B", "K7V", 8.31 } } },
    { 7, 39, 18.12, 1, 5, 13, 30.0, 3.5142,
        { { "Procyon", "F5IV-V", 2.66 }, { "Procyon B", "DQZ", 13.0 } } },
    { 0, 18, 22.89, 1, 44, 1, 22.6, 3.5624, { { "Groombridge 34", "M1.5V", 10.32 } } },
    { 22, 3, 21.66, -1, 56, 47, 9.5, 3.6481, { { "Epsilon Indi", "K5V", 6.89 } } },
    { 1, 44, 4.08, -1, 15, 56, 14.9, 3.6522, { { "Tau Ceti", "G8V", 5.68 } } },
    { 19, 50, 47.0, 1, 8, 52, 6.0, 5.13, { { "Altair", "A7V", 2.22 } } },
    { 18, 36, 56.34, 1, 38, 47, 1.3, 7.68, { { "Vega", "A0V", 0.58 } } },
    { 22, 57, 39.05, -1, 29, 37, 20.1, 7.70, { { "Fomalhaut", "A3V", 1.72 } } },
    { 7, 45, 18.95, 1, 28, 1, 34.3, 10.36, { { "Pollux", "K0III", 1.08 } } },
    { 14, 15, 39.67, 1, 19, 10, 56.7, 11.26, { { "Arcturus", "K1.5III", -0.30 } } },
    { 2, 31, 49.09, 1, 89, 15, 50.8, 132.6, { { "Polaris", "F7Ib", -3.6 } } },
    { 6, 23, 57.11, -1, 52, 41, 44.4, 94.8, { { "Canopus", "A9II", -5.71 } } },
    { 5, 55, 10.31, 1, 7, 24, 25.4, 168.1, { { "Betelgeuse", "M1Ia", -5.85 } } },
    { 5, 14, 32.27, -1, 8, 12, 5.9, 264.6, { { "Rigel", "B8Ia", -7.84 } } },
    { 20, 41, 25.91, 1, 45, 16, 49.2, 802, { { "Deneb", "A2Ia", -8.38 } } },
};

double RightAscension(const NearbySystem& s)
{
    return (s.raHours + s.raMinutes / 60 + s.raSeconds / 3600) * 15 * kPI / 180;
}

double Declination(const NearbySystem& s)
{
    return s.decSign * (s.decDegrees + s.decMinutes / 60 + s.decSeconds / 3600) * kPI / 180;
}

class NearbyStars : public ::testing::Test {
protected:
    NearbyStars()
        : file(CatalogueText())
        , universe(file.PathString().c_str(), 1000000, 5000)
    {
    }

    // The catalogue: one record per star, the members of a system at one position so that
    // the reader groups them. Also keeps the positions as the text gives them.
    std::string CatalogueText()
    {
        std::string text;
        for (const NearbySystem& s : kSystems) {
            const double ra = RightAscension(s);
            const double dec = Declination(s);
            char coordinates[3][32];
            std::snprintf(coordinates[0], 32, "%.6f", s.distance * std::cos(dec) * std::cos(ra));
            std::snprintf(coordinates[1], 32, "%.6f", s.distance * std::sin(dec));
            std::snprintf(coordinates[2], 32, "%.6f", s.distance * std::cos(dec) * std::sin(ra));
            written.push_back({ std::strtod(coordinates[0], nullptr),
                std::strtod(coordinates[1], nullptr), std::strtod(coordinates[2], nullptr) });
            for (const NearbyStar& star : s.stars) {
                text += std::string(star.name) + "\n" + star.spectralClass + " "
                    + std::to_string(star.magnitude) + " " + coordinates[0] + " " + coordinates[1]
                    + " " + coordinates[2] + "\n";
            }
        }
        return text;
    }

    int32_t IndexOf(const char* name) const
    {
        for (size_t i = 0; i < kSystems.size(); i++) {
            if (std::string(kSystems[i].stars.front().name) == name)
                return static_cast<int32_t>(i);
        }
        ADD_FAILURE() << "no system " << name;
        return -1;
    }

    std::set<int32_t> Indices(std::initializer_list<const char*> names) const
    {
        std::set<int32_t> indices;
        for (const char* name : names)
            indices.insert(IndexOf(name));
        return indices;
    }

    struct Point {
        double x, y, z;
    };
    std::vector<Point> written; // each system's position as the catalogue text has it
    TempCatalogue file;
    Universe universe;
};

} // namespace

TEST_F(NearbyStars, TheCatalogueHoldsOneSystemPerEntry)
{
    ASSERT_EQ(universe.CountItems(), static_cast<int32_t>(kSystems.size()));
    for (size_t i = 0; i < kSystems.size(); i++) {
        const StarSystem* system = universe.SystemAt(static_cast<int32_t>(i));
        EXPECT_STREQ(system->GetName(), kSystems[i].stars.front().name);
        EXPECT_EQ(system->CountItems(), static_cast<int32_t>(kSystems[i].stars.size()));
    }
}

TEST_F(NearbyStars, WithinFiveParsecsOfTheSun)
{
    ASSERT_EQ(universe.CountItems(), static_cast<int32_t>(kSystems.size()));
    std::set<int32_t> expected;
    for (size_t i = 0; i < written.size(); i++) {
        const Point& p = written[i];
        if (std::sqrt(p.x * p.x + p.y * p.y + p.z * p.z) < 5)
            expected.insert(static_cast<int32_t>(i));
    }
    // The sixteen systems listed before Altair, the Sun among them.
    EXPECT_EQ(expected.size(), 16u);
    EXPECT_EQ(expected.count(IndexOf("Altair")), 0u);

    DistanceQuery query(&universe);
    DistanceQueryParam param { kQueryLessThan, -1, 5 };
    EXPECT_EQ(Matches(query, &param), expected);
}

TEST_F(NearbyStars, NeighboursOfAlphaCentauri)
{
    const int32_t alphaCen = IndexOf("Alpha Centauri A");
    const Point& centre = written[alphaCen];
    std::set<int32_t> expected;
    for (size_t i = 0; i < written.size(); i++) {
        const Point& p = written[i];
        const double dx = p.x - centre.x, dy = p.y - centre.y, dz = p.z - centre.z;
        if (std::sqrt(dx * dx + dy * dy + dz * dz) < 2.5)
            expected.insert(static_cast<int32_t>(i));
    }
    DistanceQuery query(&universe);
    DistanceQueryParam param { kQueryLessThan, alphaCen, 2.5 };
    EXPECT_EQ(Matches(query, &param), expected);
    EXPECT_EQ(expected.count(IndexOf("Proxima Centauri")), 1u);
    EXPECT_EQ(expected.count(IndexOf("Sun")), 1u);

    // Proxima is about 0.06 pc from its companions: within the tolerance of "is" 0.
    param.mode = kQueryIs;
    param.distance = 0;
    EXPECT_EQ(Matches(query, &param), Indices({ "Alpha Centauri A", "Proxima Centauri" }));
}

TEST_F(NearbyStars, NamesByCommonName)
{
    StarNameQuery query(&universe);
    NameQueryParam param { kNameContains, "Barnard", true };
    EXPECT_EQ(Matches(query, &param), Indices({ "Barnard's Star" }));
    param.text = "sirius b";
    param.caseSensitive = false;
    EXPECT_EQ(Matches(query, &param), Indices({ "Sirius" }));
    param.text = "centauri";
    EXPECT_EQ(Matches(query, &param), Indices({ "Alpha Centauri A", "Proxima Centauri" }));
    param.text = "Ceti";
    EXPECT_EQ(Matches(query, &param), Indices({ "Luyten 726-8 A", "Tau Ceti" }));
    param.mode = kNameIs;
    param.text = "VEGA";
    EXPECT_EQ(Matches(query, &param), Indices({ "Vega" }));
    param.text = "sirius";
    EXPECT_EQ(Matches(query, &param), Indices({ "Sirius" }));
    param.mode = kNameStartsWith;
    param.text = "epsilon";
    EXPECT_EQ(Matches(query, &param), Indices({ "Epsilon Eridani", "Epsilon Indi" }));
}

TEST_F(NearbyStars, RightAscensionFindsStarsByTheirCoordinates)
{
    RAQuery query(&universe);
    // 14h 39m 36s: Alpha Centauri; Proxima, ten minutes of time earlier, is outside the window.
    RAQueryParam param { kQueryIs, RightAscension(kSystems[IndexOf("Alpha Centauri A")]) };
    EXPECT_EQ(Matches(query, &param), Indices({ "Alpha Centauri A" }));
    param.rightAscension = (6 + 45.0 / 60) * 15 * kPI / 180;
    EXPECT_EQ(Matches(query, &param), Indices({ "Sirius" }));
    // Before 2h; the Sun, on no axis, counts as right ascension 0.
    param.mode = kQueryLessThan;
    param.rightAscension = 2 * 15 * kPI / 180;
    EXPECT_EQ(
        Matches(query, &param), Indices({ "Sun", "Luyten 726-8 A", "Groombridge 34", "Tau Ceti" }));
    // After 22h.
    param.mode = kQueryGreaterThan;
    param.rightAscension = 22 * 15 * kPI / 180;
    EXPECT_EQ(Matches(query, &param), Indices({ "Lacaille 9352", "Epsilon Indi", "Fomalhaut" }));
}

TEST_F(NearbyStars, DeclinationFindsStarsByTheirCoordinates)
{
    DECQuery query(&universe);
    DECQueryParam param { kQueryIs, 89.25 * kPI / 180 };
    EXPECT_EQ(Matches(query, &param), Indices({ "Polaris" }));
    param.mode = kQueryGreaterThan;
    param.declination = 38 * kPI / 180;
    EXPECT_EQ(Matches(query, &param),
        Indices({ "61 Cygni A", "Groombridge 34", "Vega", "Polaris", "Deneb" }));
    param.mode = kQueryLessThan;
    param.declination = -50 * kPI / 180;
    EXPECT_EQ(Matches(query, &param),
        Indices({ "Alpha Centauri A", "Proxima Centauri", "Epsilon Indi", "Canopus" }));
    // Every star has a declination but the Sun, which matches nothing.
    param.declination = kPI;
    std::set<int32_t> all;
    for (size_t i = 1; i < kSystems.size(); i++)
        all.insert(static_cast<int32_t>(i));
    EXPECT_EQ(Matches(query, &param), all);
}

TEST_F(NearbyStars, SpectralClassAndMagnitude)
{
    const SpectralClass g2("G2");
    SCQuery sc(&universe);
    SCQueryParam scParam { kQueryIs, kAnyStarInSystem, &g2 };
    EXPECT_EQ(Matches(sc, &scParam), Indices({ "Sun", "Alpha Centauri A" }));
    const SpectralClass k1("K1V");
    scParam.spectralClass = &k1;
    EXPECT_EQ(Matches(sc, &scParam), Indices({ "Alpha Centauri A" }));
    scParam.starMode = kFirstStarInSystem;
    EXPECT_TRUE(Matches(sc, &scParam).empty());

    MGQuery mg(&universe);
    MGQueryParam mgParam { kQueryLessThan, kAnyStarInSystem, 0 };
    EXPECT_EQ(Matches(mg, &mgParam),
        Indices({ "Arcturus", "Polaris", "Canopus", "Betelgeuse", "Rigel", "Deneb" }));
    mgParam.mode = kQueryIs;
    mgParam.magnitude = 4.83;
    EXPECT_EQ(Matches(mg, &mgParam), Indices({ "Sun" }));
    // White dwarfs: the companions of Sirius and Procyon are faint, their primaries bright.
    mgParam.mode = kQueryGreaterThan;
    mgParam.magnitude = 11;
    mgParam.starMode = kFirstStarInSystem;
    const std::set<int32_t> faintPrimaries = Matches(mg, &mgParam);
    mgParam.starMode = kFirstOrSecondStar;
    const std::set<int32_t> faintFirstOrSecond = Matches(mg, &mgParam);
    EXPECT_EQ(faintPrimaries.count(IndexOf("Sirius")), 0u);
    EXPECT_EQ(faintFirstOrSecond.count(IndexOf("Sirius")), 1u);
    EXPECT_EQ(faintFirstOrSecond.count(IndexOf("Procyon")), 1u);
}
