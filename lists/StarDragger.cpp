// The list's drag handle: what a press drags.
#include "lists/StarDragger.h"

#include "core/MessageCodes.h"

StarDragger::StarDragger(BPoint where, const char* name, StarSysMask* mask, QWidget* parent)
    : DragHandle(BRect(where.x, where.y, where.x + 31, where.y + 31), name, parent)
    , owner(mask)
{
}

void StarDragger::Pressed()
{
    const bool single = owner->CountItems(true) == 1;
    Message message(single ? kStarMessage : kStarArrayMessage);
    if (single)
        message.AddInt32(kSystemIndexString, owner->FindFirst());
    else
        message.AddPointer(kSystemArrayPtrString, owner);
    RBitmap8 image(BRect(0, 0, 31, 31));
    image.LoadFromResource(int32_t(kRaw8Type), single ? 2 : 3, 0, 1024);
    StartDrag(message, &image);
}
