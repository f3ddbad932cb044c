// The trackball's response to a drag sample.
#include "controls/TrackballControl.h"

namespace {

// One load and one store: a render frame sees either the old value or the new one.
void Ease(std::atomic<double>& value, double target, double ease)
{
    const double now = value.load(std::memory_order_relaxed);
    value.store(now + ease * (target - now), std::memory_order_relaxed);
}

} // namespace

TrackballControl::TrackballControl(
    BRect frame, const char* name, int32_t resourceID, Qt::CursorShape cursor, QWidget* parent)
    : MouseControl(frame, name, resourceID, cursor, parent)
{
}

void TrackballControl::InitTrackball(
    double newScaleX, double newScaleY, double newEaseX, double newEaseY)
{
    scaleX = newScaleX;
    scaleY = newScaleY;
    easeX = newEaseX;
    easeY = newEaseY;
    linkX = nullptr;
    linkY = nullptr;
}

void TrackballControl::Calculate(double dx, double dy)
{
    if (linkX)
        Ease(*linkX, dx * scaleX, easeX);
    if (linkY)
        Ease(*linkY, dy * scaleY, easeY);
}
