// The find window: the six query panels (name, spectral class, magnitude, right ascension,
// declination, distance) in a column that scrolls when the window is made shorter. Its width
// is fixed; its height can shrink to 70.
#pragma once

#include "catalog/Universe.h"
#include "platform/BPoint.h"
#include "platform/qt/Messaging.h"

#include <QWidget>

class DECQueryView;
class DistQueryView;
class MGQueryView;
class NameQueryView;
class QScrollBar;
class RAQueryView;
class SCQueryView;

class FindWindow : public QWidget, public BHandler {
public:
    // A window whose frame reaches from where to where + (width, height), as every window of
    // the program is placed (so width + 1 by height + 1 pixels); its panels send their help to
    // infoTarget and search universe (not owned). The window shows itself.
    FindWindow(BPoint where, float width, float height, const char* title, QObject* infoTarget,
        Universe* universe);

    // The scroll range after a resize to newWidth by newHeight (frame sizes, a pixel less than
    // the window's): the column, 30 pixels taller than the window was made, less what shows.
    void FrameResized(float newWidth, float newHeight);
    void MessageReceived(Message* message) override;

    NameQueryView* nameQuery;
    SCQueryView* scQuery;
    MGQueryView* mgQuery;
    RAQueryView* raQuery;
    DECQueryView* decQuery;
    DistQueryView* distQuery;
    QScrollBar* scrollBar; // a child
    float contentHeight; // the frame height the window was made with

protected:
    void resizeEvent(QResizeEvent* event) override;

private:
    // Moves the column up by the scroll bar's value.
    void ScrollTo(int value);

    QWidget* fScroller; // "Find Scroller": the column's clip and the scroll bar, a child
    QWidget* fMainView; // "mainview": the grey column of panels, a child of the clip
    QWidget* fClip; // a child of the scroller
    bool fResized = false; // the scroll range stays 0 until the first resize
};
