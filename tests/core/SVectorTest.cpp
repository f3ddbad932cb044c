#include "core/SVector.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>

TEST(SVector, ConstructorSetsComponentsInOrder)
{
    const SVector v(1.5, -2.5, 3.25);
    EXPECT_EQ(v.x, 1.5);
    EXPECT_EQ(v.y, -2.5);
    EXPECT_EQ(v.z, 3.25);
}

TEST(SVector, MagnitudeNormalizeAndScale)
{
    SVector v(3, 4, 12);
    EXPECT_EQ(v.Magnitude(), 13.0);
    v.Normalize();
    EXPECT_DOUBLE_EQ(v.x, 3.0 / 13);
    EXPECT_DOUBLE_EQ(v.y, 4.0 / 13);
    EXPECT_DOUBLE_EQ(v.z, 12.0 / 13);
    v.Scale(-13);
    EXPECT_DOUBLE_EQ(v.x, -3);
    EXPECT_DOUBLE_EQ(v.y, -4);
    EXPECT_DOUBLE_EQ(v.z, -12);
}

TEST(SVector, DotAndRightHandedCrossProduct)
{
    const SVector x(1, 0, 0), y(0, 1, 0);
    SVector result;
    x.CrossProduct(&y, &result);
    EXPECT_EQ(result.x, 0);
    EXPECT_EQ(result.y, 0);
    EXPECT_EQ(result.z, 1);

    const SVector a(2, 3, 4), b(5, 6, 7);
    EXPECT_EQ(a.DotProduct(&b), 2 * 5 + 3 * 6 + 4 * 7);
    a.CrossProduct(&b, &result);
    EXPECT_EQ(result.x, 3 * 7 - 4 * 6);
    EXPECT_EQ(result.y, 4 * 5 - 2 * 7);
    EXPECT_EQ(result.z, 2 * 6 - 3 * 5);
}

TEST(SVector, CrossProductIntoAnOperand)
{
    SVector a(2, 3, 4);
    const SVector b(5, 6, 7);
    a.CrossProduct(&b, &a);
    EXPECT_EQ(a.x, -3);
    EXPECT_EQ(a.y, 6);
    EXPECT_EQ(a.z, -3);
}

TEST(SVector, ProjectionDividesByDistanceAndTurnsY)
{
    const SVector v(3, 4, 0);
    EXPECT_EQ(v.PProjectX(100, 50), 110); // 3 * 100 / 5 + 50
    EXPECT_EQ(v.PProjectY(100, 50), -30); // 50 - 4 * 100 / 5
}

TEST(SVector, ProjectionTruncatesTowardZero)
{
    // Along x alone the distance is |x|, so the result is scale * sign + offset.
    const SVector right(1, 0, 0), left(-1, 0, 0);
    EXPECT_EQ(right.PProjectX(1, 9.9), 10); // 10.9
    EXPECT_EQ(left.PProjectX(1, -9.9), -10); // -10.9
    const SVector down(0, -1, 0), up(0, 1, 0);
    EXPECT_EQ(down.PProjectY(1, 9.9), 10);
    EXPECT_EQ(up.PProjectY(1, -9.9), -10);
}

TEST(SVector, ProjectionOfThePointAtTheEyeIsDefined)
{
    const SVector eye(0, 0, 0);
    EXPECT_EQ(eye.PProjectX(100, 50), std::numeric_limits<int32_t>::min());
    EXPECT_EQ(eye.PProjectY(100, 50), std::numeric_limits<int32_t>::min());
}
