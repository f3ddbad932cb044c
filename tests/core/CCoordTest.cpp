#include "core/CCoord.h"
#include "core/Constants.h"

#include <gtest/gtest.h>

#include <cmath>

TEST(CCoord, DirectionAlongMinusXIsRightAscensionZero)
{
    const CCoord c(SVector(-1, 0, 0));
    EXPECT_EQ(c.raHours, 0);
    EXPECT_NEAR(c.raMinutes, 0, 1e-9);
    EXPECT_EQ(c.decDegrees, 0);
    EXPECT_NEAR(c.decMinutes, 0, 1e-9);
}

TEST(CCoord, RightAscensionIsStoredUncorrectedButShownInZeroToTwentyFour)
{
    const CCoord c(SVector(0, 0, 1));
    EXPECT_DOUBLE_EQ(c.ra, -kPI / 2);
    EXPECT_EQ(c.raHours, 18);
    EXPECT_NEAR(c.raMinutes, 0, 1e-9);

    const CCoord opposite(SVector(0, 0, -1));
    EXPECT_EQ(opposite.raHours, 6);
    EXPECT_NEAR(opposite.raMinutes, 0, 1e-9);
}

TEST(CCoord, JustSouthOfTheEquatorKeepsMinusZeroDegrees)
{
    const double half = 0.5 * kPI / 180;
    const CCoord c(SVector(std::cos(half), std::sin(half), 0));
    EXPECT_EQ(c.decDegrees, 0);
    EXPECT_TRUE(std::signbit(c.decDegrees));
    EXPECT_NEAR(c.decMinutes, 30, 1e-9);
    EXPECT_NEAR(c.dec, -half, 1e-15);
}

TEST(CCoord, MinutesAreNeverNegative)
{
    const CCoord south(-0.1, -(12.5 / 60) * kPI / 180); // 12.5 arc-minutes south of 0
    EXPECT_TRUE(std::signbit(south.decDegrees));
    EXPECT_NEAR(south.decMinutes, 12.5, 1e-9);
    const CCoord deep(1.0, -(40 + 15.0 / 60) * kPI / 180);
    EXPECT_EQ(deep.decDegrees, -40);
    EXPECT_NEAR(deep.decMinutes, 15, 1e-9);
}

TEST(CCoord, SetFromRadiansCorrectsOnlyNegativeRightAscension)
{
    const CCoord c(-kPI / 12, 0.0); // -1 h is 23 h
    EXPECT_DOUBLE_EQ(c.ra, -kPI / 12);
    EXPECT_EQ(c.raHours, 23);
    EXPECT_NEAR(c.raMinutes, 0, 1e-9);
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
