// The trackball's easing: each sample moves a value a fixed fraction of the way toward the
// sample's drag distance times the scale.
#include "controls/TrackballControl.h"
#include "resources/ResourceData.h"

#include <atomic>
#include <cmath>
#include <gtest/gtest.h>

namespace {

class Trackball : public ::testing::Test {
protected:
    static void SetUpTestSuite() { InitResources(); }

    TrackballControl trackball { BRect(0, 0, 31, 31), "Track Ball", 1, Qt::SizeAllCursor };
    std::atomic<double> x { 0.0 };
    std::atomic<double> y { 0.0 };
};

} // namespace

TEST_F(Trackball, OneSampleOfTenPixelsFromZeroMovesAQuarterOfTheWay)
{
    trackball.InitTrackball(0.02, 0.02, 0.25, 0.25);
    trackball.LinkTrackball(&x, &y);
    trackball.Calculate(10, 0);
    EXPECT_DOUBLE_EQ(x.load(), 0.05);
    EXPECT_EQ(y.load(), 0.0);
}

TEST_F(Trackball, BothAxesMoveTowardTheirOwnTargets)
{
    trackball.InitTrackball(0.02, 0.5, 0.25, 0.5);
    trackball.LinkTrackball(&x, &y);
    x = 1.0;
    y = 1.0;
    trackball.Calculate(-20, 6); // targets -0.4 and 3
    EXPECT_DOUBLE_EQ(x.load(), 1.0 + 0.25 * (-0.4 - 1.0));
    EXPECT_DOUBLE_EQ(x.load(), 0.65);
    EXPECT_EQ(y.load(), 2.0);
}

TEST_F(Trackball, ADragOfZeroPixelsMovesTheValuesTowardZeroByTheEaseFraction)
{
    trackball.InitTrackball(0.02, 0.02, 0.25, 0.5);
    trackball.LinkTrackball(&x, &y);
    x = 1.0;
    y = -2.0;
    trackball.Calculate(0, 0);
    EXPECT_EQ(x.load(), 0.75);
    EXPECT_EQ(y.load(), -1.0);
    trackball.Calculate(0, 0);
    EXPECT_EQ(x.load(), 0.5625);
    EXPECT_EQ(y.load(), -0.5);
}

TEST_F(Trackball, ASteadyDragApproachesTheDragSpeedTimesTheScale)
{
    trackball.InitTrackball(0.02, 0.02, 0.25, 0.25);
    trackball.LinkTrackball(&x, &y);
    for (int i = 0; i < 3; i++)
        trackball.Calculate(0, -8); // target -0.16 each time
    // After n samples from 0: target * (1 - 0.75^n).
    EXPECT_EQ(x.load(), 0.0);
    EXPECT_DOUBLE_EQ(y.load(), -0.16 * (1 - 0.421875));
    EXPECT_DOUBLE_EQ(y.load(), -0.0925);
}

TEST_F(Trackball, TheCameraControlMovesOnlyItsVerticalValueAndTheOtherWayRound)
{
    trackball.InitTrackball(0.0, -0.3, 0.0, 0.25);
    trackball.LinkTrackball(&x, &y);
    x = 3.0;
    trackball.Calculate(10, -10); // dragged right and down
    EXPECT_EQ(x.load(), 3.0);
    EXPECT_DOUBLE_EQ(y.load(), 0.75);
    trackball.Calculate(-40, 10); // left and up
    EXPECT_EQ(x.load(), 3.0);
    EXPECT_DOUBLE_EQ(y.load(), 0.75 + 0.25 * (-3.0 - 0.75));
}

TEST_F(Trackball, AnAxisWithANullLinkIsLeftAlone)
{
    trackball.InitTrackball(0.02, 0.02, 0.25, 0.25);
    trackball.Calculate(10, 10); // nothing linked: must not crash
    trackball.LinkTrackball(nullptr, &y);
    x = 1.0;
    trackball.Calculate(10, 10);
    EXPECT_EQ(x.load(), 1.0);
    EXPECT_DOUBLE_EQ(y.load(), 0.05);
    trackball.LinkTrackball(&x, nullptr);
    trackball.Calculate(0, 10);
    EXPECT_EQ(x.load(), 0.75);
    EXPECT_DOUBLE_EQ(y.load(), 0.05);
}

TEST_F(Trackball, InitClearsBothLinks)
{
    trackball.LinkTrackball(&x, &y);
    EXPECT_EQ(trackball.LinkX(), &x);
    EXPECT_EQ(trackball.LinkY(), &y);
    trackball.InitTrackball(0.0, -0.3, 0.0, 0.25);
    EXPECT_EQ(trackball.LinkX(), nullptr);
    EXPECT_EQ(trackball.LinkY(), nullptr);
    EXPECT_EQ(trackball.ScaleX(), 0.0);
    EXPECT_EQ(trackball.ScaleY(), -0.3);
    EXPECT_EQ(trackball.EaseX(), 0.0);
    EXPECT_EQ(trackball.EaseY(), 0.25);
    x = 1.0;
    trackball.Calculate(0, 10);
    EXPECT_EQ(x.load(), 1.0);
    EXPECT_EQ(y.load(), 0.0);
}
