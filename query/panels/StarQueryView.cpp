// What every query panel shares: its result, running the query, what a drag of the result
// carries, drops of single systems and the row its controls stand in.
#include "query/panels/StarQueryView.h"

#include "catalog/CNumbers.h"
#include "core/MessageCodes.h"
#include "platform/qt/MessageDrag.h"
#include "query/panels/PopUpMenuButton.h"
#include "query/panels/QueryDragger.h"
#include "query/panels/TextControl.h"
#include "widgets/WidgetGeometry.h"

#include <QDragEnterEvent>
#include <QDropEvent>
#include <QStyleOptionGroupBox>
#include <algorithm>

StarQueryView::StarQueryView(
    BRect frame, const char* name, const char* title, Universe* universe, QWidget* parent)
    : TransitView<QGroupBox>(QString::fromUtf8(title), parent)
    , dragger(nullptr)
    , mask(new StarSysMask(universe->CountItems(), false, 0))
    , query(nullptr)
    , queryParam(nullptr)
    , universe(universe)
    , selectedItems(0)
{
    PlaceWidget(this, frame, name);
    setAcceptDrops(true);
    setFocusPolicy(Qt::NoFocus);
    InitQueryDragger();
    ISetInfo("Drop stars here to copy to query");
}

StarQueryView::~StarQueryView()
{
    delete query;
    delete mask;
}

int32_t StarQueryView::PerformQuery()
{
    SetQueryParams();
    selectedItems = query->GetSysMask(mask, queryParam);
    return selectedItems;
}

Message* StarQueryView::GetDragMessage()
{
    if (selectedItems != 1) {
        auto* message = new Message(kStarArrayMessage);
        message->AddPointer(kSystemArrayPtrString, mask);
        return message;
    }
    auto* message = new Message(kStarMessage);
    message->AddInt32(kSystemIndexString, FindFirstSystem());
    return message;
}

RBitmap8* StarQueryView::GetDragBitmap(BRect* rect)
{
    *rect = BRect(0, 0, 32, 32);
    auto bitmap = std::make_unique<RBitmap8>(BRect(0, 0, 31, 31));
    const bool single = selectedItems == 1;
    bitmap->LoadFromResource(int32_t(kRaw8Type), single ? 2 : 3, 0, 1024);
    std::unique_ptr<RBitmap8>& kept = single ? singleDragBitmap : multiDragBitmap;
    kept = std::move(bitmap);
    return kept.get();
}

void StarQueryView::ISetTarget(QObject* target)
{
    dragger->ISetTarget(target);
    IBroadcaster::ISetTarget(target);
}

int32_t StarQueryView::FindFirstSystem() const
{
    return mask->FindFirst();
}

int32_t StarQueryView::FindLastSystem() const
{
    for (int32_t i = mask->GetSystemCount() - 1; i >= 0; i--) {
        if (mask->GetStateSafe(i))
            return i;
    }
    return -1;
}

void StarQueryView::SystemDropped(StarSystem*)
{
}

void StarQueryView::InitQueryDragger()
{
    // 38 pixels in from the right edge, centred on the row of controls under the title.
    const float left = float(rect().right()) - 38;
    const float top = ControlsMiddle() - 16;
    dragger = new QueryDragger(BRect(left, top, left + 31, top + 31), "", this, this);
    dragger->ISetInfo("Drag this to another view to find stars");
}

void StarQueryView::MessageReceived(Message* message)
{
    if (message->what == kStarMessage) {
        const int32_t index = message->FindInt32(kSystemIndexString);
        if (index >= 0 && index < universe->CountItems())
            SystemDropped(universe->SystemAt(index));
    }
}

void StarQueryView::MouseMoved(QPoint, Transit transit)
{
    IBroadcastOnTransit(transit);
}

void StarQueryView::resizeEvent(QResizeEvent* event)
{
    // The handle keeps to the right edge, centred.
    dragger->move(rect().right() - 38, int(ControlsMiddle() - 16));
    QGroupBox::resizeEvent(event);
}

namespace {

// Only single systems are taken: a set says nothing a panel could show.
void AcceptSingleSystems(QDragMoveEvent* event)
{
    const Message* message = DraggedMessage(event->mimeData());
    if (message && message->what == kStarMessage)
        event->acceptProposedAction();
}

} // namespace

void StarQueryView::dragEnterEvent(QDragEnterEvent* event)
{
    dragMoveEvent(event);
}

void StarQueryView::dragMoveEvent(QDragMoveEvent* event)
{
    // The panel's own result is not taken back: let go over the panel it came from, a single
    // system would rewrite the fields that found it.
    if (DroppedOnItsSource(event, this))
        event->ignore();
    else
        AcceptSingleSystems(event);
}

void StarQueryView::dropEvent(QDropEvent* event)
{
    if (DroppedOnItsSource(event, this)) {
        event->ignore();
        return;
    }
    Message message;
    if (TakeDroppedMessage(event, this, &message))
        MessageReceived(&message);
}

double StarQueryView::ReadNumber(const char* text)
{
    double value = 0;
    ScanDouble(text, &value);
    return value;
}

float StarQueryView::ControlsMiddle() const
{
    QStyleOptionGroupBox option;
    initStyleOption(&option);
    const QRect room
        = style()->subControlRect(QStyle::CC_GroupBox, &option, QStyle::SC_GroupBoxContents, this);
    return float(room.top() + room.bottom()) * 0.5f;
}

BRect StarQueryView::FirstMenuFrame(float width) const
{
    const float middle = ControlsMiddle();
    return BRect(10, middle - 8, 10 + width, middle + 8);
}

BRect StarQueryView::NextFrame(BRect previous, float dx, float width)
{
    return BRect(previous.left + dx, previous.top, previous.left + dx + width, previous.bottom);
}

namespace {

// Puts widget at frame's left and width, as high as its style wants and centred on middle.
void PlaceInRow(QWidget* widget, BRect frame, float middle)
{
    const int height = std::max(17, widget->sizeHint().height());
    widget->setGeometry(int(frame.left), int(middle - float(height) * 0.5f),
        int(frame.right - frame.left + 1), height);
}

} // namespace

PopUpMenuButton* StarQueryView::AddPopUpMenu(BRect frame, const char* barName, const char* menuName,
    std::initializer_list<const char*> items, int marked)
{
    auto* menu = new PopUpMenuButton(barName, menuName, items, marked, this);
    PlaceInRow(menu, frame, ControlsMiddle());
    return menu;
}

PopUpMenuButton* StarQueryView::AddModeMenu(BRect frame)
{
    return AddPopUpMenu(frame, "mode MB", "Mode Menu", { "is", "is less than", "is greater than" });
}

PopUpMenuButton* StarQueryView::AddStarModeMenu(BRect frame)
{
    return AddPopUpMenu(frame, "star mode MB", "Star Mode",
        { "Any star in system", "First star in system", "First or second star" });
}

TextControl* StarQueryView::AddTextControl(
    BRect frame, const char* name, const char* label, const char* text, float divider)
{
    auto* control = new TextControl(frame, name, label, text, divider, this);
    PlaceInRow(control, frame, ControlsMiddle());
    return control;
}
