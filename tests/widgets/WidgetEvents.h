// The mouse's comings and goings and what a handler heard, for widget tests.
#pragma once

#include "platform/qt/RecordingHandler.h"
#include "render/RBitmap8.h"

#include <QCoreApplication>
#include <QEnterEvent>
#include <QWidget>
#include <cstring>
#include <vector>

// The pointer comes over the widget, near its top-left corner.
inline void Enter(QWidget* widget)
{
    QEnterEvent event(
        QPointF(2, 2), widget->mapToGlobal(QPointF(2, 2)), widget->mapToGlobal(QPointF(2, 2)));
    QCoreApplication::sendEvent(widget, &event);
}

// The pointer leaves the widget.
inline void Leave(QWidget* widget)
{
    QEvent event(QEvent::Leave);
    QCoreApplication::sendEvent(widget, &event);
}

// The codes of the messages the handler received, in order.
inline std::vector<uint32_t> Codes(const RecordingHandler& handler)
{
    std::vector<uint32_t> codes;
    for (const Message& m : handler.received)
        codes.push_back(m.what);
    return codes;
}

inline bool SamePixels(const RBitmap8* a, const RBitmap8* b)
{
    return a->BitsLength() == b->BitsLength()
        && std::memcmp(a->Bits(), b->Bits(), size_t(a->BitsLength())) == 0;
}
