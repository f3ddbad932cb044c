// The drop pad: its two pictures, lighting up, and stamping drops with its tag.
#include "lists/DropPad.h"

#include "core/MessageCodes.h"
#include "lists/CsvDrop.h"
#include "platform/qt/BitmapImage.h"
#include "platform/qt/MessageDrag.h"
#include "widgets/WidgetGeometry.h"

#include <QDragEnterEvent>
#include <QDropEvent>
#include <QPainter>
#include <cstdlib>
#include <cstring>

DropPad::DropPad(BPoint where, float width, float height, const char* name, int32_t pictureId,
    BHandler* handler, QWidget* parent)
    : TransitView<QWidget>(parent)
    , tagName(nullptr)
    , tagValue(0)
    , fHandler(handler)
{
    PlaceWidget(this, BRect(where.x, where.y, where.x + width - 1, where.y + height - 1), name);
    const int32_t w = int32_t(width), h = int32_t(height);
    // Exactly w bytes a row: the two pictures lie back to back in the resource.
    normalImage = std::make_unique<RBitmap8>(BRect(0, 0, width - 1, height - 1), w);
    normalImage->LoadFromResource(int32_t(kDropPadType), pictureId, 0, w * h);
    highlightImage = std::make_unique<RBitmap8>(BRect(0, 0, width - 1, height - 1), w);
    highlightImage->LoadFromResource(int32_t(kDropPadType), pictureId, w * h, w * h);
    setAcceptDrops(true);
}

DropPad::~DropPad()
{
    std::free(tagName);
}

void DropPad::SetTag(const char* name, int32_t value)
{
    tagValue = value;
    std::free(tagName);
    tagName = strdup(name);
}

void DropPad::MessageReceived(Message* message)
{
    if (tagName)
        message->AddInt32(tagName, tagValue);
    if (fHandler)
        fHandler->MessageReceived(message);
}

void DropPad::Highlight(bool on)
{
    if (fHighlighted != on) {
        fHighlighted = on;
        update();
    }
}

void DropPad::MouseMoved(QPoint, Transit transit)
{
    if (transit == B_ENTERED_VIEW || transit == B_EXITED_VIEW)
        Highlight(transit == B_ENTERED_VIEW);
    IBroadcastOnTransit(transit);
}

void DropPad::paintEvent(QPaintEvent*)
{
    QPainter painter(this);
    RBitmap8* image = fHighlighted ? highlightImage.get() : normalImage.get();
    painter.drawImage(QPoint(0, 0), ImageOf(*image));
}

void DropPad::dragEnterEvent(QDragEnterEvent* event)
{
    // A drag over the pad is the mouse over it: lit, with its help. Sets come as messages from
    // this program's views and as CSV from others.
    const bool message = DraggedMessage(event->mimeData()) != nullptr;
    fCsvDrag = !message && CsvDrop::Offers(event->mimeData());
    if (message)
        event->acceptProposedAction();
    else if (!fCsvDrag || !CsvDrop::AcceptCopy(event))
        return;
    Highlight(true);
    IBroadcastInfo();
}

void DropPad::dragMoveEvent(QDragMoveEvent* event)
{
    if (fCsvDrag)
        CsvDrop::AcceptCopy(event);
    else
        AcceptMessageDrag(event);
}

void DropPad::dragLeaveEvent(QDragLeaveEvent*)
{
    Highlight(false);
    IClearInfo();
}

void DropPad::dropEvent(QDropEvent* event)
{
    Highlight(false);
    IClearInfo();
    // The pad tags what comes, then the window reads it, CSV too while the drop's data lasts.
    CsvDrop::Deliver(event, this, this);
}
