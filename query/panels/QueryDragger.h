// The drag handle of a query panel: pressed, it runs the panel's query, says on the help line
// how many systems it found, and drags the result away, if anything matched.
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
    // "No star systems found", "1 star system found", "12 star systems found" on the help line,
    // until the mouse next comes over a control.
    void TellFound(int32_t found);

    StarQueryView* owner;
};
