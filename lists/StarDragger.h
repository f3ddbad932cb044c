// The list window's drag handle: pressed, it drags the whole list away, as one system when it
// holds exactly one and as a set otherwise (an empty list too).
#pragma once

#include "query/StarSysMask.h"
#include "query/panels/DragHandle.h"

class StarDragger : public DragHandle {
public:
    // A 32 x 32 handle at where over mask (the window's, not owned).
    StarDragger(BPoint where, const char* name, StarSysMask* mask, QWidget* parent);

protected:
    void Pressed() override;

private:
    StarSysMask* owner;
};
