#include "tools/importer/SystemGrouping.h"

#include <gtest/gtest.h>

#include <cmath>

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
