// A handler that asked for the chart's star-information broadcasts, and what it wants in them.
#pragma once

#include <QObject>
#include <QPointer>
#include <cstdint>

// Flag bits of a subscription.
enum : int32_t {
    kSITargetChanged = 0x01, // notify when the system under the mouse changes
    kSISelectionChanged = 0x04, // notify when the selection changes
    kSIWithTarget = 0x08, // include "Target Index"
    kSIWithSelection = 0x10, // include "Selection Index"
    kSIWithUniverse = 0x20, // include "Universe Pointer"
};

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
