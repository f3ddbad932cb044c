// The picture button's press, move-out, move-back and release.
#include "widgets/IPictureButton.h"

#include "core/MessageCodes.h"

#include <QCursor>
#include <QMouseEvent>

IPictureButton::IPictureButton(BRect frame, const char* name, const char*, int32_t resourceId,
    Message* message, QWidget* parent)
    : BitmapControl(frame, name, kPictureButtonType, resourceId, 3, message, parent)
{
    fHoldTimer.setInterval(50);
    connect(&fHoldTimer, &QTimer::timeout, this, [this] { SamplePointer(); });
}

void IPictureButton::MouseMoved(QPoint, Transit transit)
{
    if (fHoldTimer.isActive())
        return; // while held, the timer decides what is shown
    if (transit == B_ENTERED_VIEW)
        Show(OverImage());
    else if (transit == B_EXITED_VIEW)
        Show(NormalImage());
    IBroadcastOnTransit(transit);
}

void IPictureButton::mousePressEvent(QMouseEvent*)
{
    Show(PressedImage());
    fHoldTimer.start();
}

void IPictureButton::SamplePointer()
{
    const bool inside = rect().contains(mapFromGlobal(QCursor::pos()));
    Show(inside ? PressedImage() : OverImage());
}

void IPictureButton::mouseReleaseEvent(QMouseEvent* event)
{
    fHoldTimer.stop();
    if (rect().contains(event->position().toPoint())) {
        Show(OverImage());
        Invoke();
    } else {
        Show(NormalImage());
    }
}
