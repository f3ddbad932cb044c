// The list's drag handle: what a press drags.
#include "lists/StarDragger.h"

#include "core/MessageCodes.h"
#include "lists/SetMimeData.h"

StarDragger::StarDragger(
    BPoint where, const char* name, StarSysMask* mask, const Universe* universe, QWidget* parent)
    : DragHandle(BRect(where.x, where.y, where.x + 31, where.y + 31), name, parent)
    , owner(mask)
    , fUniverse(universe)
{
}

std::unique_ptr<SetMimeData> StarDragger::DragData() const
{
    const bool single = owner->CountItems(true) == 1;
    Message message(single ? kStarMessage : kStarArrayMessage);
    if (single)
        message.AddInt32(kSystemIndexString, owner->FindFirst());
    else
        message.AddPointer(kSystemArrayPtrString, owner);
    return std::make_unique<SetMimeData>(message, fUniverse, owner);
}

void StarDragger::Pressed()
{
    std::unique_ptr<SetMimeData> data = DragData();
    const bool single = data->GetMessage().what == kStarMessage;
    RBitmap8 image(BRect(0, 0, 31, 31));
    image.LoadFromResource(int32_t(kRaw8Type), single ? 2 : 3, 0, 1024);
    StartDrag(data.release(), &image);
}
