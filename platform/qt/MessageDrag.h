// Dragging messages between views. A drag carries the message itself, in-process, under one
// private MIME type (its pointers are only good inside the running program), with a 32 x 32
// render bitmap as its image; a view that takes drops turns the drop back into the message,
// marked as dropped at the point where it was let go.
#pragma once

#include "platform/BPoint.h"
#include "platform/Message.h"

#include <QMimeData>
#include <functional>

class QDrag;
class QDragMoveEvent;
class QDropEvent;
class QWidget;
class RBitmap8;

inline constexpr char kMessageMimeType[] = "application/x-nightdome-message";

// The drag's payload: a copy of the message.
class MessageMimeData : public QMimeData {
public:
    explicit MessageMimeData(const Message& message);
    const Message& GetMessage() const { return fMessage; }

private:
    Message fMessage;
};

// Builds the drag of message from source, its picture the image (palette index 255
// transparent, with or without a compositing manager), held at hotSpot (bitmap coordinates). The
// caller runs it with exec(); headless tests look at what it carries instead.
QDrag* MakeMessageDrag(QWidget* source, const Message& message, RBitmap8* image, BPoint hotSpot);
// The same with a payload of the caller's (the drag takes it over): a subclass that offers other
// programs the dragged thing in formats of their own as well as the message.
QDrag* MakeMessageDrag(QWidget* source, MessageMimeData* data, RBitmap8* image, BPoint hotSpot);

// Builds the drag and runs it until the button is let go; returns what happened to it.
Qt::DropAction DragMessage(
    QWidget* source, const Message& message, RBitmap8* image, BPoint hotSpot);
Qt::DropAction DragMessage(QWidget* source, MessageMimeData* data, RBitmap8* image, BPoint hotSpot);

// What a view that starts drags may be given instead of running them: it is handed the
// message, the image and the hot spot. For tests, which cannot let a drag's own event loop
// wait for a button that is never let go.
using DragStarter = std::function<void(const Message&, RBitmap8*, BPoint)>;

// Hands the drag to starter when there is one, else runs it as DragMessage does.
void StartMessageDrag(const DragStarter& starter, QWidget* source, const Message& message,
    RBitmap8* image, BPoint hotSpot);

// The message a drag carries; null for anything else (files, text, other programs' data).
const Message* DraggedMessage(const QMimeData* data);

// Lets a drag that carries a message (any message) be dropped here, and refuses anything else.
// For drag-enter and drag-move events alike.
void AcceptMessageDrag(QDragMoveEvent* event);

// The dropped message, marked as dropped at the drop point in screen coordinates; false, and
// the drop refused, when the event carries anything but a message.
bool TakeDroppedMessage(QDropEvent* event, QWidget* receiver, Message* message);

// Whether a drop lands back on the view its drag started from (the receiver itself or a widget
// inside it): a press let go where it began, or a drag that never left its view. Views whose
// drops add what they carry refuse such a drop, so that a click does not add their own contents
// to them again. The source is the running drag's, whether Qt runs it or a starter was handed
// it (StartMessageDrag and DragMessage note it for as long as the drag runs).
bool DroppedOnItsSource(const QDropEvent* event, const QWidget* receiver);
