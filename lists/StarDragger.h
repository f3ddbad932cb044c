// The list window's drag handle: pressed, it drags the whole list away, as one system when it
// holds exactly one and as a set otherwise (an empty list too); other programs are offered the
// list as a CSV table.
#pragma once

#include "catalog/Universe.h"
#include "query/StarSysMask.h"
#include "query/panels/DragHandle.h"

#include <memory>

class SetMimeData;

class StarDragger : public DragHandle {
public:
    // A 32 x 32 handle at where over mask (the window's, not owned), a set of universe (not
    // owned).
    StarDragger(BPoint where, const char* name, StarSysMask* mask, const Universe* universe,
        QWidget* parent);

    // What a press drags: the message, and the list as CSV for other programs.
    std::unique_ptr<SetMimeData> DragData() const;

protected:
    void Pressed() override;

private:
    StarSysMask* owner;
    const Universe* fUniverse; // not owned
};
