// The help line's reactions to help messages.
#include "widgets/InfoView.h"

#include "core/MessageCodes.h"
#include "widgets/WidgetGeometry.h"

InfoView::InfoView(BRect frame, const char* name, const char* text, QWidget* parent)
    : TransitView<QLabel>(QString::fromUtf8(text), parent)
{
    PlaceWidget(this, frame, name);
}

void InfoView::MessageReceived(Message* message)
{
    switch (message->what) {
    case kInfoMessage:
        setText(QString::fromUtf8(message->FindString(kInfoStringField)));
        break;
    case kClearInfoMessage:
        setText(QString());
        break;
    default:
        break;
    }
}

void InfoView::MouseMoved(QPoint, Transit transit)
{
    IBroadcastOnTransit(transit);
}
