// What a window hands its view, for tests that drive a view without its window: the universe
// when the window opens, and single systems.
#pragma once

#include "catalog/Universe.h"
#include "core/MessageCodes.h"
#include "platform/Message.h"

// Hands view the universe it shows; not owned.
template <class View> void HandUniverse(View& view, Universe* universe)
{
    Message message(kUniversePointer);
    message.AddPointer(kUniversePtrString, universe);
    view.MessageReceived(&message);
}

// Hands view system index as a 'StaR' that was not dropped.
template <class View> void HandSystem(View& view, int32_t index)
{
    Message message(kStarMessage);
    message.AddInt32(kSystemIndexString, index);
    view.MessageReceived(&message);
}
