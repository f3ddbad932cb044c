// The star information window: one star information terminal, nothing else, at a fixed size.
#pragma once

#include "platform/BPoint.h"

#include <QWidget>

class StarIView;

class StarInfoWindow : public QWidget {
public:
    // A window of 364 x 185 pixels with its top-left at where, its help going to infoTarget (a
    // handler). It shows itself; the terminal stays blank until a universe is sent to its view,
    // "Star Info View".
    StarInfoWindow(BPoint where, const char* title, QObject* infoTarget);

    StarIView* View() const { return fView; }

private:
    StarIView* fView; // a child
};
