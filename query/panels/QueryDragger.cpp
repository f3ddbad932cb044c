// The query panel's drag handle: running the query on a press.
#include "query/panels/QueryDragger.h"

#include "query/panels/StarQueryView.h"

#include <QCursor>
#include <memory>

QueryDragger::QueryDragger(BRect frame, const char* name, StarQueryView* owner, QWidget* parent)
    : DragHandle(frame, name, parent)
    , owner(owner)
{
}

void QueryDragger::Pressed()
{
    // An empty result is never dragged.
    if (owner->PerformQuery() == 0)
        return;
    const std::unique_ptr<Message> message(owner->GetDragMessage());
    BRect rect;
    StartDrag(*message, owner->GetDragBitmap(&rect));
}

void QueryDragger::MouseMoved(QPoint where, Transit transit)
{
    DragHandle::MouseMoved(where, transit);
    // Back over the panel itself: its own help again, as when the mouse first came over it.
    if (transit == B_EXITED_VIEW && owner->rect().contains(owner->mapFromGlobal(QCursor::pos())))
        owner->IBroadcastInfo();
}
