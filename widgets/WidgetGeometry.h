// Placing a widget where its frame says and naming it, as every view of the program is, and
// the grey the windows share.
#pragma once

#include "platform/BRect.h"

#include <QPalette>
#include <QWidget>
#include <cmath>

// The frame's edges are inclusive pixel coordinates in the parent: (0, 0, 31, 31) is 32 x 32.
inline void PlaceWidget(QWidget* widget, BRect frame, const char* name)
{
    widget->setGeometry(static_cast<int>(frame.left), static_cast<int>(frame.top),
        static_cast<int>(std::trunc(frame.right - frame.left + 1)),
        static_cast<int>(std::trunc(frame.bottom - frame.top + 1)));
    if (name)
        widget->setObjectName(QString::fromUtf8(name));
}

// Gives view the light grey background the program's windows stand on.
inline void PaintWindowGrey(QWidget* view)
{
    view->setAutoFillBackground(true);
    QPalette grey = view->palette();
    grey.setColor(QPalette::Window, QColor(220, 220, 220));
    view->setPalette(grey);
}
