// The query panel's drag handle: running the query on a press, and its hover frame.
#include "query/panels/QueryDragger.h"

#include "core/MessageCodes.h"
#include "platform/qt/BitmapImage.h"
#include "platform/qt/MessageDrag.h"
#include "query/panels/StarQueryView.h"
#include "widgets/WidgetGeometry.h"

#include <QMouseEvent>
#include <QPainter>

QueryDragger::QueryDragger(BRect frame, const char* name, StarQueryView* owner, QWidget* parent)
    : TransitView<QWidget>(parent)
    , owner(owner)
    , icon(std::make_unique<RBitmap8>(BRect(0, 0, 31, 31)))
{
    PlaceWidget(this, BRect(frame.left, frame.top, frame.left + 31, frame.top + 31), name);
    icon->LoadFromResource(int32_t(kRaw8Type), 3, 0, 1024);
    setCursor(Qt::OpenHandCursor);
}

void QueryDragger::MouseMoved(QPoint, Transit transit)
{
    if (transit == B_ENTERED_VIEW || transit == B_EXITED_VIEW) {
        fHighlighted = transit == B_ENTERED_VIEW;
        update();
    }
    IBroadcastOnTransit(transit);
    // Back over the panel itself: its own help again, as when the mouse first came over it.
    if (transit == B_EXITED_VIEW && owner->rect().contains(owner->mapFromGlobal(QCursor::pos())))
        owner->IBroadcastInfo();
}

void QueryDragger::mousePressEvent(QMouseEvent* event)
{
    if (event->button() != Qt::LeftButton)
        return;
    // An empty result is never dragged.
    if (owner->PerformQuery() == 0)
        return;
    Message* message = owner->GetDragMessage();
    BRect rect;
    RBitmap8* image = owner->GetDragBitmap(&rect);
    if (fDragStarter)
        fDragStarter(*message, image, BPoint(1, 1));
    else
        DragMessage(this, *message, image, BPoint(1, 1));
    delete message;
}

void QueryDragger::paintEvent(QPaintEvent*)
{
    QPainter painter(this);
    painter.drawImage(QPoint(0, 0), ImageOf(*icon));
    if (fHighlighted) {
        painter.setPen(palette().color(QPalette::WindowText));
        painter.drawRect(rect().adjusted(0, 0, -1, -1));
    }
}
