// A list window: one set of star systems, changed by dropping sets and single systems on its
// seven drop pads (add, copy, remove, copy inverted, AND, OR, XOR) or anywhere else in it (add).
// It shows the set's size, lists the systems by name unless the list is switched off, and
// offers the set, or the systems selected in the list, to every other view.
#pragma once

#include "catalog/Universe.h"
#include "platform/BPoint.h"
#include "platform/qt/Messaging.h"
#include "query/StarSysMask.h"

#include <QWidget>

class DropPad;
class ICheckBox;
class InfoView;
class StarDragger;
class StarListView;

class ListWindow : public QWidget, public BHandler {
public:
    // A window whose frame reaches from where to where + (width, height) (so width + 1 by
    // height + 1 pixels), its help going to infoTarget, over universe (not owned). It shows
    // itself.
    ListWindow(BPoint where, float width, float height, const char* title, QObject* infoTarget,
        Universe* universe);
    ~ListWindow() override;

    // Set operations for 'SAry' and 'StaR' (by the "drop tag" a pad stamped, or adding when
    // there is none) and the "Show List" check box.
    void MessageReceived(Message* message) override;
    // Refills the list from the set, while the list is shown.
    void BuildList();

    StarSysMask* Mask() const { return mask; }
    int32_t Count() const { return count; }
    bool ShowsList() const { return showList; }
    DropPad* Pad(const char* name) const;

    Universe* universe; // not owned
    int32_t systemCount; // the universe's, when the window was made
    StarSysMask* mask; // the list's set; owned
    InfoView* countView; // "Star Systems: n"
    int32_t count; // the set's size as last shown
    StarListView* listView;
    ICheckBox* showListBox;
    bool showList;
    float frameWidth; // the window's frame width, fixed (width() is Qt's, in pixels)
    float savedHeight; // the frame height to return to when the list is shown again
    StarDragger* starDragger;

protected:
    void resizeEvent(QResizeEvent* event) override;
    void dragEnterEvent(QDragEnterEvent* event) override;
    void dragMoveEvent(QDragMoveEvent* event) override;
    void dropEvent(QDropEvent* event) override;

private:
    void DropSet(const StarSysMask* set, bool tagged, uint32_t tag);
    void DropSystem(int32_t index, bool tagged, uint32_t tag);
    // Fixes the height (list hidden) or lets it go from 120 up (list shown).
    void SetHeightLimits();

    QWidget* fMainView; // "mainview", a child
};
