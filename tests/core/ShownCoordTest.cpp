// The display fields as printed: no minus sign on anything that prints as zero, and the
// declination's sign kept wherever the shown angle is not zero.
#include "core/ShownCoord.h"
#include "core/Constants.h"

#include <gtest/gtest.h>

#include <cmath>
#include <cstdio>
#include <limits>
#include <string>

namespace {

// The program's own formats for a direction.
std::string Printed(const ShownCoord& s)
{
    char text[128];
    std::snprintf(text, sizeof text, "RA: %.0fh %.1fm\nDEC: %+.0fd %.1f'\n", s.raHours, s.raMinutes,
        s.decDegrees, s.decMinutes);
    return text;
}

double Radians(double degrees)
{
    return degrees * kPI / 180;
}

} // namespace

TEST(ShownCoord, ADirectionOnTheAxesPrintsWithoutMinusSigns)
{
    // Along -x the arctangents give -0 for both angles, and every display field is -0.
    const CCoord c(SVector(-1, 0, 0));
    ASSERT_TRUE(std::signbit(c.raHours));
    ASSERT_TRUE(std::signbit(c.raMinutes));
    ASSERT_TRUE(std::signbit(c.decDegrees));
    ASSERT_TRUE(std::signbit(c.decMinutes));
    const ShownCoord s(c);
    EXPECT_FALSE(std::signbit(s.raHours));
    EXPECT_FALSE(std::signbit(s.raMinutes));
    EXPECT_FALSE(std::signbit(s.decDegrees));
    EXPECT_FALSE(std::signbit(s.decMinutes));
    EXPECT_EQ(Printed(s), "RA: 0h 0.0m\nDEC: +0d 0.0'\n");
}

TEST(ShownCoord, HalfADegreeSouthKeepsItsSignOnTheZeroDegrees)
{
    const CCoord south(0.0, Radians(-0.5));
    EXPECT_EQ(Printed(ShownCoord(south)), "RA: 0h 0.0m\nDEC: -0d 30.0'\n");
    const CCoord north(0.0, Radians(0.5));
    EXPECT_EQ(Printed(ShownCoord(north)), "RA: 0h 0.0m\nDEC: +0d 30.0'\n");
}

TEST(ShownCoord, ADeclinationThatRoundsToZeroLosesItsSign)
{
    // 0.03 arc-minutes south prints as 0.0 minutes: nothing is left to be south.
    const CCoord c(0.0, Radians(-0.03 / 60));
    EXPECT_TRUE(std::signbit(c.decDegrees));
    EXPECT_EQ(Printed(ShownCoord(c)), "RA: 0h 0.0m\nDEC: +0d 0.0'\n");
    // 0.06 arc-minutes south prints as 0.1: it stays south.
    const CCoord d(0.0, Radians(-0.06 / 60));
    EXPECT_EQ(Printed(ShownCoord(d)), "RA: 0h 0.0m\nDEC: -0d 0.1'\n");
}

TEST(ShownCoord, MinutesJustBelowZeroPrintAsZeroButRealOnesKeepTheirSign)
{
    // The display constructor takes any values, as a typed-in query does.
    const ShownCoord nearZero(CCoord(-0.0, -0.04, -0.0, -0.04));
    EXPECT_EQ(nearZero.raMinutes, 0);
    EXPECT_FALSE(std::signbit(nearZero.raMinutes));
    EXPECT_FALSE(std::signbit(nearZero.decMinutes));
    EXPECT_EQ(Printed(nearZero), "RA: 0h 0.0m\nDEC: +0d 0.0'\n");

    const ShownCoord real(CCoord(-5, 10, 3, -0.06));
    EXPECT_EQ(Printed(real), "RA: 3h -0.1m\nDEC: -5d 10.0'\n");
}

TEST(ShownCoord, OtherValuesPassUnchanged)
{
    const CCoord c(-40, 15.5, 23, 59.5);
    const ShownCoord s(c);
    EXPECT_EQ(s.decDegrees, -40);
    EXPECT_EQ(s.decMinutes, 15.5);
    EXPECT_EQ(s.raHours, 23);
    EXPECT_EQ(s.raMinutes, 59.5);
    EXPECT_EQ(Printed(s), "RA: 23h 59.5m\nDEC: -40d 15.5'\n");
    // Undefined angles (a zero vector) stay visibly undefined rather than becoming zero.
    const double nan = std::numeric_limits<double>::quiet_NaN();
    const ShownCoord undefined(CCoord(nan, 0.0, nan, 0.0));
    EXPECT_TRUE(std::isnan(undefined.decDegrees));
    EXPECT_TRUE(std::isnan(undefined.raHours));
}
