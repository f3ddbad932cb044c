// The drag handle of a query panel: a 32 x 32 picture that runs the panel's query when pressed
// and drags the result away, if anything matched. A frame marks it while the mouse is over it.
#pragma once

#include "platform/BRect.h"
#include "platform/Message.h"
#include "platform/qt/TransitView.h"
#include "render/RBitmap8.h"
#include "widgets/IBroadcaster.h"

#include <QWidget>
#include <functional>
#include <memory>

class StarQueryView;

class QueryDragger : public TransitView<QWidget>, public IBroadcaster {
public:
    // The handle stands 32 x 32 at frame's top-left corner, in owner (not owned).
    QueryDragger(BRect frame, const char* name, StarQueryView* owner, QWidget* parent);

    // Instead of running a drag, hand its message and image to starter: for tests, which cannot
    // let a drag's own event loop wait for a button that is never let go.
    using DragStarter = std::function<void(const Message&, RBitmap8*, BPoint)>;
    void SetDragStarter(DragStarter starter) { fDragStarter = std::move(starter); }

    const RBitmap8* Icon() const { return icon.get(); }
    bool IsHighlighted() const { return fHighlighted; }

protected:
    void MouseMoved(QPoint where, Transit transit) override;
    bool PassesTransitsOn() const override { return false; }
    void mousePressEvent(QMouseEvent* event) override;
    void paintEvent(QPaintEvent* event) override;

private:
    StarQueryView* owner;
    std::unique_ptr<RBitmap8> icon; // the set picture
    bool fHighlighted = false; // framed: the mouse is over the handle
    DragStarter fDragStarter;
};
