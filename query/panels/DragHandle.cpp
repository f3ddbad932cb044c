// The drag handle's face, its hover frame and starting its drags.
#include "query/panels/DragHandle.h"

#include "core/MessageCodes.h"
#include "platform/qt/BitmapImage.h"
#include "platform/qt/MessageDrag.h"
#include "widgets/WidgetGeometry.h"

#include <QMouseEvent>
#include <QPainter>

DragHandle::DragHandle(BRect frame, const char* name, QWidget* parent)
    : TransitView<QWidget>(parent)
    , icon(std::make_unique<RBitmap8>(BRect(0, 0, 31, 31)))
{
    PlaceWidget(this, BRect(frame.left, frame.top, frame.left + 31, frame.top + 31), name);
    icon->LoadFromResource(int32_t(kRaw8Type), 3, 0, 1024);
    setCursor(Qt::OpenHandCursor);
}

void DragHandle::StartDrag(const Message& message, RBitmap8* image)
{
    StartMessageDrag(fDragStarter, this, message, image, BPoint(1, 1));
}

void DragHandle::StartDrag(MessageMimeData* data, RBitmap8* image)
{
    if (fDragStarter) {
        fDragStarter(data->GetMessage(), image, BPoint(1, 1));
        delete data;
        return;
    }
    DragMessage(this, data, image, BPoint(1, 1));
}

void DragHandle::MouseMoved(QPoint, Transit transit)
{
    if (transit == B_ENTERED_VIEW || transit == B_EXITED_VIEW) {
        fHighlighted = transit == B_ENTERED_VIEW;
        update();
    }
    IBroadcastOnTransit(transit);
}

void DragHandle::mousePressEvent(QMouseEvent* event)
{
    if (event->button() == Qt::LeftButton)
        Pressed();
}

void DragHandle::paintEvent(QPaintEvent*)
{
    QPainter painter(this);
    painter.drawImage(QPoint(0, 0), ImageOf(*icon));
    if (fHighlighted) {
        painter.setPen(palette().color(QPalette::WindowText));
        painter.drawRect(rect().adjusted(0, 0, -1, -1));
    }
}
