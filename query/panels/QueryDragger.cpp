// The query panel's drag handle: running the query on a press.
#include "query/panels/QueryDragger.h"

#include "query/panels/StarQueryView.h"

#include <QCursor>
#include <cstdio>
#include <memory>
#include <string>

QueryDragger::QueryDragger(BRect frame, const char* name, StarQueryView* owner, QWidget* parent)
    : DragHandle(frame, name, parent)
    , owner(owner)
{
}

void QueryDragger::Pressed()
{
    const int32_t found = owner->PerformQuery();
    TellFound(found);
    // An empty result is never dragged.
    if (found == 0)
        return;
    const std::unique_ptr<Message> message(owner->GetDragMessage());
    BRect rect;
    StartDrag(*message, owner->GetDragBitmap(&rect));
}

void QueryDragger::TellFound(int32_t found)
{
    char text[64];
    if (found == 0)
        std::snprintf(text, sizeof text, "No star systems found");
    else
        std::snprintf(
            text, sizeof text, "%d star system%s found", int(found), found == 1 ? "" : "s");
    // Posted as the handle's help is, which the next entry over the handle shows again.
    const std::string help = IGetInfo();
    ISetInfo(text);
    IBroadcastInfo();
    ISetInfo(help.c_str());
}

void QueryDragger::MouseMoved(QPoint where, Transit transit)
{
    DragHandle::MouseMoved(where, transit);
    // Back over the panel itself: its own help again, as when the mouse first came over it.
    if (transit == B_EXITED_VIEW && owner->rect().contains(owner->mapFromGlobal(QCursor::pos())))
        owner->IBroadcastInfo();
}
