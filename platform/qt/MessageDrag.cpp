// Message drags with their render-bitmap pictures.
#include "platform/qt/MessageDrag.h"

#include "platform/qt/BitmapImage.h"
#include "render/RBitmap8.h"

#include <QDrag>
#include <QDropEvent>
#include <QWidget>

MessageMimeData::MessageMimeData(const Message& message)
    : fMessage(message)
{
    // Announce the private type; the bytes are never read, the message travels as an object.
    setData(kMessageMimeType, QByteArray());
}

QDrag* MakeMessageDrag(QWidget* source, const Message& message, RBitmap8* image, BPoint hotSpot)
{
    auto* drag = new QDrag(source);
    drag->setMimeData(new MessageMimeData(message));
    if (image) {
        drag->setPixmap(DragPixmap(*image));
        drag->setHotSpot(QPoint(static_cast<int>(hotSpot.x), static_cast<int>(hotSpot.y)));
    }
    return drag;
}

Qt::DropAction DragMessage(QWidget* source, const Message& message, RBitmap8* image, BPoint hotSpot)
{
    QDrag* drag = MakeMessageDrag(source, message, image, hotSpot);
    return drag->exec(Qt::CopyAction);
}

const Message* DraggedMessage(const QMimeData* data)
{
    const auto* ours = dynamic_cast<const MessageMimeData*>(data);
    return ours ? &ours->GetMessage() : nullptr;
}

bool TakeDroppedMessage(QDropEvent* event, QWidget* receiver, Message* message)
{
    const Message* dragged = DraggedMessage(event->mimeData());
    if (!dragged) {
        event->ignore();
        return false;
    }
    *message = *dragged;
    const QPoint screen = receiver->mapToGlobal(event->position().toPoint());
    message->SetDropped(BPoint(static_cast<float>(screen.x()), static_cast<float>(screen.y())));
    event->acceptProposedAction();
    return true;
}
