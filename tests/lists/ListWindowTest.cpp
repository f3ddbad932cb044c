// The list window: its pads and layout, the set operations each pad makes with sets and with
// single systems, the count line, switching the list off and on, and dragging from the list and
// its handle.
#include "query/UniverseBuilder.h"

#include "app/ChartReaders.h"
#include "catalog/TempCatalogue.h"
#include "controls/ControlWindow.h"
#include "controls/ControlsOnTwoStars.h"
#include "core/MessageCodes.h"
#include "lists/DropPad.h"
#include "lists/ListWindow.h"
#include "lists/StarDragger.h"
#include "lists/StarListView.h"
#include "platform/qt/MessageDrag.h"
#include "platform/qt/RecordingHandler.h"
#include "query/panels/NameQueryView.h"
#include "query/panels/QueryDragger.h"
#include "query/panels/TextControl.h"
#include "render/SpectralTables.h"
#include "resources/ResourceData.h"
#include "widgets/IButton.h"
#include "widgets/InfoView.h"
#include "widgets/WidgetEvents.h"
#include "widgets/WidgetGeometry.h"

#include "PadOperations.h"
#include <QDragEnterEvent>
#include <QDropEvent>
#include <QItemSelectionModel>
#include <QLabel>
#include <QTest>
#include <algorithm>
#include <cstring>

#include <gtest/gtest.h>
#include <optional>

namespace {

class ListTest : public ::testing::Test {
protected:
    static void SetUpTestSuite() { InitResources(); }

    void SetUp() override
    {
        // Twenty systems "S0" to "S19" along the x axis.
        for (int i = 0; i < 20; i++) {
            const std::string name = "S" + std::to_string(i);
            AddTestSystem(universe, i + 1, 0, 0, { { name.c_str(), "G2V", 4.8 } });
        }
    }

    std::unique_ptr<ListWindow> NewList()
    {
        return std::make_unique<ListWindow>(
            BPoint(140, 140), 230, 340, "Star List", &help, &universe);
    }

    // A set of the given systems, kept by the test while the drop is handled.
    StarSysMask* Set(std::initializer_list<int32_t> indices)
    {
        sets.push_back(std::make_unique<StarSysMask>(universe.CountItems(), false, 0));
        for (const int32_t i : indices)
            sets.back()->SetStateSafe(i, true);
        return sets.back().get();
    }

    // Drops message on target (a pad or the window) as a drag ending there would.
    static void Drop(QWidget* target, const Message& message)
    {
        MessageMimeData data(message);
        const QPoint middle(target->width() / 2, target->height() / 2);
        QDragEnterEvent enter(middle, Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
        QCoreApplication::sendEvent(target, &enter);
        ASSERT_TRUE(enter.isAccepted());
        QDropEvent drop(QPointF(middle), Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
        QCoreApplication::sendEvent(target, &drop);
    }

    static Message SetMessage(const StarSysMask* set)
    {
        Message message(kStarArrayMessage);
        message.AddPointer(kSystemArrayPtrString, const_cast<StarSysMask*>(set));
        return message;
    }

    static Message SystemMessage(int32_t index)
    {
        Message message(kStarMessage);
        message.AddInt32(kSystemIndexString, index);
        return message;
    }

    static std::vector<int32_t> Members(const ListWindow& list)
    {
        std::vector<int32_t> members;
        for (int32_t i = 0; i < list.Mask()->GetSystemCount(); i++) {
            if (list.Mask()->GetStateSafe(i))
                members.push_back(i);
        }
        return members;
    }

    static std::optional<CaughtDrag> PressHandle(DragHandle* handle)
    {
        std::optional<CaughtDrag> caught;
        handle->SetDragStarter(CatchDrag(caught));
        QTest::mousePress(handle, Qt::LeftButton, Qt::NoModifier, QPoint(5, 5));
        return caught;
    }

    Universe universe { 50 };
    RecordingHandler help;
    std::vector<std::unique_ptr<StarSysMask>> sets;
};

} // namespace

TEST_F(ListTest, ANewListWindowAndItsParts)
{
    auto list = NewList();
    EXPECT_EQ(list->windowTitle(), "Star List");
    EXPECT_EQ(list->geometry(), QRect(140, 140, 231, 341));
    EXPECT_EQ(list->minimumSize(), QSize(231, 121));
    EXPECT_EQ(list->maximumSize(), QSize(231, 32001));
    EXPECT_TRUE(list->ShowsList());
    EXPECT_EQ(list->Count(), 0);
    EXPECT_EQ(list->countView->text(), "Star Systems: 0");
    EXPECT_EQ(list->countView->geometry().topLeft(), QPoint(0, 54));
    EXPECT_GE(list->countView->width(), 101);
    EXPECT_LE(list->countView->geometry().right(), list->showListBox->x() - 1);
    EXPECT_STREQ(list->countView->IGetInfo(), "Star systems in list");
    EXPECT_TRUE(list->showListBox->isChecked());
    EXPECT_EQ(list->showListBox->text(), "Show List");
    EXPECT_EQ(list->showListBox->objectName(), "Show List CB");
    EXPECT_STREQ(
        list->showListBox->IGetInfo(), "List operations are much faster when list is not shown");
    EXPECT_EQ(list->listView->objectName(), "The List");
    EXPECT_EQ(list->listView->geometry().top(), 71);
    EXPECT_EQ(list->listView->geometry().bottom(), 340);
    EXPECT_STREQ(list->listView->IGetInfo(), "Star List: Drag stars to another view  [Ctrl+S]");
    EXPECT_EQ(list->starDragger->objectName(), "Star Dragger");
    EXPECT_EQ(list->starDragger->geometry(), QRect(230 - 42, 10, 32, 32));
    EXPECT_STREQ(
        list->starDragger->IGetInfo(), "Star List Dragger: Drag to another view  [Ctrl+S]");

    struct Expected {
        const char* name;
        QRect frame;
        uint32_t tag;
        const char* help;
    };
    const Expected pads[] = {
        { "Plus", QRect(0, 0, 32, 32), kAddTag, "Drop Pad: Add to list" },
        { "Equals", QRect(40, 0, 32, 32), kEqualsTag, "Drop Pad: Copy list" },
        { "Minus", QRect(80, 0, 32, 32), kMinusTag, "Drop Pad: Remove from list" },
        { "NOT", QRect(2, 34, 32, 16), kNotTag, "Drop Pad: Copy and invert list" },
        { "AND", QRect(42, 34, 32, 16), kAndTag, "Drop Pad: Logical AND" },
        { "OR", QRect(82, 34, 32, 16), kOrTag, "Drop Pad: Logical OR" },
        { "XOR", QRect(122, 34, 32, 16), kXorTag, "Drop Pad: Logical XOR" },
    };
    for (const Expected& e : pads) {
        const DropPad* pad = list->Pad(e.name);
        ASSERT_NE(pad, nullptr) << e.name;
        EXPECT_EQ(pad->geometry(), e.frame) << e.name;
        EXPECT_STREQ(pad->TagName(), "drop tag");
        EXPECT_EQ(uint32_t(pad->TagValue()), e.tag) << e.name;
        EXPECT_STREQ(pad->IGetInfo(), e.help);
        EXPECT_EQ(pad->IGetTarget(), &help);
    }
    EXPECT_EQ(kOrTag, 0x4f527420u); // 'ORt ', its last character a blank
}

TEST_F(ListTest, SetsDroppedOnEachPad)
{
    const std::vector<PadOperation> cases = PadOperationsOnOneTwoThree();
    for (const PadOperation& c : cases) {
        auto list = NewList();
        Drop(list->Pad("Equals"), SetMessage(Set({ 1, 2, 3 })));
        ASSERT_EQ(Members(*list), std::vector<int32_t>({ 1, 2, 3 }));
        Drop(c.pad ? static_cast<QWidget*>(list->Pad(c.pad)) : list.get(),
            SetMessage(Set({ 3, 4 })));
        EXPECT_EQ(Members(*list), c.expected) << (c.pad ? c.pad : "window");
        EXPECT_EQ(list->Count(), int32_t(c.expected.size()));
        EXPECT_EQ(list->listView->Model()->Systems(), c.expected);
    }
}

TEST_F(ListTest, SingleSystemsFollowRulesOfTheirOwn)
{
    struct Case {
        const char* pad;
        int32_t dropped;
        std::vector<int32_t> expected; // from {1, 2, 3}
    };
    const Case cases[] = {
        { nullptr, 5, { 1, 2, 3, 5 } },
        { "Plus", 5, { 1, 2, 3, 5 } },
        { "Equals", 5, { 5 } },
        { "Minus", 2, { 1, 3 } },
        { "NOT", 2, { 1, 3 } }, // flips that system alone
        { "NOT", 5, { 1, 2, 3, 5 } },
        { "AND", 5, { 1, 2, 3 } }, // changes nothing
        { "AND", 2, { 1, 2, 3 } },
        { "OR", 5, { 1, 2, 3, 5 } },
        { "XOR", 2, { 1, 3 } },
        { "XOR", 5, { 1, 2, 3, 5 } },
    };
    for (const Case& c : cases) {
        auto list = NewList();
        Drop(list->Pad("Equals"), SetMessage(Set({ 1, 2, 3 })));
        Drop(
            c.pad ? static_cast<QWidget*>(list->Pad(c.pad)) : list.get(), SystemMessage(c.dropped));
        EXPECT_EQ(Members(*list), c.expected) << (c.pad ? c.pad : "window") << " " << c.dropped;
    }
    // The same system as a set of one on NOT: the list becomes everything else.
    auto list = NewList();
    Drop(list->Pad("Equals"), SetMessage(Set({ 1, 2, 3 })));
    Drop(list->Pad("NOT"), SetMessage(Set({ 2 })));
    EXPECT_EQ(list->Count(), 19);
    EXPECT_FALSE(list->Mask()->GetStateSafe(2));
    // A negative index is ignored altogether.
    Drop(list->Pad("Equals"), SystemMessage(-1));
    EXPECT_EQ(list->Count(), 19);
}

TEST_F(ListTest, TheCountLineAfterTwelveSystems)
{
    auto list = NewList();
    Drop(list->Pad("Plus"), SetMessage(Set({ 0, 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11 })));
    EXPECT_EQ(list->countView->text(), "Star Systems: 12");
    EXPECT_EQ(list->listView->model()->rowCount(), 12);
    EXPECT_EQ(list->listView->model()->index(11, 0).data().toString(), "S11");
}

// The count line as the window draws it: the strip from the left edge to the check box.
static QImage DrawnCountLine(ListWindow& list)
{
    const QRect strip(0, 54, list.showListBox->x(), 13);
    return list.grab(strip).toImage().convertToFormat(QImage::Format_RGB32);
}

// What that strip shows when text is drawn whole: a label as wide as the strip, in the count
// line's font, on the windows' grey.
static QImage WholeCountLine(ListWindow& list, const QString& text)
{
    QWidget back;
    PaintWindowGrey(&back);
    back.resize(list.showListBox->x(), 13);
    QLabel line(text, &back);
    line.setFont(list.countView->font());
    line.setGeometry(0, 0, back.width(), 13);
    return back.grab().toImage().convertToFormat(QImage::Format_RGB32);
}

TEST(ListCountLine, CountsUpToAMillionShowWhole)
{
    InitResources();
    Universe universe(100000);
    for (int32_t i = 0; i < 1000000; i++)
        AddTestSystem(universe, i % 1000, i / 1000, 0, { { "S", "G2V", 4.8 } });
    RecordingHandler help;
    ListWindow list(BPoint(140, 140), 230, 340, "Star List", &help, &universe);
    // Nothing may stand over the line, nor the line over the check box.
    EXPECT_EQ(list.countView->geometry().topLeft(), QPoint(0, 54));
    EXPECT_EQ(list.countView->height(), 13);
    EXPECT_LE(list.countView->geometry().right(), list.showListBox->x() - 1);
    EXPECT_EQ(list.showListBox->geometry(), QRect(230 - 80, 49, 81, 15));
    const QFontMetrics metrics(list.countView->font());
    for (const char* widest : { "Star Systems: 0000000", "Star Systems: 8888888" })
        EXPECT_LE(metrics.horizontalAdvance(QString::fromLatin1(widest)), list.countView->width());

    StarSysMask set(universe.CountItems(), false, 0);
    for (const int32_t count : { 285, 261533, 999999 }) {
        set.SetAll(false);
        for (int32_t i = 0; i < count; i++)
            set.SetStateSafe(i, true);
        Message message(kStarArrayMessage);
        message.AddPointer(kSystemArrayPtrString, &set);
        list.Pad("Equals")->MessageReceived(&message);
        const QString text = QString("Star Systems: %1").arg(count);
        ASSERT_EQ(list.countView->text(), text);
        EXPECT_EQ(DifferentPixels(DrawnCountLine(list), WholeCountLine(list, text)), 0) << count;
    }
    // The whole universe: NOT of an empty set, dropped on the pad.
    StarSysMask none(universe.CountItems(), false, 0);
    Message message(kStarArrayMessage);
    message.AddPointer(kSystemArrayPtrString, &none);
    list.Pad("NOT")->MessageReceived(&message);
    ASSERT_EQ(list.countView->text(), "Star Systems: 1000000");
    EXPECT_EQ(
        DifferentPixels(DrawnCountLine(list), WholeCountLine(list, "Star Systems: 1000000")), 0);
}

TEST_F(ListTest, AnEmptyListIsDraggedAndEmptiesAnotherList)
{
    auto empty = NewList();
    auto other = NewList();
    Drop(other->Pad("Plus"), SetMessage(Set({ 4, 5 })));
    const std::optional<CaughtDrag> drag = PressHandle(empty->starDragger);
    ASSERT_TRUE(drag.has_value());
    EXPECT_EQ(drag->message.what, kStarArrayMessage);
    EXPECT_EQ(drag->message.FindPointer(kSystemArrayPtrString), empty->Mask());
    EXPECT_EQ(drag->pixels, DragPicture(3));
    Drop(other->Pad("Equals"), drag->message);
    EXPECT_EQ(other->Count(), 0);
    EXPECT_EQ(other->countView->text(), "Star Systems: 0");

    // A query panel whose search finds nothing offers nothing to drag.
    NameQueryView panel(BRect(10, 10, 370, 60), "Name Query", &universe, nullptr);
    panel.starName->SetText("Nowhere");
    EXPECT_FALSE(PressHandle(panel.Dragger()).has_value());

    // A list of one system is dragged as that system.
    Drop(other->Pad("Plus"), SystemMessage(7));
    const std::optional<CaughtDrag> one = PressHandle(other->starDragger);
    ASSERT_TRUE(one.has_value());
    EXPECT_EQ(one->message.what, kStarMessage);
    EXPECT_EQ(one->message.FindInt32(kSystemIndexString), 7);
    EXPECT_EQ(one->pixels, DragPicture(2));
}

TEST_F(ListTest, SwitchingTheListOffAndOn)
{
    auto list = NewList();
    list->resize(231, 251);
    Drop(list->Pad("Plus"), SetMessage(Set({ 2, 3 })));
    list->showListBox->setChecked(false);
    DeliverPostedMessages();
    EXPECT_FALSE(list->ShowsList());
    EXPECT_EQ(list->height(), 69);
    EXPECT_EQ(list->minimumHeight(), 69);
    EXPECT_EQ(list->maximumHeight(), 69);
    EXPECT_FLOAT_EQ(list->savedHeight, 250);

    // While it is off, drops change the set and the count, not the list.
    Drop(list->Pad("Plus"), SetMessage(Set({ 9 })));
    EXPECT_EQ(list->countView->text(), "Star Systems: 3");
    EXPECT_EQ(list->listView->model()->rowCount(), 2);

    list->showListBox->setChecked(true);
    DeliverPostedMessages();
    EXPECT_TRUE(list->ShowsList());
    EXPECT_EQ(list->height(), 251);
    EXPECT_EQ(list->minimumHeight(), 121);
    EXPECT_EQ(list->listView->Model()->Systems(), std::vector<int32_t>({ 2, 3, 9 }));
}

TEST_F(ListTest, DraggingFromTheList)
{
    auto list = NewList();
    Drop(list->Pad("Plus"), SetMessage(Set({ 2, 5, 8, 11 })));
    StarListView* view = list->listView;
    std::optional<CaughtDrag> caught;
    view->SetDragStarter(CatchDrag(caught));
    EXPECT_EQ(view->ListToMaskIndex(0), 2);
    EXPECT_EQ(view->ListToMaskIndex(3), 11);
    EXPECT_EQ(view->ListToMaskIndex(4), -1);
    EXPECT_EQ(view->ListToMaskIndex(-1), -1);

    // Nothing selected: the row dragged from is selected and goes alone.
    view->InitiateDrag(1);
    ASSERT_TRUE(caught.has_value());
    EXPECT_EQ(caught->message.what, kStarMessage);
    EXPECT_EQ(caught->message.FindInt32(kSystemIndexString), 5);
    EXPECT_EQ(caught->pixels, DragPicture(2));
    EXPECT_TRUE(view->selectionModel()->isRowSelected(1));

    // Two selected, dragged from one of them: both, as a set.
    view->selectionModel()->select(view->model()->index(3, 0), QItemSelectionModel::Select);
    caught.reset();
    view->InitiateDrag(3);
    ASSERT_TRUE(caught.has_value());
    EXPECT_EQ(caught->message.what, kStarArrayMessage);
    const auto* set
        = static_cast<const StarSysMask*>(caught->message.FindPointer(kSystemArrayPtrString));
    ASSERT_NE(set, nullptr);
    EXPECT_NE(set, list->Mask());
    EXPECT_EQ(set->CountItems(true), 2);
    EXPECT_TRUE(set->GetStateSafe(5));
    EXPECT_TRUE(set->GetStateSafe(11));
    EXPECT_EQ(caught->pixels, DragPicture(3));

    // Dragged from an unselected row: that row alone.
    caught.reset();
    view->InitiateDrag(0);
    ASSERT_TRUE(caught.has_value());
    EXPECT_EQ(caught->message.what, kStarMessage);
    EXPECT_EQ(caught->message.FindInt32(kSystemIndexString), 2);

    // With the mouse: pressed on a row, moved out of the 6-pixel box.
    caught.reset();
    view->clearSelection();
    const QPoint row = view->visualRect(view->model()->index(2, 0)).center();
    QTest::mousePress(view->viewport(), Qt::LeftButton, Qt::NoModifier, row);
    QTest::mouseMove(view->viewport(), row + QPoint(3, 0));
    EXPECT_FALSE(caught.has_value());
    QMouseEvent move(QEvent::MouseMove, QPointF(row + QPoint(20, 0)),
        view->viewport()->mapToGlobal(QPointF(row + QPoint(20, 0))), Qt::NoButton, Qt::LeftButton,
        Qt::NoModifier);
    QCoreApplication::sendEvent(view->viewport(), &move);
    ASSERT_TRUE(caught.has_value());
    EXPECT_EQ(caught->message.FindInt32(kSystemIndexString), 8);
}

TEST_F(ListTest, SeveralSelectedRowsDraggedWithTheMouseGoTogether)
{
    auto list = NewList();
    Drop(list->Pad("Plus"), SetMessage(Set({ 2, 5, 8, 11, 14 })));
    StarListView* view = list->listView;
    QWidget* viewport = view->viewport();
    std::optional<CaughtDrag> caught;
    view->SetDragStarter(CatchDrag(caught));
    auto middle = [&](int row) { return view->visualRect(view->model()->index(row, 0)).center(); };
    // The pointer moves to where with the left button held.
    auto moveHeld = [&](QPoint where) {
        QMouseEvent move(QEvent::MouseMove, QPointF(where), viewport->mapToGlobal(QPointF(where)),
            Qt::NoButton, Qt::LeftButton, Qt::NoModifier);
        QCoreApplication::sendEvent(viewport, &move);
    };
    // Rows 1, 3 and 4 (systems 5, 11 and 14) picked with Ctrl.
    for (const int row : { 1, 3, 4 })
        QTest::mouseClick(viewport, Qt::LeftButton, Qt::ControlModifier, middle(row));
    auto selectedRows = [&] {
        std::vector<int> rows;
        for (const QModelIndex& item : view->selectionModel()->selectedRows())
            rows.push_back(item.row());
        std::sort(rows.begin(), rows.end());
        return rows;
    };
    ASSERT_EQ(selectedRows(), (std::vector<int> { 1, 3, 4 }));

    // Pressed on row 3, moved a pixel or two at a time inside the 6-pixel box, then out of it.
    const QPoint start = middle(3);
    QTest::mousePress(viewport, Qt::LeftButton, Qt::NoModifier, start);
    for (const QPoint step : { QPoint(1, 0), QPoint(2, 1), QPoint(4, 2), QPoint(5, 4), QPoint(6, 6),
             QPoint(3, -5), QPoint(-6, -6) }) {
        moveHeld(start + step);
        EXPECT_FALSE(caught.has_value()) << "inside the box at " << step.x() << ", " << step.y();
        EXPECT_EQ(selectedRows(), (std::vector<int> { 1, 3, 4 }));
    }
    moveHeld(start + QPoint(9, 7));
    ASSERT_TRUE(caught.has_value());
    QTest::mouseRelease(viewport, Qt::LeftButton, Qt::NoModifier, start + QPoint(9, 7));
    EXPECT_EQ(caught->message.what, kStarArrayMessage);
    EXPECT_EQ(caught->pixels, DragPicture(3));
    EXPECT_EQ(selectedRows(), (std::vector<int> { 1, 3, 4 })) << "the selection survives";

    // Dropped on another list's Equals pad: exactly the three selected systems.
    auto other = NewList();
    Drop(other->Pad("Equals"), caught->message);
    EXPECT_EQ(Members(*other), (std::vector<int32_t> { 5, 11, 14 }));

    // Pressed on a selected row and let go inside the box: a click, that row alone selected.
    caught.reset();
    QTest::mousePress(viewport, Qt::LeftButton, Qt::NoModifier, middle(4));
    moveHeld(middle(4) + QPoint(3, 3));
    QTest::mouseRelease(viewport, Qt::LeftButton, Qt::NoModifier, middle(4) + QPoint(3, 3));
    EXPECT_FALSE(caught.has_value());
    EXPECT_EQ(selectedRows(), (std::vector<int> { 4 }));
}

TEST_F(ListTest, PadsLightUpUnderADrag)
{
    auto list = NewList();
    DropPad* pad = list->Pad("AND");
    EXPECT_FALSE(pad->IsHighlighted());
    Message message = SetMessage(Set({ 1 }));
    MessageMimeData data(message);
    QDragEnterEvent enter(QPoint(4, 4), Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(pad, &enter);
    EXPECT_TRUE(enter.isAccepted());
    EXPECT_TRUE(pad->IsHighlighted());
    QDragLeaveEvent leave;
    QCoreApplication::sendEvent(pad, &leave);
    EXPECT_FALSE(pad->IsHighlighted());
    // Text from elsewhere is refused.
    QMimeData text;
    text.setText("S1");
    QDragEnterEvent foreign(QPoint(4, 4), Qt::CopyAction, &text, Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(pad, &foreign);
    EXPECT_FALSE(foreign.isAccepted());
    EXPECT_FALSE(pad->IsHighlighted());
}

TEST(ListFromControlWindow, TheListButtonOpensAStarList)
{
    ControlsOnTwoStars program;
    auto* list = program.Open<ListWindow>("New List Window Button");
    ASSERT_NE(list, nullptr);
    EXPECT_EQ(program.controls.OtherWindows().size(), 1);
    EXPECT_EQ(list->windowTitle(), "Star List");
    EXPECT_EQ(list->geometry(), QRect(140, 140, 231, 341));
    EXPECT_EQ(list->systemCount, 2);
    EXPECT_EQ(list->Pad("Plus")->IGetTarget(), program.controls.GetInfoView());
}
