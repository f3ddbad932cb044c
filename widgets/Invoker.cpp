// Sending a control's message.
#include "widgets/Invoker.h"

#include "platform/qt/Messaging.h"

bool Invoker::Invoke()
{
    return fMessage && PostMessage(fTarget, *fMessage);
}
