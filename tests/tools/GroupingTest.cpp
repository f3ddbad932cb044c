#include "ImporterFixture.h"
#include "tools/importer/SystemGrouping.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <numeric>
#include <random>
#include <sstream>
#include <string>
#include <vector>

namespace {

constexpr double kPi = 3.141592653589793;
constexpr double kArcsecond = kPi / 180 / 3600;

ImportStar Star(double raRadians, double decRadians, double parallax, double magnitude)
{
    ImportStar s;
    s.ra = raRadians;
    s.dec = decRadians;
    s.parallax = parallax;
    s.absoluteMagnitude = magnitude;
    s.spectralClass = "G2V";
    s.name = "star";
    return s;
}

// The widest angle (radians) the rule allows a pair at one parsec: 5,000 AU seen from there.
constexpr double kAngleAtOneParsec = kMaxSeparationAU / 206264.806;

// Uniform doubles from a generator whose output the standard fixes, so every platform sees
// the same catalogue for a seed.
class Dice {
public:
    explicit Dice(uint64_t seed)
        : fRandom(seed)
    {
    }
    double Uniform(double low, double high)
    {
        return low + (high - low) * static_cast<double>(fRandom() >> 11) * 0x1.0p-53;
    }
    uint64_t Below(uint64_t n) { return fRandom() % n; }

private:
    std::mt19937_64 fRandom;
};

// A star anywhere on the sky.
ImportStar AnywhereAt(Dice& dice, double parallax, double magnitude)
{
    return Star(dice.Uniform(0, 2 * kPi), std::asin(dice.Uniform(-1, 1)), parallax, magnitude);
}

// A star angle radians from primary in a random direction, at the given parallax.
ImportStar Beside(const ImportStar& primary, double angle, double parallax, Dice& dice)
{
    const double cd = std::cos(primary.dec);
    const double u[3]
        = { cd * std::cos(primary.ra), std::sin(primary.dec), cd * std::sin(primary.ra) };
    // Two unit vectors across the line of sight: toward increasing RA and increasing Dec.
    const double east[3] = { -std::sin(primary.ra), 0, std::cos(primary.ra) };
    const double north[3] = { -std::sin(primary.dec) * std::cos(primary.ra), std::cos(primary.dec),
        -std::sin(primary.dec) * std::sin(primary.ra) };
    const double turn = dice.Uniform(0, 2 * kPi);
    double v[3];
    for (int k = 0; k < 3; k++) {
        const double across = std::cos(turn) * east[k] + std::sin(turn) * north[k];
        v[k] = std::cos(angle) * u[k] + std::sin(angle) * across;
    }
    return Star(std::atan2(v[2], v[0]), std::asin(std::clamp(v[1], -1.0, 1.0)), parallax,
        dice.Uniform(-2, 15));
}

// Parallax of a companion: off by up to 1.3 times the rule's tolerance, so that about as many
// companions miss as match, many of them close to the limit.
double CompanionParallax(double parallax, Dice& dice)
{
    const double error = std::max(1.0, 0.02 * parallax);
    const double tolerance = 3 * std::sqrt(2.0) * error;
    return std::max(0.5, parallax + dice.Uniform(-1.3, 1.3) * tolerance);
}

// Stars everywhere from 1 mas to 9,999,999 mas, with pairs, triples and a tight cluster whose
// separations straddle the rule's limits, a few stars nearer than any real one, and a few in
// fixed groups.
std::vector<ImportStar> TestCatalogue(uint64_t seed, size_t count)
{
    Dice dice(seed);
    std::vector<ImportStar> stars;
    // A handful of stars far nearer than any real one, all around the sky: at such distances
    // the rule allows any angle, so the ones whose parallaxes agree are one system.
    for (double parallax : { 9999999.0, 9600000.0, 9300000.0, 2000000.0, 31000.0 })
        stars.push_back(AnywhereAt(dice, parallax, dice.Uniform(-2, 15)));
    // A cluster: stars in a patch of the sky at about one distance, chaining into systems.
    const ImportStar centre = AnywhereAt(dice, 40, 3);
    for (int k = 0; k < 60; k++)
        stars.push_back(Beside(centre, dice.Uniform(0, 6) * kAngleAtOneParsec * 40 / 1000,
            CompanionParallax(40, dice), dice));
    while (stars.size() < count) {
        // Parallaxes spread evenly in their logarithm, from 1 mas to 10,000 mas, plus the
        // values where the error switches from its floor to its fraction.
        const double parallax
            = dice.Below(20) == 0 ? (dice.Below(2) ? 1.0 : 50.0) : std::pow(10, dice.Uniform(0, 4));
        const ImportStar primary = AnywhereAt(dice, parallax, dice.Uniform(-2, 15));
        stars.push_back(primary);
        const uint64_t companions = dice.Below(4); // none, a pair, a triple, a quadruple
        for (uint64_t k = 0; k < companions; k++) {
            const double distance = 1000 / parallax;
            const double angle = dice.Uniform(0, 1.3) * kAngleAtOneParsec / distance;
            stars.push_back(Beside(primary, angle, CompanionParallax(parallax, dice), dice));
        }
    }
    for (size_t k = 50; k < stars.size(); k += 97)
        stars[k].group = static_cast<int64_t>(k % 3);
    return stars;
}

// For each star, the lowest index in its system.
std::vector<size_t> FirstOfSystem(size_t count, const std::vector<StarGroup>& systems)
{
    std::vector<size_t> first(count, count);
    for (const StarGroup& system : systems) {
        const size_t lowest = *std::min_element(system.members.begin(), system.members.end());
        for (size_t member : system.members)
            first[member] = lowest;
    }
    return first;
}

// The same, by trying the rule on every pair of stars.
std::vector<size_t> FirstOfSystemByEveryPair(const std::vector<ImportStar>& stars)
{
    const size_t n = stars.size();
    std::vector<size_t> parent(n);
    std::iota(parent.begin(), parent.end(), size_t(0));
    auto root = [&](size_t i) {
        while (parent[i] != i)
            i = parent[i];
        return i;
    };
    auto join = [&](size_t a, size_t b) {
        a = root(a);
        b = root(b);
        parent[std::max(a, b)] = std::min(a, b);
    };
    for (size_t i = 0; i < n; i++) {
        for (size_t j = i + 1; j < n; j++) {
            const bool fixed = stars[i].group >= 0 || stars[j].group >= 0;
            if (fixed ? stars[i].group == stars[j].group : SameSystem(stars[i], stars[j]))
                join(i, j);
        }
    }
    std::vector<size_t> first(n);
    for (size_t i = 0; i < n; i++)
        first[i] = root(i);
    return first;
}

// A catalogue shaped like the real sky: stars evenly spread in space from 1 pc to 1,000 pc
// (parallaxes 1 to 1,000 mas), one in eight with a close companion.
std::vector<ImportStar> SkyLikeCatalogue(uint64_t seed, size_t count)
{
    Dice dice(seed);
    std::vector<ImportStar> stars;
    stars.reserve(count);
    while (stars.size() < count) {
        const double distance = std::cbrt(dice.Uniform(1, 1e9));
        const ImportStar primary = AnywhereAt(dice, 1000 / distance, dice.Uniform(-2, 15));
        stars.push_back(primary);
        if (dice.Below(8) == 0) {
            const double angle = dice.Uniform(0, 0.9) * kAngleAtOneParsec / distance;
            stars.push_back(Beside(primary, angle, primary.parallax * 1.01, dice));
        }
    }
    return stars;
}

} // namespace

TEST(Grouping, CloseOnTheSkyAndAtOneDistance)
{
    const ImportStar a = Star(1.0, 0.5, 100, 5);
    // 100 mas is 10 pc: 5,000 AU there is 500 arc-seconds.
    EXPECT_TRUE(SameSystem(a, Star(1.0, 0.5 + 490 * kArcsecond, 100, 6)));
    EXPECT_FALSE(SameSystem(a, Star(1.0, 0.5 + 510 * kArcsecond, 100, 6)));
    // Errors of 2% each: three combined errors are about 8.8 mas here.
    EXPECT_TRUE(SameSystem(a, Star(1.0, 0.5, 108, 6)));
    EXPECT_FALSE(SameSystem(a, Star(1.0, 0.5, 109, 6)));
    // Far stars: the 1 mas floor, 4.2 mas of tolerance.
    EXPECT_TRUE(SameSystem(Star(2, 0.1, 5, 1), Star(2, 0.1, 9.1, 1)));
    EXPECT_FALSE(SameSystem(Star(2, 0.1, 5, 1), Star(2, 0.1, 9.3, 1)));
}

TEST(Grouping, SystemsBrightestFirstInOrderOfTheirFirstStar)
{
    std::vector<ImportStar> stars = {
        Star(0.1, 0.1, 50, 6), // 0: joins 2
        Star(3.0, -0.4, 20, 2), // 1: alone
        Star(0.1, 0.1 + 20 * kArcsecond, 50.5, 4), // 2: brighter than 0
        Star(0.1, 0.1 + 40 * kArcsecond, 49.8, 8), // 3: chained through 2
    };
    const auto systems = GroupSystems(stars);
    ASSERT_EQ(systems.size(), 2u);
    EXPECT_EQ(systems[0].members, (std::vector<size_t> { 2, 0, 3 }));
    EXPECT_EQ(systems[1].members, (std::vector<size_t> { 1 }));
}

TEST(Grouping, FixedGroupsAreKept)
{
    std::vector<ImportStar> stars
        = { Star(0.1, 0.1, 50, 6), Star(0.1, 0.1, 50, 5), Star(0.1, 0.1, 50, 4) };
    stars[0].group = 7;
    stars[1].group = 7;
    stars[2].group = 9; // same place, but a group of its own
    const auto systems = GroupSystems(stars);
    ASSERT_EQ(systems.size(), 2u);
    EXPECT_EQ(systems[0].members, (std::vector<size_t> { 1, 0 }));
    EXPECT_EQ(systems[1].members, (std::vector<size_t> { 2 }));
}

TEST(Grouping, PositionsInTheProgramsFrame)
{
    double x, y, z;
    CartesianPosition(Star(0, 0, 1000, 0), &x, &y, &z);
    EXPECT_NEAR(x, 1, 1e-12);
    EXPECT_NEAR(y, 0, 1e-12);
    EXPECT_NEAR(z, 0, 1e-12);
    CartesianPosition(Star(kPi / 2, 0, 500, 0), &x, &y, &z); // 6 h, 2 pc
    EXPECT_NEAR(x, 0, 1e-12);
    EXPECT_NEAR(z, 2, 1e-12);
    CartesianPosition(Star(1.0, kPi / 2, 250, 0), &x, &y, &z); // the pole, 4 pc
    EXPECT_NEAR(y, 4, 1e-12);
}

TEST(Grouping, SameSystemsAsTryingEveryPair)
{
    for (uint64_t seed : { 1, 2, 3 }) {
        const std::vector<ImportStar> stars = TestCatalogue(seed, 1500);
        const auto systems = GroupSystems(stars);
        EXPECT_EQ(FirstOfSystem(stars.size(), systems), FirstOfSystemByEveryPair(stars))
            << "seed " << seed;

        // The catalogue is worth the comparison: many multiple systems, and the three nearest
        // stars (parallaxes within 8% of each other) one system across the whole sky.
        size_t multiple = 0;
        for (const StarGroup& system : systems)
            multiple += system.members.size() > 1;
        EXPECT_GT(multiple, 200u) << "seed " << seed;
        const auto first = FirstOfSystem(stars.size(), systems);
        EXPECT_EQ(first[1], 0u);
        EXPECT_EQ(first[2], 0u);
        EXPECT_NE(first[3], 0u);
    }
}

TEST(Grouping, WorkGrowsWithTheStarsNotTheirSquare)
{
    // One star a ten-thousandth of a parsec away allows any angle for its own pairs; it must
    // not widen the search for every other star.
    std::vector<ImportStar> stars = SkyLikeCatalogue(11, 120000);
    GroupingStats without;
    const auto systemsWithout = GroupSystems(stars, &without);
    stars.push_back(Star(1.0, 0.3, 9999999, 20));
    GroupingStats with;
    const auto systems = GroupSystems(stars, &with);

    const int64_t n = static_cast<int64_t>(stars.size());
    EXPECT_LT(with.candidatePairs, n);
    EXPECT_LT(with.candidatePairs, without.candidatePairs + 100);
    ASSERT_EQ(systems.size(), systemsWithout.size() + 1);
    EXPECT_EQ(systems.back().members, (std::vector<size_t> { stars.size() - 1 }));
    // Most companions are one system with their primary.
    EXPECT_LT(systems.size(), stars.size() - stars.size() / 20);
}

namespace {

using GroupingImport = ImportFolder;

// The systems of an imported catalogue, each as its members' names in the order written.
std::vector<std::vector<std::string>> SystemsOf(const std::string& catalogue)
{
    std::vector<std::vector<std::string>> systems;
    std::istringstream in(catalogue);
    std::string name, line, previous;
    while (std::getline(in, name) && std::getline(in, line)) {
        // The position is the last three numbers of the second line.
        size_t cut = line.size();
        for (int k = 0; k < 3; k++)
            cut = line.rfind(' ', cut - 1);
        const std::string position = line.substr(cut);
        if (systems.empty() || position != previous)
            systems.emplace_back();
        systems.back().push_back(name);
        previous = position;
    }
    return systems;
}

} // namespace

TEST_F(GroupingImport, OneVeryNearStarChangesNoOtherSystem)
{
    const std::vector<ImportStar> stars = SkyLikeCatalogue(5, 3000);
    auto rows = [&](bool withNearest) {
        std::string csv = "name,ra,dec,parallax,mag,spect\n";
        char row[160];
        for (size_t i = 0; i < stars.size(); i++) {
            if (withNearest && i == stars.size() / 2)
                csv += "Nearest,123.4,-12.5,9999999,-5.0,M9V\n";
            double ra = std::fmod(stars[i].ra * 180 / kPi + 360, 360);
            if (ra >= 359.999999)
                ra = 0;
            std::snprintf(row, sizeof row, "S%zu,%.8f,%.8f,%.6f,%.2f,G2V\n", i, ra,
                stars[i].dec * 180 / kPi, stars[i].parallax, stars[i].absoluteMagnitude);
            csv += row;
        }
        return csv;
    };
    std::string output;
    ASSERT_EQ(
        Run("--format=csv " + Write("without.csv", rows(false)) + " -o " + PathOf("without.dat"),
            &output),
        0)
        << output;
    ASSERT_EQ(
        Run("--format=csv " + Write("with.csv", rows(true)) + " -o " + PathOf("with.dat"), &output),
        0)
        << output;

    const auto expected = SystemsOf(Read(PathOf("without.dat")));
    auto systems = SystemsOf(Read(PathOf("with.dat")));
    const auto nearest = std::find_if(systems.begin(), systems.end(), [](const auto& system) {
        return std::find(system.begin(), system.end(), "Nearest") != system.end();
    });
    ASSERT_NE(nearest, systems.end());
    EXPECT_EQ(*nearest, (std::vector<std::string> { "Nearest" }));
    systems.erase(nearest);
    EXPECT_EQ(systems, expected);
    // The Sun, every star, and a good number of pairs among them.
    ASSERT_GT(expected.size(), 2500u);
    EXPECT_LT(expected.size(), 2900u);
}
