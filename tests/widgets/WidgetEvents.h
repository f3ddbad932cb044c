// The mouse's comings and goings, what a handler heard and what a drag would have carried, for
// widget tests.
#pragma once

#include "core/MessageCodes.h"
#include "platform/qt/MessageDrag.h"
#include "platform/qt/RecordingHandler.h"
#include "render/RBitmap8.h"

#include <QCoreApplication>
#include <QDragEnterEvent>
#include <QDropEvent>
#include <QEnterEvent>
#include <QMouseEvent>
#include <QWidget>
#include <cstring>
#include <optional>
#include <vector>

// The pointer comes over the widget, near its top-left corner.
inline void Enter(QWidget* widget)
{
    QEnterEvent event(
        QPointF(2, 2), widget->mapToGlobal(QPointF(2, 2)), widget->mapToGlobal(QPointF(2, 2)));
    QCoreApplication::sendEvent(widget, &event);
}

// The pointer moves to where in the widget, no button held; what that posts is delivered.
inline void MoveMouse(QWidget* widget, QPoint where)
{
    QMouseEvent move(QEvent::MouseMove, QPointF(where), widget->mapToGlobal(QPointF(where)),
        Qt::NoButton, Qt::NoButton, Qt::NoModifier);
    QCoreApplication::sendEvent(widget, &move);
    DeliverPostedMessages();
}

// The left button goes down at where in the widget.
inline void PressMouse(QWidget* widget, QPoint where)
{
    QMouseEvent press(QEvent::MouseButtonPress, QPointF(where), widget->mapToGlobal(QPointF(where)),
        Qt::LeftButton, Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(widget, &press);
}

// The pointer leaves the widget.
inline void Leave(QWidget* widget)
{
    QEvent event(QEvent::Leave);
    QCoreApplication::sendEvent(widget, &event);
}

// The codes of the messages the handler received, in order.
inline std::vector<uint32_t> Codes(const RecordingHandler& handler)
{
    std::vector<uint32_t> codes;
    for (const Message& m : handler.received)
        codes.push_back(m.what);
    return codes;
}

inline bool SamePixels(const RBitmap8* a, const RBitmap8* b)
{
    return a->BitsLength() == b->BitsLength()
        && std::memcmp(a->Bits(), b->Bits(), size_t(a->BitsLength())) == 0;
}

// A bitmap's pixel memory, to compare pictures.
inline std::vector<uint8_t> Pixels(const RBitmap8& bitmap)
{
    return std::vector<uint8_t>(bitmap.Bits(), bitmap.Bits() + bitmap.BitsLength());
}

// The pixels of the 32 x 32 drag picture 'Raw8' id: 2 one system, 3 a set.
inline std::vector<uint8_t> DragPicture(int32_t id)
{
    RBitmap8 picture(BRect(0, 0, 31, 31));
    picture.LoadFromResource(int32_t(kRaw8Type), id, 0, 1024);
    return Pixels(picture);
}

// What a drag would have carried: the message, its picture's pixels and the hot spot.
struct CaughtDrag {
    Message message;
    std::vector<uint8_t> pixels;
    BPoint hotSpot;
};

// A drag starter that keeps what it is handed in caught (which must outlive its use).
inline DragStarter CatchDrag(std::optional<CaughtDrag>& caught)
{
    return [&caught](const Message& message, RBitmap8* image, BPoint hotSpot) {
        caught = CaughtDrag { message, Pixels(*image), hotSpot };
    };
}

// A drag starter that lets the drag go at where over target, as a hand would let the button go
// there: the target sees the drag come in, move and, if it lets it, be dropped. taken (which
// must outlive its use) tells whether the target took the drop.
inline DragStarter LetGoOver(QWidget* target, QPoint where, bool& taken)
{
    return [target, where, &taken](const Message& message, RBitmap8*, BPoint) {
        taken = false;
        MessageMimeData data(message);
        QDragEnterEvent enter(where, Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
        QCoreApplication::sendEvent(target, &enter);
        if (!enter.isAccepted())
            return;
        QDragMoveEvent move(where, Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
        QCoreApplication::sendEvent(target, &move);
        if (!move.isAccepted())
            return;
        QDropEvent drop(QPointF(where), Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
        QCoreApplication::sendEvent(target, &drop);
        taken = drop.isAccepted();
    };
}
