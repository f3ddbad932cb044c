// The star list: its rows, mapping rows to systems, and dragging from it.
#include "lists/StarListView.h"

#include "core/MessageCodes.h"
#include "platform/qt/MessageDrag.h"
#include "render/RBitmap8.h"
#include "widgets/WidgetGeometry.h"

#include <QItemSelectionModel>
#include <QMouseEvent>
#include <algorithm>

void StarListModel::SetSystems(const Universe* universe, std::vector<int32_t> indices)
{
    beginResetModel();
    fUniverse = universe;
    fIndices = std::move(indices);
    endResetModel();
}

int StarListModel::rowCount(const QModelIndex& parent) const
{
    return parent.isValid() ? 0 : int(fIndices.size());
}

QVariant StarListModel::data(const QModelIndex& index, int role) const
{
    if (role != Qt::DisplayRole || !fUniverse || index.row() < 0
        || size_t(index.row()) >= fIndices.size())
        return QVariant();
    const StarSystem* system = fUniverse->SystemAt(fIndices[size_t(index.row())]);
    return system ? QString::fromUtf8(system->GetName()) : QString();
}

StarListView::StarListView(BRect frame, const char* name, StarSysMask* mask, QWidget* parent)
    : TransitView<QListView>(parent)
    , listMask(mask)
    , dragMask(new StarSysMask(mask->GetSystemCount(), false, 0))
    , fModel(new StarListModel(this))
{
    PlaceWidget(this, frame, name);
    setModel(fModel);
    setSelectionMode(QAbstractItemView::ExtendedSelection);
    // Every row is one line of text: Qt need not measure 100,000 of them.
    setUniformItemSizes(true);
    setDragEnabled(false);
    setVerticalScrollBarPolicy(Qt::ScrollBarAlwaysOn);
    setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
}

StarListView::~StarListView()
{
    delete dragMask;
}

int32_t StarListView::ListToMaskIndex(int32_t listIndex) const
{
    if (listIndex < 0)
        return -1;
    int32_t seen = 0;
    for (int32_t i = 0; i < listMask->GetSystemCount(); i++) {
        if (listMask->GetStateSafe(i) && seen++ == listIndex)
            return i;
    }
    return -1;
}

void StarListView::InitiateDrag(int32_t index)
{
    QList<int> selected;
    for (const QModelIndex& item : selectionModel()->selectedRows())
        selected.append(item.row());
    if (selected.isEmpty()) {
        setCurrentIndex(fModel->index(index));
        selected.append(index);
    }
    RBitmap8 image(BRect(0, 0, 31, 31));
    if (selected.size() < 2 || !selected.contains(index)) {
        Message message(kStarMessage);
        message.AddInt32(kSystemIndexString, ListToMaskIndex(index));
        image.LoadFromResource(int32_t(kRaw8Type), 2, 0, 1024);
        StartMessageDrag(fDragStarter, this, message, &image, BPoint(1, 1));
        return;
    }
    // The selected rows' systems, found in one walk up the set.
    std::sort(selected.begin(), selected.end());
    dragMask->SetAll(false);
    int32_t row = 0;
    qsizetype next = 0;
    for (int32_t i = 0; i < listMask->GetSystemCount() && next < selected.size(); i++) {
        if (!listMask->GetStateSafe(i))
            continue;
        if (row == selected[next]) {
            dragMask->SetStateSafe(i, true);
            next++;
        }
        row++;
    }
    Message message(kStarArrayMessage);
    message.AddPointer(kSystemArrayPtrString, dragMask);
    image.LoadFromResource(int32_t(kRaw8Type), 3, 0, 1024);
    StartMessageDrag(fDragStarter, this, message, &image, BPoint(1, 1));
}

void StarListView::MouseMoved(QPoint, Transit transit)
{
    IBroadcastOnTransit(transit);
}

void StarListView::mousePressEvent(QMouseEvent* event)
{
    const QPoint where = event->position().toPoint();
    const QModelIndex item = indexAt(where);
    fPressPoint = where;
    fPressedRow = event->button() == Qt::LeftButton && item.isValid() ? item.row() : -1;
    // A plain press on one of several selected items may start a drag of all of them: the
    // selection stays as it is until the button comes up inside the start box.
    fClickPending = fPressedRow >= 0 && event->modifiers() == Qt::NoModifier
        && selectionModel()->isSelected(item) && selectionModel()->selectedRows().size() >= 2;
    if (fClickPending) {
        event->accept();
        return;
    }
    QListView::mousePressEvent(event);
}

void StarListView::mouseMoveEvent(QMouseEvent* event)
{
    if (fPressedRow >= 0 && (event->buttons() & Qt::LeftButton)) {
        const QPoint where = event->position().toPoint();
        // Inside the start box the list neither drags nor drag-selects.
        if (std::abs(where.x() - fPressPoint.x()) <= 6
            && std::abs(where.y() - fPressPoint.y()) <= 6)
            return;
        const int32_t row = fPressedRow;
        fPressedRow = -1;
        fClickPending = false;
        InitiateDrag(row);
        // The drag took the button's release: the list waits for a new press.
        setState(QAbstractItemView::NoState);
        return;
    }
    TransitView<QListView>::mouseMoveEvent(event);
}

void StarListView::mouseReleaseEvent(QMouseEvent* event)
{
    const int32_t clicked = fClickPending ? fPressedRow : -1;
    fPressedRow = -1;
    fClickPending = false;
    if (clicked >= 0) {
        // Released inside the start box: an ordinary click, which selects that item alone.
        selectionModel()->setCurrentIndex(
            fModel->index(clicked), QItemSelectionModel::ClearAndSelect);
        event->accept();
        return;
    }
    QListView::mouseReleaseEvent(event);
}
