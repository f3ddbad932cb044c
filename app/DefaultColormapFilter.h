// Puts every window of the program on its screen's default colormap as soon as the window
// exists, before it is mapped.
//
// Why: on X11, Qt gives each window a colormap of its own even when the window uses the screen's
// default visual, where a colormap changes nothing about the colours. Screen-capture tools that
// honour colormaps (xwd, and what is built on the same multi-visual code) treat such windows as
// a separate layer and read all of that layer's windows through the lowest of them; the X server
// blanks whatever of that lowest window is covered. A chart lying wholly inside another chart's
// area, such as a new chart opened over the first, then came out solid black in screenshots while
// the screen itself showed it. On the default colormap the program's windows are plain parts of
// the screen to those tools. Windows on another visual (translucent ones) keep Qt's colormap: the
// default one would not match them. Off X11 the filter does nothing.
#pragma once

#include <QObject>

class QWindow;

class DefaultColormapFilter : public QObject {
public:
    explicit DefaultColormapFilter(QObject* parent = nullptr);

    // Moves window (created, on X11, on its screen's default visual) onto the default colormap;
    // false when there was nothing to do.
    static bool UseDefaultColormap(QWindow* window);

protected:
    // Watches the application's windows being created; never consumes an event.
    bool eventFilter(QObject* watched, QEvent* event) override;
};
