// Trimming the allocator after windows are deleted.
#include "app/ClosedWindowTrimmer.h"

#include <QEvent>
#include <QPixmapCache>
#include <QWidget>

#if defined(__GLIBC__)
#include <malloc.h>
#endif

ClosedWindowTrimmer::ClosedWindowTrimmer(QObject* parent)
    : QObject(parent)
{
    fTrim.setSingleShot(true);
    fTrim.setInterval(0);
    connect(&fTrim, &QTimer::timeout, this, [] {
        // The pictures still needed are drawn again at the next paint.
        QPixmapCache::clear();
        TrimFreeMemory();
    });
}

bool ClosedWindowTrimmer::TrimFreeMemory()
{
#if defined(__GLIBC__)
    return malloc_trim(0) != 0;
#else
    return false;
#endif
}

bool ClosedWindowTrimmer::eventFilter(QObject* watched, QEvent* event)
{
    // A window that deletes itself on close goes once the event loop gets to its deletion; its
    // children (a chart's view, with its frames) go inside its destructor, before `destroyed`.
    if (event->type() == QEvent::Close && watched->isWidgetType()) {
        auto* widget = static_cast<QWidget*>(watched);
        if (widget->isWindow() && widget->testAttribute(Qt::WA_DeleteOnClose))
            connect(widget, &QObject::destroyed, this, &ClosedWindowTrimmer::WindowDestroyed,
                Qt::UniqueConnection);
    }
    return false;
}

void ClosedWindowTrimmer::WindowDestroyed()
{
    fTrim.start();
}
