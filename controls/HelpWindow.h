// The help window F1 opens: what the mouse does in each window of the program, and its keys.
// One page of text, read-only, that scrolls when the screen is too small for it; it deletes
// itself when closed.
#pragma once

#include "platform/BPoint.h"

#include <QPoint>
#include <QWidget>

class HelpWindow : public QWidget {
public:
    // Titled "Nightdome Help", its top-left at where; not shown until asked. At most as large as
    // the free area of the screen it opens on, and moved into that area if need be.
    explicit HelpWindow(BPoint where);

private:
    void FitToScreen(QPoint where);
};
