#include "core/SMatrix.h"
#include "core/Constants.h"

#include <gtest/gtest.h>

namespace {

constexpr double kTolerance = 1e-12;

SVector Apply(const SMatrix& m, SVector v)
{
    m.Transform(&v);
    return v;
}

void ExpectNear(const SVector& v, double x, double y, double z)
{
    EXPECT_NEAR(v.x, x, kTolerance);
    EXPECT_NEAR(v.y, y, kTolerance);
    EXPECT_NEAR(v.z, z, kTolerance);
}

} // namespace

TEST(SMatrix, QuarterTurnsAreRightHanded)
{
    SMatrix m;
    m.InitZRotation(kPI / 2);
    ExpectNear(Apply(m, SVector(1, 0, 0)), 0, 1, 0);
    m.InitXRotation(kPI / 2);
    ExpectNear(Apply(m, SVector(0, 1, 0)), 0, 0, 1);
    m.InitYRotation(kPI / 2);
    ExpectNear(Apply(m, SVector(0, 0, 1)), 1, 0, 0);
}

TEST(SMatrix, CompositionAppliesTheLeftOperandFirst)
{
    SMatrix a, b;
    a.InitTranslation(1, 0, 0);
    b.InitZRotation(kPI / 2);
    ExpectNear(Apply(a * b, SVector(0, 0, 0)), 0, 1, 0); // move, then turn
    ExpectNear(Apply(b * a, SVector(0, 0, 0)), 1, 0, 0); // turn, then move
}

TEST(SMatrix, CompoundAssignmentMatchesTheProductAndAllowsSelf)
{
    SMatrix a, b;
    a.InitScale(2, 3, 4);
    b.InitTranslation(1, 2, 3);
    SMatrix c = a;
    c *= b;
    ExpectNear(Apply(c, SVector(1, 1, 1)), 3, 5, 7);

    SMatrix d;
    d.InitTranslation(1, 2, 3);
    d *= d; // translation twice
    ExpectNear(Apply(d, SVector(0, 0, 0)), 2, 4, 6);

    SMatrix r;
    r.InitZRotation(kPI / 2);
    r *= r; // half a turn
    ExpectNear(Apply(r, SVector(1, 0, 0)), -1, 0, 0);
}

TEST(SMatrix, InitialisersWriteEveryElement)
{
    SMatrix m;
    for (auto& row : m.m) {
        for (double& e : row)
            e = 99;
    }
    m.InitIdentity();
    for (int r = 0; r < 3; r++) {
        for (int c = 0; c < 4; c++)
            EXPECT_EQ(m.m[r][c], r == c ? 1.0 : 0.0) << r << "," << c;
    }
    m.InitScale(2, 3, 4);
    ExpectNear(Apply(m, SVector(1, 1, 1)), 2, 3, 4);
    m.InitTranslation(-1, -2, -3);
    ExpectNear(Apply(m, SVector(1, 1, 1)), 0, -1, -2);
}

TEST(SMatrix, TransformReadsAllInputsFirst)
{
    SMatrix m;
    m.InitZRotation(kPI / 2);
    // A transform that wrote x before reading it for y would give (−1, −1, 0) here.
    ExpectNear(Apply(m, SVector(1, 1, 0)), -1, 1, 0);
}
