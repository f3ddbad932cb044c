// The list of a list window: the names of the systems in its set, in universe order, any
// number of them selected. Dragging from it drags the item under the mouse as one system, or,
// from one of two or more selected items, every selected item as a set.
#pragma once

#include "catalog/Universe.h"
#include "platform/BPoint.h"
#include "platform/BRect.h"
#include "platform/Message.h"
#include "platform/qt/MessageDrag.h"
#include "platform/qt/TransitView.h"
#include "query/StarSysMask.h"
#include "widgets/IBroadcaster.h"

#include <QAbstractListModel>
#include <QListView>
#include <vector>

class RBitmap8;

// The names shown: one row per system index, read from the universe when drawn.
class StarListModel : public QAbstractListModel {
public:
    explicit StarListModel(QObject* parent)
        : QAbstractListModel(parent)
    {
    }

    // Shows the systems at indices (of universe), in that order, all at once.
    void SetSystems(const Universe* universe, std::vector<int32_t> indices);
    const std::vector<int32_t>& Systems() const { return fIndices; }

    int rowCount(const QModelIndex& parent = QModelIndex()) const override;
    QVariant data(const QModelIndex& index, int role) const override;

private:
    const Universe* fUniverse = nullptr;
    std::vector<int32_t> fIndices;
};

class StarListView : public TransitView<QListView>, public IBroadcaster {
public:
    // Lists the set mask (the window's, not owned) of universe.
    StarListView(BRect frame, const char* name, StarSysMask* mask, QWidget* parent);
    ~StarListView() override;

    StarListModel* Model() const { return fModel; }

    // The index of the (listIndex + 1)-th system of the set, counting up from index 0; -1 when
    // the set has fewer.
    int32_t ListToMaskIndex(int32_t listIndex) const;

    // Starts a drag from the item at index once the mouse, held down at point, has left a box
    // of 6 pixels around it; the drag begins at that moment, so this answers whether index
    // would be dragged as a set. Called by the mouse handling; public for tests.
    void InitiateDrag(int32_t index);

    // Tests catch what a drag would carry instead of running it.
    void SetDragStarter(DragStarter starter) { fDragStarter = std::move(starter); }

protected:
    void MouseMoved(QPoint where, Transit transit) override;
    void mousePressEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;

private:
    StarSysMask* listMask; // the window's set; not owned
    StarSysMask* dragMask; // what a drag of several items carries; owned
    StarListModel* fModel; // a child
    DragStarter fDragStarter;
    int32_t fPressedRow = -1; // the item the button went down on, -1 when none
    QPoint fPressPoint;
    // The press came down on one of several selected items and was kept from the list: a
    // release inside the start box makes it a click after all.
    bool fClickPending = false;
};
