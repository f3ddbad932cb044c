// The drag handle of a query panel: pressed, it runs the panel's query and drags the result
// away, if anything matched.
#pragma once

#include "query/panels/DragHandle.h"

class StarQueryView;

class QueryDragger : public DragHandle {
public:
    // The handle stands 32 x 32 at frame's top-left corner, in owner (not owned).
    QueryDragger(BRect frame, const char* name, StarQueryView* owner, QWidget* parent);

protected:
    void Pressed() override;
    void MouseMoved(QPoint where, Transit transit) override;

private:
    StarQueryView* owner;
};
