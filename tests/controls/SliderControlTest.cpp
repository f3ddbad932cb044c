// The slider's arithmetic: base^dx times the value, held within the range.
#include "controls/SliderControl.h"
#include "resources/ResourceData.h"

#include <atomic>
#include <cmath>
#include <gtest/gtest.h>

namespace {

class Slider : public ::testing::Test {
protected:
    static void SetUpTestSuite() { InitResources(); }

    SliderControl slider { BRect(0, 0, 31, 31), "Stellar Contrast", 5, Qt::SizeHorCursor };
};

} // namespace

TEST_F(Slider, EachPixelLeftMultipliesByTheBaseAndEachPixelRightDivides)
{
    slider.InitSlider(1.02, 0.1, 8.0);
    std::atomic<double> value { 1.0 };
    slider.LinkSlider(&value);
    slider.Calculate(10, 0);
    EXPECT_EQ(value.load(), std::pow(1.02, 10.0));
    EXPECT_NEAR(value.load(), 1.2189944199947573, 1e-15);
    slider.Calculate(-3, 0);
    EXPECT_EQ(value.load(), std::pow(1.02, -3.0) * std::pow(1.02, 10.0));
    EXPECT_NEAR(value.load(), 1.1486856676492803, 1e-15);
}

TEST_F(Slider, OnlyTheHorizontalDragCounts)
{
    slider.InitSlider(1.02, 0.1, 8.0);
    std::atomic<double> value { 2.0 };
    slider.LinkSlider(&value);
    slider.Calculate(0, 40);
    EXPECT_EQ(value.load(), 2.0);
    slider.Calculate(1, -40);
    EXPECT_EQ(value.load(), 2.04);
}

TEST_F(Slider, AtItsMaximumDraggedFurtherLeftItStaysAtTheMaximum)
{
    slider.InitSlider(1.02, 0.1, 8.0);
    std::atomic<double> value { 8.0 };
    slider.LinkSlider(&value);
    slider.Calculate(1, 0);
    EXPECT_EQ(value.load(), 8.0);
    slider.Calculate(250, 0);
    EXPECT_EQ(value.load(), 8.0);
}

TEST_F(Slider, AValueAboveTheMaximumIsBroughtDownByAnyDrag)
{
    slider.InitSlider(1.02, 0.5, 10000.0);
    std::atomic<double> value { 20000.0 };
    slider.LinkSlider(&value);
    slider.Calculate(-1, 0);
    EXPECT_EQ(value.load(), 10000.0);
}

TEST_F(Slider, AValueBelowTheMinimumWhenLinkedIsRaisedToItByTheFirstNonZeroDrag)
{
    slider.InitSlider(1.02, 0.1, 8.0);
    std::atomic<double> value { 0.01 };
    slider.LinkSlider(&value);
    slider.Calculate(0, 0);
    EXPECT_EQ(value.load(), 0.01);
    slider.Calculate(0, 12);
    EXPECT_EQ(value.load(), 0.01);
    slider.Calculate(1, 0);
    EXPECT_EQ(value.load(), 0.1);
}

TEST_F(Slider, DraggedFarRightItStopsAtTheMinimum)
{
    slider.InitSlider(1.03, 0.1, 5e12);
    std::atomic<double> value { 1.0 };
    slider.LinkSlider(&value);
    slider.Calculate(-100, 0); // 1.03^-100 is about 0.052
    EXPECT_EQ(value.load(), 0.1);
    slider.Calculate(-1, 0);
    EXPECT_EQ(value.load(), 0.1);
}

TEST_F(Slider, WithANullLinkDragsAreIgnored)
{
    slider.InitSlider(1.02, 0.1, 8.0);
    EXPECT_EQ(slider.Link(), nullptr);
    slider.Calculate(10, 10); // nothing to write through: must not crash
    std::atomic<double> value { 1.0 };
    slider.LinkSlider(&value);
    slider.LinkSlider(nullptr);
    slider.Calculate(10, 0);
    slider.Calculate(-10, 0);
    EXPECT_EQ(value.load(), 1.0);
}

TEST_F(Slider, InitClearsTheLink)
{
    std::atomic<double> value { 1.0 };
    slider.LinkSlider(&value);
    EXPECT_EQ(slider.Link(), &value);
    slider.InitSlider(1.02, 0.5, 10000.0);
    EXPECT_EQ(slider.Link(), nullptr);
    EXPECT_EQ(slider.Base(), 1.02);
    EXPECT_EQ(slider.Minimum(), 0.5);
    EXPECT_EQ(slider.Maximum(), 10000.0);
    slider.Calculate(10, 0);
    EXPECT_EQ(value.load(), 1.0);
}

TEST_F(Slider, ADragOfZeroPixelsChangesNothing)
{
    slider.InitSlider(1.02, 0.1, 8.0);
    std::atomic<double> value { 2.5 };
    slider.LinkSlider(&value);
    slider.Calculate(0, 0);
    EXPECT_EQ(value.load(), 2.5);
}

TEST_F(Slider, ABaseOfZeroDoesNothing)
{
    slider.InitSlider(0.0, 0.1, 8.0);
    std::atomic<double> value { 20.0 }; // above the maximum, and left there
    slider.LinkSlider(&value);
    slider.Calculate(5, 0);
    EXPECT_EQ(value.load(), 20.0);
}
