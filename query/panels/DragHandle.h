// A 32 x 32 drag handle: the set picture, framed while the mouse is over it, that starts a drag
// of a star set when pressed. What it drags is its subclass's business.
#pragma once

#include "platform/BPoint.h"
#include "platform/BRect.h"
#include "platform/Message.h"
#include "platform/qt/MessageDrag.h"
#include "platform/qt/TransitView.h"
#include "render/RBitmap8.h"
#include "widgets/IBroadcaster.h"

#include <QWidget>
#include <memory>

class DragHandle : public TransitView<QWidget>, public IBroadcaster {
public:
    // Tests catch what a drag would carry instead of running it.
    void SetDragStarter(DragStarter starter) { fDragStarter = std::move(starter); }

    const RBitmap8* Icon() const { return icon.get(); }
    bool IsHighlighted() const { return fHighlighted; }

protected:
    // The handle stands 32 x 32 at frame's top-left corner.
    DragHandle(BRect frame, const char* name, QWidget* parent);

    // A press of the left button.
    virtual void Pressed() = 0;
    // Drags message with image held at its point (1, 1), or hands both to the drag starter.
    void StartDrag(const Message& message, RBitmap8* image);
    // The same with a payload that offers more than the message (taken over; a drag starter is
    // handed its message).
    void StartDrag(MessageMimeData* data, RBitmap8* image);

    void MouseMoved(QPoint where, Transit transit) override;
    bool PassesTransitsOn() const override { return false; }
    void mousePressEvent(QMouseEvent* event) override;
    void paintEvent(QPaintEvent* event) override;

    std::unique_ptr<RBitmap8> icon; // the set picture

private:
    bool fHighlighted = false; // framed: the mouse is over the handle
    DragStarter fDragStarter;
};
