// The help window F1 opens: what the mouse does in each window of the program, and its keys.
// One page of text, read-only, at a fixed size; it deletes itself when closed.
#pragma once

#include "platform/BPoint.h"

#include <QWidget>

class HelpWindow : public QWidget {
public:
    // Titled "Nightdome Help", its top-left at where; not shown until asked.
    explicit HelpWindow(BPoint where);
};
