// The controls under the mouse: pictures, cursor and help text as the pointer comes and goes,
// and the drag loop sampling the real pointer every 50 ms while a button is held.
#include "widgets/WidgetEvents.h"

#include "controls/SliderControl.h"
#include "controls/TrackballControl.h"
#include "core/MessageCodes.h"
#include "platform/qt/BitmapImage.h"
#include "resources/ResourceData.h"

#include <QCursor>
#include <QEnterEvent>
#include <QTest>
#include <atomic>
#include <cmath>
#include <cstring>
#include <gtest/gtest.h>
#include <vector>

namespace {

constexpr int kWait = 3000; // ms; generous for the sanitizer builds

struct Delta {
    double dx;
    double dy;
    bool operator==(const Delta&) const = default;
};

// A trackball that also keeps every sample it is given.
class RecordingTrackball : public TrackballControl {
public:
    using TrackballControl::TrackballControl;
    void Calculate(double dx, double dy) override
    {
        samples.push_back({ dx, dy });
        TrackballControl::Calculate(dx, dy);
    }
    std::vector<Delta> samples;
};

// Index of the first sample from `from` on that is not zero, or -1.
int FirstMove(const std::vector<Delta>& samples, size_t from)
{
    for (size_t i = from; i < samples.size(); i++)
        if (samples[i].dx != 0 || samples[i].dy != 0)
            return int(i);
    return -1;
}

class Controls : public ::testing::Test {
protected:
    static void SetUpTestSuite() { InitResources(); }

    // A shown window for the drags, so that mapping the pointer to the control means something.
    void ShowWindow()
    {
        window.setGeometry(50, 50, 200, 200);
        window.show();
        ASSERT_TRUE(QTest::qWaitForWindowExposed(&window, kWait));
    }
    // Puts the pointer at where, in control's coordinates.
    static void PointAt(QWidget* control, QPoint where)
    {
        QCursor::setPos(control->mapToGlobal(where));
    }

    QWidget window;
};

} // namespace

TEST_F(Controls, ThePicturesAreThreeKilobytesOfTheResourceInOrder)
{
    MouseControl control(BRect(10, 20, 41, 51), "Stellar Contrast", 5, Qt::SizeHorCursor);
    EXPECT_EQ(control.objectName(), "Stellar Contrast");
    EXPECT_EQ(control.geometry(), QRect(10, 20, 32, 32));
    const RBitmap8* pictures[]
        = { control.NormalImage(), control.HoverImage(), control.PressedImage() };
    for (int i = 0; i < 3; i++) {
        RBitmap8 expected(BRect(0, 0, 31, 31), 32);
        ASSERT_TRUE(expected.LoadFromResource(int32_t(kMouseControlType), 5, i * 1024, 1024));
        EXPECT_EQ(pictures[i]->Width(), 32);
        EXPECT_EQ(pictures[i]->Height(), 32);
        EXPECT_TRUE(SamePixels(pictures[i], &expected)) << "picture " << i;
    }
    EXPECT_FALSE(SamePixels(control.NormalImage(), control.HoverImage()));
    EXPECT_FALSE(SamePixels(control.HoverImage(), control.PressedImage()));
    EXPECT_EQ(control.ShownImage(), control.NormalImage());
    EXPECT_EQ(control.CursorShape(), Qt::PointingHandCursor);
    EXPECT_EQ(control.OwnCursor(), Qt::SizeHorCursor);
    EXPECT_FALSE(control.Dragging());
}

TEST_F(Controls, TheShownPictureIsWhatIsPainted)
{
    MouseControl control(BRect(0, 0, 31, 31), "Track Ball", 1, Qt::SizeAllCursor);
    auto expectPainted = [&](const RBitmap8* picture) {
        const QImage painted = control.grab().toImage().convertToFormat(QImage::Format_RGB32);
        const QImage wanted
            = ImageOf(*const_cast<RBitmap8*>(picture)).convertToFormat(QImage::Format_ARGB32);
        int compared = 0;
        for (int y = 0; y < 32; y++)
            for (int x = 0; x < 32; x++)
                if (qAlpha(wanted.pixel(x, y)) == 255) {
                    ASSERT_EQ(painted.pixel(x, y), wanted.pixel(x, y)) << x << ", " << y;
                    compared++;
                }
        EXPECT_GT(compared, 512);
    };
    expectPainted(control.NormalImage());
    Enter(&control);
    expectPainted(control.HoverImage());
}

TEST_F(Controls, EnteringShowsTheHoverPictureTheOwnCursorAndTheHelpLeavingUndoesIt)
{
    RecordingHandler help;
    SliderControl control(BRect(0, 0, 31, 31), "Stellar Brightness", 3, Qt::SizeHorCursor);
    control.ISetTarget(&help);
    control.ISetInfo("Stellar Brightness: Change absoulue luminosity");

    Enter(&control);
    EXPECT_EQ(control.ShownImage(), control.HoverImage());
    EXPECT_EQ(control.CursorShape(), Qt::SizeHorCursor);
    DeliverPostedMessages();
    ASSERT_EQ(Codes(help), (std::vector<uint32_t> { kInfoMessage }));
    EXPECT_STREQ(help.received[0].FindString(kInfoStringField),
        "Stellar Brightness: Change absoulue luminosity");

    QTest::mouseMove(&control, QPoint(20, 20)); // inside: nothing new
    DeliverPostedMessages();
    EXPECT_EQ(Codes(help), (std::vector<uint32_t> { kInfoMessage }));
    EXPECT_EQ(control.ShownImage(), control.HoverImage());

    Leave(&control);
    EXPECT_EQ(control.ShownImage(), control.NormalImage());
    EXPECT_EQ(control.CursorShape(), Qt::PointingHandCursor);
    DeliverPostedMessages();
    EXPECT_EQ(Codes(help), (std::vector<uint32_t> { kInfoMessage, kClearInfoMessage }));
}

TEST_F(Controls, PressingShowsThePressedPictureAndTakesTheFirstSampleAtOnce)
{
    ShowWindow();
    TrackballControl control(BRect(10, 10, 41, 41), "Track Ball", 1, Qt::SizeAllCursor, &window);
    control.show();
    control.InitTrackball(0.02, 0.02, 0.25, 0.25);
    std::atomic<double> x { 1.0 };
    std::atomic<double> y { -1.0 };
    control.LinkTrackball(&x, &y);
    Enter(&control);
    PointAt(&control, QPoint(16, 16));
    QTest::mousePress(&control, Qt::LeftButton, {}, QPoint(16, 16));
    EXPECT_TRUE(control.Dragging());
    EXPECT_EQ(control.ShownImage(), control.PressedImage());
    // The pointer has not moved since the press: one zero sample eases both toward zero.
    EXPECT_EQ(x.load(), 0.75);
    EXPECT_EQ(y.load(), -0.75);
    QTest::mouseRelease(&control, Qt::LeftButton, {}, QPoint(16, 16));
    EXPECT_FALSE(control.Dragging());
    EXPECT_EQ(control.ShownImage(), control.HoverImage());
    EXPECT_EQ(control.CursorShape(), Qt::SizeAllCursor);
}

TEST_F(Controls, DragSamplesAreThePreviousPointMinusTheCurrentOne)
{
    ShowWindow();
    RecordingTrackball control(BRect(10, 10, 41, 41), "Track Ball", 1, Qt::SizeAllCursor, &window);
    control.show();
    PointAt(&control, QPoint(5, 5));
    QTest::mousePress(&control, Qt::LeftButton, {}, QPoint(5, 5));
    ASSERT_EQ(control.samples, (std::vector<Delta> { { 0, 0 } }));

    // Right and down: negative deltas.
    PointAt(&control, QPoint(12, 8));
    ASSERT_TRUE(QTest::qWaitFor([&] { return FirstMove(control.samples, 0) >= 0; }, kWait));
    const size_t first = size_t(FirstMove(control.samples, 0));
    EXPECT_EQ(control.samples[first], (Delta { -7, -3 }));

    // Held still: the samples go on, every one zero.
    ASSERT_TRUE(QTest::qWaitFor([&] { return control.samples.size() >= first + 3; }, kWait));
    EXPECT_EQ(FirstMove(control.samples, first + 1), -1);

    // Left and up, past the control's edge: positive deltas, measured all the same.
    PointAt(&control, QPoint(-20, 1));
    ASSERT_TRUE(QTest::qWaitFor([&] { return FirstMove(control.samples, first + 1) >= 0; }, kWait));
    const size_t second = size_t(FirstMove(control.samples, first + 1));
    EXPECT_EQ(control.samples[second], (Delta { 32, 7 }));
    EXPECT_EQ(control.ShownImage(), control.PressedImage());

    QTest::mouseRelease(&control, Qt::LeftButton, {}, QPoint(-20, 1));
    EXPECT_FALSE(control.Dragging());
    EXPECT_EQ(FirstMove(control.samples, second + 1), -1);
}

TEST_F(Controls, DraggingASliderRightLowersItsValueAndLeftRaisesIt)
{
    ShowWindow();
    SliderControl control(BRect(10, 10, 41, 41), "Stellar Contrast", 5, Qt::SizeHorCursor, &window);
    control.show();
    control.InitSlider(1.02, 0.1, 8.0);
    std::atomic<double> contrast { 1.0 };
    control.LinkSlider(&contrast);
    PointAt(&control, QPoint(5, 5));
    QTest::mousePress(&control, Qt::LeftButton, {}, QPoint(5, 5));
    EXPECT_EQ(contrast.load(), 1.0);

    PointAt(&control, QPoint(15, 9));
    ASSERT_TRUE(QTest::qWaitFor([&] { return contrast.load() != 1.0; }, kWait));
    // Holding still adds only zero samples, which a slider ignores: the value is exact.
    EXPECT_EQ(contrast.load(), std::pow(1.02, -10.0));

    PointAt(&control, QPoint(35, 9));
    ASSERT_TRUE(QTest::qWaitFor([&] { return contrast.load() < 0.8; }, kWait));
    EXPECT_EQ(contrast.load(), std::pow(1.02, -20.0) * std::pow(1.02, -10.0));

    PointAt(&control, QPoint(5, 9));
    ASSERT_TRUE(QTest::qWaitFor([&] { return contrast.load() > 0.6; }, kWait));
    EXPECT_DOUBLE_EQ(contrast.load(), 1.0);
    QTest::mouseRelease(&control, Qt::LeftButton, {}, QPoint(5, 9));
    EXPECT_FALSE(control.Dragging());
    EXPECT_DOUBLE_EQ(contrast.load(), 1.0);
}

TEST_F(Controls, ATrackballFollowsTheDragAndDecaysWhileThePointerIsStill)
{
    ShowWindow();
    RecordingTrackball control(BRect(10, 10, 41, 41), "Camera Z", 2, Qt::SizeVerCursor, &window);
    control.show();
    control.InitTrackball(0.0, -0.3, 0.0, 0.25);
    std::atomic<double> unused { 0.0 };
    std::atomic<double> z { 0.0 };
    control.LinkTrackball(&unused, &z);
    PointAt(&control, QPoint(16, 16));
    QTest::mousePress(&control, Qt::LeftButton, {}, QPoint(16, 16));
    PointAt(&control, QPoint(20, 26)); // down: dy = -10, target +3
    ASSERT_TRUE(QTest::qWaitFor([&] { return z.load() != 0.0; }, kWait));
    const double peak = z.load();
    EXPECT_GT(peak, 0.0);
    EXPECT_LE(peak, 0.75);
    ASSERT_TRUE(QTest::qWaitFor([&] { return z.load() < peak; }, kWait));
    QTest::mouseRelease(&control, Qt::LeftButton, {}, QPoint(20, 26));

    // The value is exactly what the recorded samples give, and the horizontal one never moved.
    double expected = 0.0;
    for (const Delta& d : control.samples)
        expected += 0.25 * (d.dy * -0.3 - expected);
    EXPECT_EQ(z.load(), expected);
    EXPECT_EQ(unused.load(), 0.0);
    const int move = FirstMove(control.samples, 0);
    ASSERT_GE(move, 0);
    EXPECT_EQ(control.samples[size_t(move)], (Delta { -4, -10 }));
}

TEST_F(Controls, ReleasingOutsideLeavesTheHandCursorAndTheNormalPicture)
{
    RecordingHandler help;
    SliderControl control(BRect(0, 0, 31, 31), "Clipping Sphere", 4, Qt::SizeHorCursor);
    control.ISetTarget(&help);
    Enter(&control);
    QTest::mousePress(&control, Qt::LeftButton, {}, QPoint(5, 5));
    EXPECT_EQ(control.CursorShape(), Qt::SizeHorCursor);
    QTest::mouseRelease(&control, Qt::LeftButton, {}, QPoint(60, 5));
    EXPECT_FALSE(control.Dragging());
    EXPECT_EQ(control.CursorShape(), Qt::PointingHandCursor);
    EXPECT_EQ(control.ShownImage(), control.NormalImage());
}

TEST_F(Controls, LeavingWhileHeldClearsTheHelpButKeepsThePressedPicture)
{
    RecordingHandler help;
    SliderControl control(BRect(0, 0, 31, 31), "Clipping Sphere", 4, Qt::SizeHorCursor);
    control.ISetTarget(&help);
    Enter(&control);
    QTest::mousePress(&control, Qt::LeftButton, {}, QPoint(5, 5));
    Leave(&control);
    EXPECT_EQ(control.ShownImage(), control.PressedImage());
    EXPECT_EQ(control.CursorShape(), Qt::PointingHandCursor);
    Enter(&control);
    EXPECT_EQ(control.ShownImage(), control.PressedImage());
    EXPECT_EQ(control.CursorShape(), Qt::SizeHorCursor);
    QTest::mouseRelease(&control, Qt::LeftButton, {}, QPoint(5, 6));
    EXPECT_EQ(control.ShownImage(), control.HoverImage());
    EXPECT_EQ(control.CursorShape(), Qt::SizeHorCursor);
    DeliverPostedMessages();
    EXPECT_EQ(
        Codes(help), (std::vector<uint32_t> { kInfoMessage, kClearInfoMessage, kInfoMessage }));
}

TEST_F(Controls, TheDragLastsWhileAnyButtonIsHeld)
{
    MouseControl control(BRect(0, 0, 31, 31), "Track Ball", 1, Qt::SizeAllCursor);
    QTest::mousePress(&control, Qt::LeftButton, {}, QPoint(5, 5));
    QTest::mousePress(&control, Qt::RightButton, {}, QPoint(5, 5));
    QTest::mouseRelease(&control, Qt::LeftButton, {}, QPoint(5, 5));
    EXPECT_TRUE(control.Dragging());
    EXPECT_EQ(control.ShownImage(), control.PressedImage());
    QTest::mouseRelease(&control, Qt::RightButton, {}, QPoint(5, 5));
    EXPECT_FALSE(control.Dragging());
    EXPECT_EQ(control.ShownImage(), control.HoverImage());
}

TEST_F(Controls, HidingTheControlEndsItsDrag)
{
    ShowWindow();
    MouseControl control(BRect(0, 0, 31, 31), "Track Ball", 1, Qt::SizeAllCursor, &window);
    control.show();
    QTest::mousePress(&control, Qt::LeftButton, {}, QPoint(5, 5));
    ASSERT_TRUE(control.Dragging());
    control.hide();
    EXPECT_FALSE(control.Dragging());
    EXPECT_EQ(control.ShownImage(), control.NormalImage());
    EXPECT_EQ(control.CursorShape(), Qt::PointingHandCursor);
    QTest::mouseRelease(&control, Qt::LeftButton, {}, QPoint(5, 5));
}
