// A handler that asked for the chart's star-information broadcasts, and what it wants in them.
#pragma once

#include "core/MessageCodes.h"

#include <QObject>
#include <QPointer>
#include <cstdint>

struct SISubscriber {
    SISubscriber(QObject* looper, QObject* handler, int32_t flags)
        : looper(looper)
        , handler(handler)
        , flags(flags)
    {
    }

    QPointer<QObject> looper; // the handler's window; not owned
    QPointer<QObject> handler; // a BHandler; not owned
    int32_t flags;
};
