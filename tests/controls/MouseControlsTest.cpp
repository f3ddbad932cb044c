// The control window's five mouse controls, built from their table.
#include "controls/MouseControls.h"
#include "controls/SliderControl.h"
#include "controls/TrackballControl.h"
#include "core/MessageCodes.h"
#include "resources/ResourceData.h"

#include <cstring>
#include <gtest/gtest.h>
#include <memory>
#include <string>

namespace {

class Table : public ::testing::Test {
protected:
    static void SetUpTestSuite() { InitResources(); }
};

bool ShowsResource(const MouseControl& control, int32_t id)
{
    RBitmap8 expected(BRect(0, 0, 31, 31), 32);
    expected.LoadFromResource(int32_t(kMouseControlType), id, 0, 1024);
    return std::memcmp(control.NormalImage()->Bits(), expected.Bits(), 1024) == 0;
}

} // namespace

TEST_F(Table, TheFiveControlsInTheirOrder)
{
    ASSERT_EQ(kMouseControls.size(), 5u);
    const char* names[]
        = { "Track Ball", "Camera Z", "Stellar Brightness", "Stellar Contrast", "Clipping Sphere" };
    const int32_t resources[] = { 1, 2, 3, 5, 4 };
    const Qt::CursorShape cursors[] = { Qt::SizeAllCursor, Qt::SizeVerCursor, Qt::SizeHorCursor,
        Qt::SizeHorCursor, Qt::SizeHorCursor };
    const char* help[] = { "Virtual Trackball: Rotate nightdome  [arrows]",
        "Camera Distance: Zoom in and out  [+ -, wheel]",
        "Stellar Brightness: Change absoulue luminosity",
        "Stellar Contrast: Change relative luminosity",
        "Clipping Sphere: Hide stars beyond radius R" };
    for (size_t i = 0; i < 5; i++) {
        EXPECT_STREQ(kMouseControls[i].name, names[i]);
        EXPECT_EQ(kMouseControls[i].resourceID, resources[i]);
        EXPECT_EQ(kMouseControls[i].cursor, cursors[i]);
        EXPECT_STREQ(kMouseControls[i].help, help[i]);
        EXPECT_EQ(kMouseControls[i].kind,
            i < 2 ? MouseControlClass::Trackball : MouseControlClass::Slider);
    }
    EXPECT_STREQ(kMouseControls[kTrackBallControl].name, "Track Ball");
    EXPECT_STREQ(kMouseControls[kCameraZControl].name, "Camera Z");
    EXPECT_STREQ(kMouseControls[kStellarBrightnessControl].name, "Stellar Brightness");
    EXPECT_STREQ(kMouseControls[kStellarContrastControl].name, "Stellar Contrast");
    EXPECT_STREQ(kMouseControls[kClippingSphereControl].name, "Clipping Sphere");
}

TEST_F(Table, BuiltTrackballsCarryTheirSettingsAndNoLinks)
{
    const double settings[2][4] = { { 0.02, 0.02, 0.25, 0.25 }, { 0.0, -0.3, 0.0, 0.25 } };
    for (int32_t i : { kTrackBallControl, kCameraZControl }) {
        std::unique_ptr<MouseControl> control(MakeMouseControl(
            kMouseControls[size_t(i)], BRect(float(32 * i), 0, float(32 * i + 31), 31), nullptr));
        auto* trackball = dynamic_cast<TrackballControl*>(control.get());
        ASSERT_NE(trackball, nullptr) << i;
        EXPECT_EQ(trackball->ScaleX(), settings[i][0]);
        EXPECT_EQ(trackball->ScaleY(), settings[i][1]);
        EXPECT_EQ(trackball->EaseX(), settings[i][2]);
        EXPECT_EQ(trackball->EaseY(), settings[i][3]);
        EXPECT_EQ(trackball->LinkX(), nullptr);
        EXPECT_EQ(trackball->LinkY(), nullptr);
        EXPECT_EQ(trackball->OwnCursor(), kMouseControls[size_t(i)].cursor);
        EXPECT_STREQ(trackball->IGetInfo(), kMouseControls[size_t(i)].help);
        EXPECT_EQ(trackball->objectName().toStdString(), kMouseControls[size_t(i)].name);
        EXPECT_EQ(trackball->geometry(), QRect(32 * i, 0, 32, 32));
        EXPECT_TRUE(ShowsResource(*trackball, kMouseControls[size_t(i)].resourceID));
    }
}

TEST_F(Table, BuiltSlidersCarryTheirSettingsAndNoLink)
{
    const double settings[3][3]
        = { { 1.03, 0.1, 5e12 }, { 1.02, 0.1, 8.0 }, { 1.02, 0.5, 10000.0 } };
    const int32_t pictures[3] = { 3, 5, 4 };
    for (int32_t i :
        { kStellarBrightnessControl, kStellarContrastControl, kClippingSphereControl }) {
        std::unique_ptr<MouseControl> control(MakeMouseControl(
            kMouseControls[size_t(i)], BRect(float(32 * i), 0, float(32 * i + 31), 31), nullptr));
        auto* slider = dynamic_cast<SliderControl*>(control.get());
        ASSERT_NE(slider, nullptr) << i;
        EXPECT_EQ(slider->Base(), settings[i - 2][0]);
        EXPECT_EQ(slider->Minimum(), settings[i - 2][1]);
        EXPECT_EQ(slider->Maximum(), settings[i - 2][2]);
        EXPECT_EQ(slider->Link(), nullptr);
        EXPECT_EQ(slider->OwnCursor(), Qt::SizeHorCursor);
        EXPECT_STREQ(slider->IGetInfo(), kMouseControls[size_t(i)].help);
        EXPECT_EQ(slider->objectName().toStdString(), kMouseControls[size_t(i)].name);
        EXPECT_TRUE(ShowsResource(*slider, pictures[i - 2]));
    }
}

TEST_F(Table, ControlsBuiltIntoAWindowBelongToIt)
{
    QWidget window;
    for (size_t i = 0; i < kMouseControls.size(); i++) {
        const float left = kMouseControlSpacing * float(i);
        MakeMouseControl(kMouseControls[i], BRect(left, 0, left + 31, 31), &window);
    }
    const auto controls = window.findChildren<MouseControl*>(Qt::FindDirectChildrenOnly);
    ASSERT_EQ(controls.size(), 5);
    for (size_t i = 0; i < kMouseControls.size(); i++) {
        auto* control = window.findChild<MouseControl*>(kMouseControls[i].name);
        ASSERT_NE(control, nullptr) << kMouseControls[i].name;
        EXPECT_EQ(control->parentWidget(), &window);
        EXPECT_EQ(control->x(), int(32 * i));
    }
}
