// Gives the memory of closed windows back to the system.
//
// Why: a chart's render threads allocate its frames and caches from malloc arenas of their own,
// and glibc keeps the freed memory of an arena for later instead of handing it back. Closing 24
// charts left the program holding about 200 MB where one chart needs 70 MB, although every
// chart and every thread was gone. And the style draws scroll bars through Qt's pixmap cache
// under keys that differ from window to window, so every list window closed left its pictures
// there, some 2.5 kB a window, until the cache was full at 10 MB. After a window has been
// deleted this filter empties the pixmap cache and asks the allocator to release what it holds
// free (malloc_trim), once for any number of windows that go in one pass of the event loop.
#pragma once

#include <QObject>
#include <QTimer>

class ClosedWindowTrimmer : public QObject {
public:
    explicit ClosedWindowTrimmer(QObject* parent = nullptr);

    // Hands the allocator's free memory back to the system; true when some was released. Does
    // nothing off glibc.
    static bool TrimFreeMemory();

protected:
    // Watches top-level windows close; never consumes an event.
    bool eventFilter(QObject* watched, QEvent* event) override;

private:
    void WindowDestroyed();

    QTimer fTrim; // single shot: one trim after a run of deletions
};
