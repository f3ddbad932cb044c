// The toggle button: its value, its pictures and its red hover frame.
#include "widgets/IToggleButton.h"

#include "core/MessageCodes.h"

#include <QPainter>

IToggleButton::IToggleButton(BRect frame, const char* name, const char*, int32_t resourceId,
    Message* message, QWidget* parent)
    : BitmapControl(frame, name, kToggleButtonType, resourceId, 2, message, parent)
{
    Show(OffImage());
}

void IToggleButton::SetValue(int32_t value)
{
    BitmapControl::SetValue(value);
    Show(value == 1 ? OnImage() : OffImage());
}

void IToggleButton::MouseMoved(QPoint, Transit transit)
{
    if (transit == B_ENTERED_VIEW || transit == B_EXITED_VIEW) {
        fHover = transit == B_ENTERED_VIEW;
        update();
    }
    IBroadcastOnTransit(transit);
}

void IToggleButton::mousePressEvent(QMouseEvent*)
{
    SetValue(Value() != 1 ? 1 : 0);
    Invoke();
    fHover = true; // the pointer is still over it
    update();
}

void IToggleButton::paintEvent(QPaintEvent* event)
{
    BitmapControl::paintEvent(event);
    if (fHover) {
        QPainter painter(this);
        painter.setPen(QColor(255, 0, 0));
        painter.drawRect(rect().adjusted(0, 0, -1, -1));
    }
}
