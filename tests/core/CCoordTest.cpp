#include "core/CCoord.h"
#include "core/Constants.h"

#include <gtest/gtest.h>

#include <cmath>

namespace {

// EXPECT_EQ(x, 0) passes for -0 too, so wherever a zero comes out the sign is checked as well.
::testing::AssertionResult IsZero(double value, bool negative)
{
    if (value == 0 && std::signbit(value) == negative)
        return ::testing::AssertionSuccess();
    return ::testing::AssertionFailure() << "is " << value << (std::signbit(value) ? " (-)" : "")
                                         << ", expected " << (negative ? "-0" : "+0");
}

} // namespace

TEST(CCoord, DirectionAlongMinusXIsRightAscensionZero)
{
    // Both arctangents see a -0 sine side (minus the vector's zero z and y) and return -0, and
    // the split keeps it: every field is -0. Showing them without the sign is the display's
    // business (ShownCoord).
    const CCoord c(SVector(-1, 0, 0));
    EXPECT_TRUE(IsZero(c.ra, true));
    EXPECT_TRUE(IsZero(c.dec, true));
    EXPECT_TRUE(IsZero(c.raHours, true));
    EXPECT_TRUE(IsZero(c.raMinutes, true));
    EXPECT_TRUE(IsZero(c.decDegrees, true));
    EXPECT_TRUE(IsZero(c.decMinutes, true));
}

TEST(CCoord, NegativeZeroRightAscensionGainsNoTurn)
{
    // Only a right ascension strictly below 0 gains a full turn: -0 stays 0 hours, not 24.
    const CCoord c(-0.0, 0.0);
    EXPECT_TRUE(IsZero(c.raHours, true));
    EXPECT_TRUE(IsZero(c.raMinutes, true));
    EXPECT_TRUE(IsZero(c.decDegrees, false));
    EXPECT_TRUE(IsZero(c.decMinutes, false));
}

TEST(CCoord, RightAscensionIsStoredUncorrectedButShownInZeroToTwentyFour)
{
    const CCoord c(SVector(0, 0, 1));
    EXPECT_EQ(c.ra, -kPI / 2);
    EXPECT_EQ(c.raHours, 18);
    EXPECT_TRUE(IsZero(c.raMinutes, false));

    const CCoord opposite(SVector(0, 0, -1));
    EXPECT_EQ(opposite.ra, kPI / 2);
    EXPECT_EQ(opposite.raHours, 6);
    EXPECT_TRUE(IsZero(opposite.raMinutes, false));
}

TEST(CCoord, OnTheEquatorTheDegreesAreMinusZeroAndJustNorthPlusZero)
{
    // y = 0: the declination is atan2(-0, 1) = -0, and so are its degrees and minutes.
    const CCoord equator(SVector(0, 0, 1));
    EXPECT_TRUE(IsZero(equator.dec, true));
    EXPECT_TRUE(IsZero(equator.decDegrees, true));
    EXPECT_TRUE(IsZero(equator.decMinutes, true));

    const double half = 0.5 * kPI / 180;
    const CCoord north(SVector(std::cos(half), -std::sin(half), 0));
    EXPECT_NEAR(north.dec, half, 1e-15);
    EXPECT_TRUE(IsZero(north.decDegrees, false));
    EXPECT_NEAR(north.decMinutes, 30, 1e-9);
}

TEST(CCoord, JustSouthOfTheEquatorKeepsMinusZeroDegrees)
{
    const double half = 0.5 * kPI / 180;
    const CCoord c(SVector(std::cos(half), std::sin(half), 0));
    EXPECT_TRUE(IsZero(c.decDegrees, true));
    EXPECT_NEAR(c.decMinutes, 30, 1e-9);
    EXPECT_NEAR(c.dec, -half, 1e-15);
}

TEST(CCoord, MinutesAreNeverNegative)
{
    const CCoord south(-0.1, -(12.5 / 60) * kPI / 180); // 12.5 arc-minutes south of 0
    EXPECT_TRUE(IsZero(south.decDegrees, true));
    EXPECT_NEAR(south.decMinutes, 12.5, 1e-9);
    const CCoord deep(1.0, -(40 + 15.0 / 60) * kPI / 180);
    EXPECT_EQ(deep.decDegrees, -40);
    EXPECT_NEAR(deep.decMinutes, 15, 1e-9);
}

TEST(CCoord, SetFromRadiansCorrectsOnlyNegativeRightAscension)
{
    const CCoord c(-kPI / 12, 0.0); // -1 h is 23 h
    EXPECT_EQ(c.ra, -kPI / 12);
    EXPECT_EQ(c.raHours, 23);
    EXPECT_GE(c.raMinutes, 0); // a rounding's worth above 0, not 59.99 of hour 22
    EXPECT_NEAR(c.raMinutes, 0, 1e-9);
    // A declination of +0 keeps its plus: +0 degrees, +0 minutes.
    EXPECT_TRUE(IsZero(c.decDegrees, false));
    EXPECT_TRUE(IsZero(c.decMinutes, false));
    const CCoord d(kPI / 12 * 6.5, 0.0);
    EXPECT_EQ(d.raHours, 6);
    EXPECT_NEAR(d.raMinutes, 30, 1e-9);
}

TEST(CCoord, TheCallersVectorIsNotNormalised)
{
    const SVector v(0, 3, 4);
    const CCoord c(v);
    EXPECT_EQ(v.x, 0);
    EXPECT_EQ(v.y, 3);
    EXPECT_EQ(v.z, 4);
    EXPECT_NEAR(c.dec, -std::asin(0.6), 1e-15);
}

TEST(CCoord, DisplayConstructorStoresTheFourValues)
{
    const CCoord c(-16, 43.5, 6, 45.2);
    EXPECT_EQ(c.decDegrees, -16);
    EXPECT_EQ(c.decMinutes, 43.5);
    EXPECT_EQ(c.raHours, 6);
    EXPECT_EQ(c.raMinutes, 45.2);
}

TEST(CCoord, GetVectorInvertsSet)
{
    const SVector v(-2, 1, 3);
    const CCoord c(v);
    const SVector back = c.GetVector(v.Magnitude());
    EXPECT_NEAR(back.x, v.x, 1e-12);
    EXPECT_NEAR(back.y, v.y, 1e-12);
    EXPECT_NEAR(back.z, v.z, 1e-12);
}
