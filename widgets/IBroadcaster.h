// The help-text mix-in every control and custom view carries: a one-line info string, posted
// as 'Info' to a target handler when the mouse enters and cleared with 'CInf' when it leaves.
#pragma once

#include "platform/qt/TransitView.h"

#include <QPointer>

class QObject;
class QWidget;

class IBroadcaster {
public:
    IBroadcaster();
    virtual ~IBroadcaster();

    // target must be a handler (a QObject that is also a BHandler), normally an InfoView.
    // Its window is taken now, once, as the place the messages go through.
    virtual void ISetTarget(QObject* target);
    QObject* IGetTarget() const { return target; }

    // Copies text (fewer than 256 bytes are kept); posts nothing.
    void ISetInfo(const char* text);
    const char* IGetInfo() const { return info; }

    // Post 'Info' with "InfoString", or 'CInf', to the target; false, posting nothing, without
    // a target or once the target or its window is gone.
    bool IBroadcastInfo();
    bool IClearInfo();

    // The hover protocol every help-carrying widget follows: entering broadcasts, leaving
    // clears, other transits do nothing.
    void IBroadcastOnTransit(Transit transit);

protected:
    QPointer<QObject> targetLooper; // the target's window; null when no target
    QPointer<QObject> target; // where info messages go; null when none
    char info[256];
};
