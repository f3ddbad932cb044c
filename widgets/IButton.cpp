// Help-carrying push buttons and check boxes.
#include "widgets/IButton.h"

#include "widgets/WidgetGeometry.h"

IButton::IButton(
    BRect frame, const char* name, const char* label, Message* message, QWidget* parent)
    : TransitView<QPushButton>(QString::fromUtf8(label), parent)
    , Invoker(message)
{
    PlaceWidget(this, frame, name);
    connect(this, &QPushButton::clicked, this, [this] { Invoke(); });
}

void IButton::MouseMoved(QPoint, Transit transit)
{
    IBroadcastOnTransit(transit);
}

ICheckBox::ICheckBox(
    BRect frame, const char* name, const char* label, Message* message, QWidget* parent)
    : TransitView<QCheckBox>(QString::fromUtf8(label), parent)
    , Invoker(message)
{
    PlaceWidget(this, frame, name);
    connect(this, &QCheckBox::toggled, this, [this] { Invoke(); });
}

void ICheckBox::MouseMoved(QPoint, Transit transit)
{
    IBroadcastOnTransit(transit);
}
