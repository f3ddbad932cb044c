// A chart's keys and wheel, against the controls they stand in for: each key changes the value
// a drag of the trackball or the camera-distance control in its direction changes, the same
// way; Space and Esc stop everything; Home brings the Sun back as origin.
#include "ControlsOnTwoStars.h"

#include "chart/UniverseView.h"
#include "chart/UniverseWindow.h"
#include "controls/ChartKeys.h"
#include "controls/MouseControls.h"
#include "controls/TrackballControl.h"
#include "widgets/IPictureButton.h"
#include "widgets/InfoView.h"

#include <QApplication>
#include <QCursor>
#include <QFontMetrics>
#include <QKeyEvent>
#include <QTest>
#include <QWheelEvent>
#include <gtest/gtest.h>

namespace {

constexpr int kWait = 5000; // ms

class ChartKeysTest : public ::testing::Test, protected ControlsOnTwoStars {
protected:
    void SetUp() override
    {
        ASSERT_EQ(controls.UniverseWindows().size(), 1);
        chart = controls.UniverseWindows()[0];
        view = chart->View();
        // The chart's frames stopped: nothing but the keys and the controls changes its
        // velocities (a frame slows two of them down).
        view->DetachedFromWindow();
        chart->activateWindow();
        ASSERT_TRUE(QTest::qWaitForWindowActive(chart));
        x = view->GetRadialVelocityX();
        y = view->GetRadialVelocityY();
        z = view->GetCameraVelocityZ();
        Zero();
    }

    void Zero()
    {
        x->store(0);
        y->store(0);
        z->store(0);
    }

    // A key typed on the chart's window, which hands it to the widget with its focus.
    void Press(Qt::Key key, Qt::KeyboardModifiers modifiers = Qt::NoModifier)
    {
        QTest::keyClick(chart->windowHandle(), key, modifiers);
    }

    // The first press of key, then `repeats` auto-repeats, as a key held down sends them; the
    // value after each.
    std::vector<double> Hold(Qt::Key key, int repeats, std::atomic<double>* value)
    {
        std::vector<double> seen;
        for (int i = 0; i <= repeats; i++) {
            QKeyEvent press(QEvent::KeyPress, key, Qt::NoModifier, QString(), i > 0);
            QApplication::sendEvent(view, &press);
            seen.push_back(value->load());
        }
        return seen;
    }

    void Wheel(int angle)
    {
        const QPointF at(100, 100);
        QWheelEvent wheel(at, view->mapToGlobal(at), QPoint(), QPoint(0, angle), Qt::NoButton,
            Qt::NoModifier, Qt::NoScrollPhase, false);
        QApplication::sendEvent(view, &wheel);
    }

    // A drag of control from its middle by `by` pixels, let go once the sample with the move
    // has changed `watched`.
    static void Drag(MouseControl* control, QPoint by, std::atomic<double>* watched)
    {
        const QPoint middle(16, 16);
        QCursor::setPos(control->mapToGlobal(middle));
        QTest::mousePress(control, Qt::LeftButton, {}, middle);
        QCursor::setPos(control->mapToGlobal(middle + by));
        EXPECT_TRUE(QTest::qWaitFor([&] { return watched->load() != 0; }, kWait));
        QTest::mouseRelease(control, Qt::LeftButton, {}, middle + by);
    }

    // What one sample of a drag of ChartKeys::kPressPixels in the direction of `by` gives the
    // control's value from rest.
    double OneSample(TrackballControl* control, QPoint by, std::atomic<double>* value)
    {
        Zero();
        const double n = ChartKeys::kPressPixels / QVector2D(by).length();
        // Previous minus current position, as the drag loop measures it.
        control->Calculate(-by.x() * n, -by.y() * n);
        const double sample = value->load();
        Zero();
        return sample;
    }

    UniverseWindow* chart = nullptr;
    UniverseView* view = nullptr;
    std::atomic<double>* x = nullptr; // turn driven by the trackball's horizontal drags
    std::atomic<double>* y = nullptr; // turn driven by its vertical drags
    std::atomic<double>* z = nullptr; // the camera's motion
};

} // namespace

TEST_F(ChartKeysTest, TheChartHasItsWindowsKeyboardFocus)
{
    EXPECT_EQ(QApplication::focusWidget(), view);
    EXPECT_EQ(view->focusPolicy(), Qt::StrongFocus);
}

TEST_F(ChartKeysTest, ArrowKeysTurnAsTheTrackballDraggedThatWay)
{
    struct Case {
        Qt::Key key;
        QPoint drag;
        std::atomic<double>* turned;
        std::atomic<double>* still;
    };
    const Case cases[]
        = { { Qt::Key_Left, QPoint(-8, 0), x, y }, { Qt::Key_Right, QPoint(8, 0), x, y },
              { Qt::Key_Up, QPoint(0, -8), y, x }, { Qt::Key_Down, QPoint(0, 8), y, x } };
    for (const Case& c : cases) {
        SCOPED_TRACE(QKeySequence(c.key).toString().toStdString());
        Zero();
        Drag(controls.trackball, c.drag, c.turned);
        const double dragged = c.turned->load();
        ASSERT_NE(dragged, 0);
        Zero();
        Press(c.key);
        const double keyed = c.turned->load();
        EXPECT_GT(keyed * dragged, 0) << "dragged " << dragged << ", key " << keyed;
        EXPECT_EQ(c.still->load(), 0);
        EXPECT_EQ(z->load(), 0);
        // A press is one trackball sample of a short drag that way.
        EXPECT_DOUBLE_EQ(keyed, OneSample(controls.trackball, c.drag, c.turned));
    }
}

TEST_F(ChartKeysTest, AHeldArrowKeySpeedsTheTurnUpToASteadyDragsPace)
{
    const std::vector<double> held = Hold(Qt::Key_Right, 30, x);
    const double step = held[0];
    ASSERT_LT(step, 0);
    for (size_t i = 1; i < held.size(); i++)
        EXPECT_LE(held[i], held[i - 1]) << i;
    EXPECT_DOUBLE_EQ(held[1], 2 * step);
    EXPECT_DOUBLE_EQ(held[2], 3 * step);
    // The top speed is where a steady drag of kTopPixels a sample takes the trackball.
    Zero();
    for (int i = 0; i < 200; i++)
        controls.trackball->Calculate(-ChartKeys::kTopPixels, 0);
    EXPECT_NEAR(held.back(), x->load(), 1e-12);
    EXPECT_LT(held.back(), 5 * step);

    // A faster turn than that, from a quick drag, is not slowed down by the key; the other
    // direction still slows it.
    x->store(-0.5);
    Press(Qt::Key_Right);
    EXPECT_EQ(x->load(), -0.5);
    Press(Qt::Key_Left);
    EXPECT_DOUBLE_EQ(x->load(), -0.5 - step);
}

TEST_F(ChartKeysTest, PlusMinusAndTheWheelMoveTheCameraAsItsControlDoes)
{
    Drag(controls.cameraZ, QPoint(0, -8), z); // up: in
    const double in = z->load();
    ASSERT_LT(in, 0);
    Zero();
    Drag(controls.cameraZ, QPoint(0, 8), z); // down: out
    const double out = z->load();
    ASSERT_GT(out, 0);
    const double stepIn = OneSample(controls.cameraZ, QPoint(0, -8), z);
    const double stepOut = OneSample(controls.cameraZ, QPoint(0, 8), z);

    const std::pair<Qt::Key, Qt::KeyboardModifiers> inKeys[]
        = { { Qt::Key_Plus, Qt::NoModifier }, { Qt::Key_Plus, Qt::ShiftModifier },
              { Qt::Key_Equal, Qt::NoModifier }, { Qt::Key_Plus, Qt::KeypadModifier } };
    for (const auto& [key, modifiers] : inKeys) {
        Zero();
        Press(key, modifiers);
        EXPECT_DOUBLE_EQ(z->load(), stepIn) << QKeySequence(key).toString().toStdString();
        EXPECT_EQ(x->load(), 0);
        EXPECT_EQ(y->load(), 0);
    }
    const std::pair<Qt::Key, Qt::KeyboardModifiers> outKeys[] = { { Qt::Key_Minus, Qt::NoModifier },
        { Qt::Key_Minus, Qt::KeypadModifier }, { Qt::Key_Underscore, Qt::ShiftModifier } };
    for (const auto& [key, modifiers] : outKeys) {
        Zero();
        Press(key, modifiers);
        EXPECT_DOUBLE_EQ(z->load(), stepOut) << QKeySequence(key).toString().toStdString();
    }

    // The wheel: a notch up is a press of +, down one of -; half a notch half a press.
    Zero();
    Wheel(120);
    EXPECT_DOUBLE_EQ(z->load(), stepIn);
    Zero();
    Wheel(-120);
    EXPECT_DOUBLE_EQ(z->load(), stepOut);
    Zero();
    Wheel(60);
    EXPECT_DOUBLE_EQ(z->load(), stepIn / 2);

    // Held, + speeds the camera up to a steady drag's pace and no further.
    Zero();
    const std::vector<double> held = Hold(Qt::Key_Plus, 30, z);
    Zero();
    for (int i = 0; i < 200; i++)
        controls.cameraZ->Calculate(0, ChartKeys::kTopPixels);
    EXPECT_NEAR(held.back(), z->load(), 1e-12);
}

TEST_F(ChartKeysTest, SpaceAndEscStopEveryTurnAndTheCamera)
{
    for (Qt::Key key : { Qt::Key_Space, Qt::Key_Escape }) {
        Drag(controls.trackball, QPoint(6, -6), x);
        Drag(controls.cameraZ, QPoint(0, 6), z);
        y->store(-0.01); // the chart's own spin at the start
        ASSERT_NE(x->load(), 0);
        ASSERT_NE(z->load(), 0);
        Press(key);
        EXPECT_EQ(x->load(), 0);
        EXPECT_EQ(y->load(), 0);
        EXPECT_EQ(z->load(), 0);
    }
}

TEST_F(ChartKeysTest, HomeMakesTheSunTheOriginAgain)
{
    Message sirius(kStarMessage);
    sirius.AddInt32(kSystemIndexString, 1);
    view->MessageReceived(&sirius);
    ASSERT_EQ(view->OriginSystem(), 1);
    ASSERT_EQ(view->ReadOut().rfind("Origin: Sirius\n", 0), 0u) << view->ReadOut();
    Press(Qt::Key_Home);
    EXPECT_EQ(view->OriginSystem(), 0);
    EXPECT_EQ(view->ReadOut().rfind("Origin: The Sun\n", 0), 0u) << view->ReadOut();
}

TEST_F(ChartKeysTest, KeysWithCtrlOrAltAreNotTheCharts)
{
    Press(Qt::Key_Right, Qt::ControlModifier);
    Press(Qt::Key_Up, Qt::AltModifier);
    Press(Qt::Key_Plus, Qt::ControlModifier);
    EXPECT_EQ(x->load(), 0);
    EXPECT_EQ(y->load(), 0);
    EXPECT_EQ(z->load(), 0);
}

TEST_F(ChartKeysTest, TheHelpLineNamesTheKeysAndStillFits)
{
    InfoView* line = controls.GetInfoView();
    const QFontMetrics metrics(line->font());
    struct Case {
        IBroadcaster* control;
        const char* help;
    };
    const Case cases[] = {
        { controls.trackball, "Virtual Trackball: Rotate nightdome  [arrows]" },
        { controls.cameraZ, "Camera Distance: Zoom in and out  [+ -, wheel]" },
        { controls.findChild<IPictureButton*>("New Nightdome Button"), "New Nightdome  [Ctrl+N]" },
    };
    for (const Case& c : cases) {
        ASSERT_NE(c.control, nullptr) << c.help;
        EXPECT_STREQ(c.control->IGetInfo(), c.help);
        ASSERT_TRUE(c.control->IBroadcastInfo());
        DeliverPostedMessages();
        EXPECT_EQ(line->text().toStdString(), c.help);
        EXPECT_LE(metrics.horizontalAdvance(line->text()), line->width()) << c.help;
    }
    // The chart's own help, with the origin away from the Sun.
    view->originOffset.Set(0.49, 0.76, -2.48);
    view->SetDataString(-1, -1);
    DeliverPostedMessages();
    EXPECT_EQ(line->text().toStdString(), "Click to return Origin to the sun  [Home]");
    EXPECT_LE(metrics.horizontalAdvance(line->text()), line->width());
}
