// Posting help texts to a help line.
#include "widgets/IBroadcaster.h"

#include "core/MessageCodes.h"
#include "platform/qt/Messaging.h"

#include <QWidget>
#include <cstring>

IBroadcaster::IBroadcaster()
    : info {}
{
}

IBroadcaster::~IBroadcaster() = default;

void IBroadcaster::ISetTarget(QObject* newTarget)
{
    target = newTarget;
    auto* widget = qobject_cast<QWidget*>(newTarget);
    targetLooper = widget ? static_cast<QObject*>(widget->window()) : newTarget;
}

void IBroadcaster::ISetInfo(const char* text)
{
    std::strncpy(info, text ? text : "", sizeof info - 1);
    info[sizeof info - 1] = '\0';
}

bool IBroadcaster::IBroadcastInfo()
{
    if (!targetLooper || !target)
        return false;
    Message message(kInfoMessage);
    message.AddString(kInfoStringField, info);
    return PostMessage(target, message);
}

bool IBroadcaster::IClearInfo()
{
    if (!targetLooper || !target)
        return false;
    return PostMessage(target, Message(kClearInfoMessage));
}

void IBroadcaster::IBroadcastOnTransit(Transit transit)
{
    if (transit == B_ENTERED_VIEW)
        IBroadcastInfo();
    else if (transit == B_EXITED_VIEW)
        IClearInfo();
}
