// A chart's keys and wheel, turned into the velocities the trackball and the camera-distance
// control write.
#include "controls/ChartKeys.h"

#include "chart/UniverseView.h"
#include "controls/MouseControls.h"

#include <QKeyEvent>
#include <QWheelEvent>
#include <algorithm>
#include <cmath>

namespace {

// Adds step to value, but never beyond limit in step's direction, and never takes back speed a
// drag gave beyond it. One load and one store, as the controls write: the render thread's decay
// of the same value in between may be lost, or this step may.
void Push(std::atomic<double>* value, double step, double limit)
{
    const double now = value->load(std::memory_order_relaxed);
    double next = now + step;
    if (step > 0)
        next = std::max(now, std::min(next, limit));
    else
        next = std::min(now, std::max(next, -limit));
    value->store(next, std::memory_order_relaxed);
}

// Trackball figures: InitTrackball(scaleX, scaleY, easeX, easeY).
const double* Figures(MouseControlIndex control)
{
    return kMouseControls[size_t(control)].init;
}

} // namespace

ChartKeys::ChartKeys(UniverseView* view)
    : QObject(view)
    , fView(view)
{
    view->setFocusPolicy(Qt::StrongFocus);
    view->setFocus();
    view->installEventFilter(this);
}

void ChartKeys::Turn(double dx, double dy, double times)
{
    const double* f = Figures(kTrackBallControl);
    if (dx != 0)
        Push(fView->GetRadialVelocityX(), times * f[2] * f[0] * dx, std::abs(f[0]) * kTopPixels);
    if (dy != 0)
        Push(fView->GetRadialVelocityY(), times * f[3] * f[1] * dy, std::abs(f[1]) * kTopPixels);
}

void ChartKeys::MoveCamera(double dy, double times)
{
    const double* f = Figures(kCameraZControl);
    Push(fView->GetCameraVelocityZ(), times * f[3] * f[1] * dy, std::abs(f[1]) * kTopPixels);
}

void ChartKeys::Stop()
{
    fView->GetRadialVelocityX()->store(0.0, std::memory_order_relaxed);
    fView->GetRadialVelocityY()->store(0.0, std::memory_order_relaxed);
    fView->GetCameraVelocityZ()->store(0.0, std::memory_order_relaxed);
}

bool ChartKeys::eventFilter(QObject* watched, QEvent* event)
{
    if (watched != fView)
        return false;
    if (event->type() == QEvent::Wheel) {
        // Up, away from the user, is in: as a drag up on the camera-distance control.
        const double notches = static_cast<QWheelEvent*>(event)->angleDelta().y() / kWheelNotch;
        if (notches == 0)
            return false;
        MoveCamera(kPressPixels, notches);
        return true;
    }
    if (event->type() != QEvent::KeyPress)
        return false;
    const auto* key = static_cast<QKeyEvent*>(event);
    // Shortcuts with Ctrl, Alt or Meta belong to the program; Shift is allowed, as '+' needs it
    // on many keyboards.
    if (key->modifiers() & (Qt::ControlModifier | Qt::AltModifier | Qt::MetaModifier))
        return false;
    // The pixel deltas are the previous pointer position minus the current one, as the drag
    // loop measures them: a drag right or down is negative.
    switch (key->key()) {
    case Qt::Key_Left:
        Turn(kPressPixels, 0, 1);
        return true;
    case Qt::Key_Right:
        Turn(-kPressPixels, 0, 1);
        return true;
    case Qt::Key_Up:
        Turn(0, kPressPixels, 1);
        return true;
    case Qt::Key_Down:
        Turn(0, -kPressPixels, 1);
        return true;
    case Qt::Key_Plus:
    case Qt::Key_Equal:
        MoveCamera(kPressPixels, 1);
        return true;
    case Qt::Key_Minus:
    case Qt::Key_Underscore:
        MoveCamera(-kPressPixels, 1);
        return true;
    case Qt::Key_Space:
    case Qt::Key_Escape:
        Stop();
        return true;
    case Qt::Key_Home:
        fView->ReturnOriginToSun();
        return true;
    default:
        return false;
    }
}
