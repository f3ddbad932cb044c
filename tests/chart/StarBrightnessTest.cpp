// The star pass's brightness from the float its coarse test reads draws exactly what the double
// brightness draws: a point of the same brightness or a glow of the same side, at every depth,
// right at the steps between one and the next, and for every brightness a float holds badly.
#include "chart/StarBrightness.h"

#include <gtest/gtest.h>

#include <cfloat>
#include <cmath>
#include <random>

namespace {

// What the pass draws for a system of brightness lum at depth squared zz, taking the double
// only when it must; exact counts the times it took it.
double PassBrightness(double lum, double zz, int* exact)
{
    return DrawBrightness(RoundedUpToFloat(lum), zz, [&] {
        ++*exact;
        return lum;
    });
}

// Whether the pass draws what lum / zz draws, and where it reads the double, that very value.
::testing::AssertionResult DrawsAsTheDouble(double lum, double zz, int* exact)
{
    const int before = *exact;
    const double rule = lum / zz;
    const double pass = PassBrightness(lum, zz, exact);
    if (DrawnAs(pass) != DrawnAs(rule))
        return ::testing::AssertionFailure() << "lum " << lum << " zz " << zz << " draws as "
                                             << DrawnAs(pass) << " not " << DrawnAs(rule);
    if (*exact > before && pass != rule)
        return ::testing::AssertionFailure() << "read the double but drew " << pass;
    return ::testing::AssertionSuccess();
}

} // namespace

TEST(StarBrightnessTest, WhatIsDrawnNeverFallsAsTheBrightnessGrows)
{
    int last = DrawnAs(0);
    EXPECT_EQ(last, 0);
    for (double b = 1e-3; b < 1e20; b *= 1.0001) {
        const int now = DrawnAs(b);
        ASSERT_GE(now, last) << b;
        last = now;
    }
    EXPECT_EQ(DrawnAs(15.999), 15);
    EXPECT_EQ(DrawnAs(16), 16 + 2);
    EXPECT_EQ(DrawnAs(1e19), 16 + 64);
}

TEST(StarBrightnessTest, TheFloatIsNeverBelowTheBrightnessNorFarAbove)
{
    std::mt19937_64 random(27);
    std::uniform_real_distribution<double> exponent(-60, 40);
    for (int n = 0; n < 200000; n++) {
        const double lum = std::pow(10.0, exponent(random));
        const float up = RoundedUpToFloat(lum);
        ASSERT_GE(double(up), lum);
        // Within a float's step above it, 2^-23 of it or less among normal floats.
        if (lum >= FLT_MIN && lum <= FLT_MAX) {
            ASSERT_LE(double(up), lum * (1 + 0x1p-23)) << lum;
        }
    }
    EXPECT_EQ(RoundedUpToFloat(0), 0.0f);
    EXPECT_EQ(RoundedUpToFloat(1e300), INFINITY);
    EXPECT_GT(RoundedUpToFloat(1e-50), 0.0f); // below the smallest float, not rounded to 0
}

TEST(StarBrightnessTest, RandomBrightnessesAndDepthsDrawAsTheDoubleAndRarelyReadIt)
{
    std::mt19937_64 random(4);
    std::uniform_real_distribution<double> lumExponent(-3, 12), depth(0.01, 3000);
    int exact = 0;
    constexpr int kSystems = 1000000;
    for (int n = 0; n < kSystems; n++) {
        const double z = depth(random);
        ASSERT_TRUE(DrawsAsTheDouble(std::pow(10.0, lumExponent(random)), z * z, &exact));
    }
    // Only brightnesses within a few millionths of a step need the double.
    EXPECT_LT(exact, kSystems / 1000);
}

TEST(StarBrightnessTest, BrightnessesAtEveryStepDrawAsTheDouble)
{
    // Every step of the points (1 to 16) and of the glows (each power of two), approached from
    // below and above by a few units in the last place, at depths squared that round.
    std::vector<double> steps;
    for (int k = 1; k <= 16; k++)
        steps.push_back(k);
    for (int k = 5; k < 64; k++)
        steps.push_back(std::ldexp(1.0, k));
    int exact = 0;
    for (const double zz : { 1.0, 0.7, 3.3, 1234.5678, 1e-6, 7.77e5 }) {
        for (const double step : steps) {
            double lum = step * zz;
            for (int k = 0; k < 40; k++)
                lum = std::nextafter(lum, 0.0);
            for (int k = 0; k < 80; k++) {
                ASSERT_TRUE(DrawsAsTheDouble(lum, zz, &exact));
                lum = std::nextafter(lum, INFINITY);
            }
            // A float's width about the step, both sides.
            for (const double nudge : { -2e-7, -1e-7, -3e-8, 3e-8, 1e-7, 2e-7 })
                ASSERT_TRUE(DrawsAsTheDouble(step * zz * (1 + nudge), zz, &exact));
        }
    }
    // Near the steps the double is read, and it is what decides there.
    EXPECT_GT(exact, 1000);
}

TEST(StarBrightnessTest, BrightnessesAFloatHoldsBadlyAreReadAsDoubles)
{
    int exact = 0;
    // Below the smallest normal float: the float's steps are coarse there.
    EXPECT_TRUE(DrawsAsTheDouble(1e-40, 1e-41, &exact));
    EXPECT_EQ(exact, 1);
    // Past the largest float.
    EXPECT_TRUE(DrawsAsTheDouble(1e300, 1.0, &exact));
    EXPECT_EQ(exact, 2);
    // A quotient that overflows.
    EXPECT_TRUE(DrawsAsTheDouble(1e30, 1e-300, &exact));
    EXPECT_EQ(exact, 3);
    // No brightness at all draws nothing, from the float alone.
    EXPECT_EQ(PassBrightness(0, 4.0, &exact), 0.0);
    EXPECT_EQ(exact, 3);
    // The marks of hidden and dark systems (drawn only when selected or under the mouse) always
    // take the double.
    for (const float mark : { -1.0f, -0.5f }) {
        const double b = DrawBrightness(mark, 2.0, [&] {
            exact++;
            return 6.0;
        });
        EXPECT_EQ(b, 3.0);
    }
    EXPECT_EQ(exact, 5);
}
