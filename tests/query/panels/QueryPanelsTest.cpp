// The six query panels: their controls as a new panel shows them, the parameters they read,
// what pressing the handle drags, and what a system dropped on them fills in.
#include "PanelFixture.h"

#include "core/MessageCodes.h"
#include "platform/qt/MessageDrag.h"
#include "platform/qt/RecordingHandler.h"
#include "query/panels/DECQueryView.h"
#include "query/panels/DistQueryView.h"
#include "query/panels/MGQueryView.h"
#include "query/panels/NameQueryView.h"
#include "query/panels/PopUpMenuButton.h"
#include "query/panels/RAQueryView.h"
#include "query/panels/SCQueryView.h"
#include "query/panels/TextControl.h"
#include "widgets/InfoView.h"

#include <QDragEnterEvent>
#include <QDropEvent>
#include <QFontMetrics>
#include <QLabel>
#include <QMenu>
#include <cmath>

namespace {

constexpr double kTurn = 2 * 3.141592653589793;
const BRect kFrame(10, 10, 370, 60);

QStringList Items(const PopUpMenuButton* menu)
{
    QStringList items;
    for (int i = 0; i < menu->CountItems(); i++)
        items << menu->ItemText(i);
    return items;
}

// Chooses item index of menu as a user would: through the menu's own action.
void Choose(PopUpMenuButton* menu, int index)
{
    menu->Menu()->actions()[index]->trigger();
}

// Drops a one-system message for index on panel, at its middle, as a drag would end there.
bool DropSystem(StarQueryView* panel, int32_t index, uint32_t what = kStarMessage)
{
    Message message(what);
    message.AddInt32(kSystemIndexString, index);
    MessageMimeData data(message);
    const QPointF middle(panel->width() / 2.0, panel->height() / 2.0);
    QDragEnterEvent enter(middle.toPoint(), Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(panel, &enter);
    if (!enter.isAccepted())
        return false;
    QDropEvent drop(middle, Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(panel, &drop);
    return drop.isAccepted();
}

} // namespace

TEST_F(PanelTest, ANamePanelStartsWithTheSunByWholeName)
{
    NameQueryView panel(kFrame, "Name Query", &universe, nullptr);
    EXPECT_EQ(panel.objectName(), "Name Query");
    EXPECT_EQ(panel.title(), "Find by Name");
    EXPECT_EQ(panel.geometry(), QRect(10, 10, 361, 51));
    EXPECT_EQ(panel.queryType->objectName(), "Name Query TypeMB");
    EXPECT_EQ(panel.queryType->Menu()->objectName(), "Query Type");
    EXPECT_EQ(
        Items(panel.queryType), QStringList({ "Name is", "Name contains", "Name starts with" }));
    EXPECT_EQ(panel.queryType->MarkedIndex(), 0);
    EXPECT_EQ(panel.queryType->text(), "Name is");
    EXPECT_EQ(panel.starName->objectName(), "Star Name");
    EXPECT_STREQ(panel.starName->Text(), "The Sun");
    EXPECT_FALSE(panel.starName->Label()->isVisible());
    EXPECT_EQ(panel.GetSelectedItems(), 0);
    EXPECT_EQ(panel.Query()->QueryType(), kNameQueryType);
    EXPECT_STREQ(panel.IGetInfo(), "Drop stars here to copy to query");
    // The menu and the field in a row: the field 145 right of the menu.
    EXPECT_EQ(panel.queryType->x(), 10);
    EXPECT_EQ(panel.queryType->width(), 121);
    EXPECT_EQ(panel.starName->x(), 155);
    EXPECT_EQ(panel.starName->width(), 131);
}

TEST_F(PanelTest, TheSunByWholeNameDragsOneSystemWithTheSingleSystemPicture)
{
    NameQueryView panel(kFrame, "Name Query", &universe, nullptr);
    const std::optional<CaughtDrag> drag = PressHandle(&panel);
    ASSERT_TRUE(drag.has_value());
    EXPECT_EQ(drag->message.what, kStarMessage);
    EXPECT_EQ(drag->message.FindInt32(kSystemIndexString), sun);
    EXPECT_EQ(drag->pixels, DragPicture(2));
    EXPECT_NE(drag->pixels, DragPicture(3));
    EXPECT_EQ(drag->hotSpot.x, 1);
    EXPECT_EQ(drag->hotSpot.y, 1);
    EXPECT_EQ(panel.GetSelectedItems(), 1);
    EXPECT_EQ(panel.FindFirstSystem(), sun);
    EXPECT_EQ(panel.FindLastSystem(), sun);
}

TEST_F(PanelTest, SeveralSystemsDragTheResultSetWithTheSetPicture)
{
    NameQueryView panel(kFrame, "Name Query", &universe, nullptr);
    Choose(panel.queryType, kNameContains);
    panel.starName->SetText("I"); // any case: Sirius A, Sirius B, Tau Ceti, Altair
    const std::optional<CaughtDrag> drag = PressHandle(&panel);
    ASSERT_TRUE(drag.has_value());
    EXPECT_EQ(drag->message.what, kStarArrayMessage);
    const auto* carried
        = static_cast<const StarSysMask*>(drag->message.FindPointer(kSystemArrayPtrString));
    StarSysMask result(universe.CountItems(), false, 0);
    panel.GetMask(&result);
    ASSERT_NE(carried, nullptr);
    // The panel's own mask travels, holding the result.
    EXPECT_EQ(carried->CountItems(true), 3);
    for (int32_t i = 0; i < universe.CountItems(); i++) {
        const bool expected = i == sirius || i == tauCeti || i == altair;
        EXPECT_EQ(carried->GetStateSafe(i), expected) << i;
        EXPECT_EQ(result.GetStateSafe(i), expected) << i;
        EXPECT_EQ(panel.IsSystemSelected(i), expected) << i;
    }
    EXPECT_EQ(drag->pixels, DragPicture(3));
    EXPECT_EQ(panel.GetSelectedItems(), 3);
    EXPECT_EQ(panel.FindFirstSystem(), sirius);
    EXPECT_EQ(panel.FindLastSystem(), altair);

    // A later press with another text replaces the whole result.
    panel.starName->SetText("ceti");
    const std::optional<CaughtDrag> again = PressHandle(&panel);
    ASSERT_TRUE(again.has_value());
    EXPECT_EQ(again->message.what, kStarMessage);
    EXPECT_EQ(again->message.FindInt32(kSystemIndexString), tauCeti);
    EXPECT_FALSE(panel.IsSystemSelected(sirius));
}

TEST_F(PanelTest, AnEmptyResultStartsNoDrag)
{
    NameQueryView panel(kFrame, "Name Query", &universe, nullptr);
    panel.starName->SetText("Nowhere");
    EXPECT_FALSE(PressHandle(&panel).has_value());
    EXPECT_EQ(panel.GetSelectedItems(), 0);
    EXPECT_EQ(panel.FindFirstSystem(), -1);
    EXPECT_EQ(panel.FindLastSystem(), -1);
}

TEST_F(PanelTest, AnOverlongTextFindsNothingAndOverrunsNothing)
{
    NameQueryView panel(kFrame, "Name Query", &universe, nullptr);
    for (const int mode : { kNameIs, kNameContains, kNameStartsWith }) {
        Choose(panel.queryType, mode);
        panel.starName->SetText(std::string(5000, 'a').c_str());
        EXPECT_FALSE(PressHandle(&panel).has_value()) << mode;
        EXPECT_EQ(std::strlen(panel.param.text), size_t(StarNameQuery::kNameBufferSize) - 1);
        // Letters beyond one byte in UTF-8 are searched as their bytes.
        panel.starName->SetText(std::string(3000, 'e').append("\xc3\xa9").c_str());
        EXPECT_FALSE(PressHandle(&panel).has_value()) << mode;
    }
}

TEST_F(PanelTest, APanelKeepsItsQueryAcrossPresses)
{
    NameQueryView panel(kFrame, "Name Query", &universe, nullptr);
    const StarSysQuery* query = panel.Query();
    PressHandle(&panel);
    panel.starName->SetText("Altair");
    PressHandle(&panel);
    EXPECT_EQ(panel.Query(), query);
}

TEST_F(PanelTest, NamesAreSearchedWithoutRegardToCase)
{
    NameQueryView panel(kFrame, "Name Query", &universe, nullptr);
    panel.starName->SetText("the sun");
    const std::optional<CaughtDrag> drag = PressHandle(&panel);
    ASSERT_TRUE(drag.has_value());
    EXPECT_EQ(drag->message.FindInt32(kSystemIndexString), sun);
    const auto* param = static_cast<const NameQueryParam*>(panel.QueryParam());
    EXPECT_EQ(param, &panel.param);
    EXPECT_FALSE(param->caseSensitive);
    EXPECT_STREQ(param->text, "the sun");

    Choose(panel.queryType, kNameStartsWith);
    panel.starName->SetText("SIRIUS");
    const std::optional<CaughtDrag> starts = PressHandle(&panel);
    ASSERT_TRUE(starts.has_value());
    EXPECT_EQ(panel.param.mode, kNameStartsWith);
    EXPECT_EQ(starts->message.FindInt32(kSystemIndexString), sirius);
}

TEST_F(PanelTest, ANewSpectralClassPanelSearchesForG0)
{
    SCQueryView panel(kFrame, "SC Query", &universe, nullptr);
    EXPECT_EQ(panel.title(), "Find by Spectral Class");
    EXPECT_EQ(panel.starMode->objectName(), "star mode MB");
    EXPECT_EQ(panel.starMode->Menu()->objectName(), "Star Mode");
    EXPECT_EQ(Items(panel.starMode),
        QStringList({ "Any star in system", "First star in system", "First or second star" }));
    EXPECT_EQ(panel.modeMenu->objectName(), "mode MB");
    EXPECT_EQ(panel.modeMenu->Menu()->objectName(), "Mode Menu");
    EXPECT_EQ(Items(panel.modeMenu), QStringList({ "is", "is less than", "is greater than" }));
    EXPECT_EQ(panel.harvardClass->objectName(), "HC MB");
    EXPECT_EQ(panel.harvardClass->Menu()->objectName(), "Harvard Class Menu");
    EXPECT_EQ(Items(panel.harvardClass),
        QStringList({ "W", "O", "B", "A", "F", "G", "K", "M", "R", "N" }));
    EXPECT_EQ(panel.harvardClass->text(), "G");
    EXPECT_EQ(panel.decimalClass->objectName(), "DC MB");
    EXPECT_EQ(panel.decimalClass->Menu()->objectName(), "Decimal Class Menu");
    EXPECT_EQ(Items(panel.decimalClass),
        QStringList({ "0", "1", "2", "3", "4", "5", "6", "7", "8", "9" }));
    EXPECT_EQ(panel.decimalClass->text(), "0");
    EXPECT_EQ(panel.starMode->MarkedIndex(), 0);
    EXPECT_EQ(panel.modeMenu->MarkedIndex(), 0);
    // In a row: 140, 110 and 30 to the right of each other.
    EXPECT_EQ(panel.modeMenu->x(), 150);
    EXPECT_EQ(panel.harvardClass->x(), 260);
    EXPECT_EQ(panel.decimalClass->x(), 290);
    EXPECT_EQ(panel.decimalClass->width(), 26);

    // Only the G0 star: not the G2 Sun, nor the G8 Tau Ceti.
    const std::optional<CaughtDrag> drag = PressHandle(&panel);
    ASSERT_TRUE(drag.has_value());
    EXPECT_EQ(drag->message.what, kStarMessage);
    EXPECT_EQ(drag->message.FindInt32(kSystemIndexString), south);
    const auto* param = static_cast<const SCQueryParam*>(panel.QueryParam());
    EXPECT_EQ(param->spectralClass->GetHarvardClass(), kClassG);
    EXPECT_EQ(param->spectralClass->GetDecimalClass(), 0);
    EXPECT_EQ(param->mode, kQueryIs);
    EXPECT_EQ(param->starMode, kAnyStarInSystem);
}

TEST_F(PanelTest, TheSpectralClassMenusMakeTheClassAndTheModes)
{
    SCQueryView panel(kFrame, "SC Query", &universe, nullptr);
    Choose(panel.harvardClass, 3); // A
    Choose(panel.decimalClass, 5);
    Choose(panel.modeMenu, kQueryLessThan);
    Choose(panel.starMode, kFirstStarInSystem);
    EXPECT_EQ(panel.harvardClass->text(), "A");
    EXPECT_EQ(panel.decimalClass->text(), "5");
    // Earlier than A5 on the scale: A1 Sirius A; its white dwarf is not looked at.
    const std::optional<CaughtDrag> drag = PressHandle(&panel);
    ASSERT_TRUE(drag.has_value());
    EXPECT_EQ(drag->message.FindInt32(kSystemIndexString), sirius);
    EXPECT_DOUBLE_EQ(panel.spectralClass.SCToDouble(), 3.5);
    EXPECT_EQ(panel.param.starMode, kFirstStarInSystem);
    EXPECT_EQ(panel.param.mode, kQueryLessThan);
}

TEST_F(PanelTest, AMagnitudePanelReadsItsFieldAndMenus)
{
    MGQueryView panel(kFrame, "SC Query", &universe, nullptr);
    EXPECT_EQ(panel.title(), "Find by Absolute Magnitude");
    EXPECT_EQ(panel.magnitude->objectName(), "Magnitude");
    EXPECT_STREQ(panel.magnitude->Text(), "4.7");
    EXPECT_EQ(panel.magnitude->x(), 270);
    EXPECT_EQ(panel.magnitude->width(), 41);
    EXPECT_EQ(Items(panel.modeMenu), QStringList({ "is", "is less than", "is greater than" }));

    // 4.7 within 0.05: nobody; greater than 4.7: the Sun (4.83), Sirius (B at 11.3), Tau Ceti.
    EXPECT_FALSE(PressHandle(&panel).has_value());
    Choose(panel.modeMenu, kQueryGreaterThan);
    ASSERT_TRUE(PressHandle(&panel).has_value());
    EXPECT_EQ(panel.GetSelectedItems(), 3);
    EXPECT_TRUE(panel.IsSystemSelected(sirius));
    // The first star only: Sirius A at 1.43 is not fainter.
    Choose(panel.starMode, kFirstStarInSystem);
    ASSERT_TRUE(PressHandle(&panel).has_value());
    EXPECT_EQ(panel.GetSelectedItems(), 2);
    EXPECT_FALSE(panel.IsSystemSelected(sirius));

    // Text that is not a number reads as 0.
    panel.magnitude->SetText("bright");
    Choose(panel.modeMenu, kQueryLessThan);
    EXPECT_FALSE(PressHandle(&panel).has_value());
    EXPECT_EQ(panel.param.magnitude, 0);
    panel.magnitude->SetText("2.3e0");
    ASSERT_TRUE(PressHandle(&panel).has_value());
    EXPECT_EQ(panel.param.magnitude, 2.3);
    EXPECT_EQ(panel.GetSelectedItems(), 2); // Sirius A, Altair
}

TEST_F(PanelTest, RightAscensionIsTypedInHoursAndMinutes)
{
    RAQueryView panel(kFrame, "SC Query", &universe, nullptr);
    EXPECT_EQ(panel.title(), "Find by Right Ascension");
    EXPECT_EQ(panel.hours->objectName(), "Hours");
    EXPECT_EQ(panel.hours->Label()->text(), "h");
    EXPECT_EQ(panel.hours->Label()->width(), 10);
    EXPECT_STREQ(panel.hours->Text(), "0");
    EXPECT_EQ(panel.minutes->objectName(), "Minutes");
    EXPECT_EQ(panel.minutes->Label()->text(), "m");
    EXPECT_STREQ(panel.minutes->Text(), "0");
    EXPECT_EQ(panel.modeMenu->width(), 111);
    EXPECT_EQ(panel.hours->x(), 130);
    EXPECT_EQ(panel.minutes->x(), 185);

    panel.hours->SetText("23");
    panel.minutes->SetText("59");
    PressHandle(&panel);
    EXPECT_DOUBLE_EQ(panel.param.rightAscension, kTurn * (23.0 / 24 + 59.0 / 1440));
    EXPECT_EQ(panel.QueryParam(), &panel.param);
}

TEST_F(PanelTest, MinusZeroDegreesAndThirtyMinutesIsThirtyMinutesNorth)
{
    DECQueryView panel(kFrame, "SC Query", &universe, nullptr);
    EXPECT_EQ(panel.title(), "Find by Declination");
    EXPECT_EQ(panel.degrees->Label()->text(), "°");
    EXPECT_EQ(panel.minutes->Label()->text(), QString::fromUtf8("\u2018"));
    EXPECT_EQ(panel.degrees->objectName(), "Degrees");
    EXPECT_EQ(panel.minutes->objectName(), "Minutes");

    panel.degrees->SetText("-0");
    panel.minutes->SetText("30");
    PressHandle(&panel);
    EXPECT_DOUBLE_EQ(panel.param.declination, kTurn * 30 / 21600);

    // Below zero the minutes take the sign.
    panel.degrees->SetText("-16");
    panel.minutes->SetText("42");
    PressHandle(&panel);
    EXPECT_DOUBLE_EQ(panel.param.declination, kTurn * -16 / 360 + kTurn * -42 / 21600);
}

TEST_F(PanelTest, ANewDistancePanelMeasuresFromTheFirstSystem)
{
    DistQueryView panel(kFrame, "Dist Query", &universe, nullptr);
    EXPECT_EQ(panel.title(), "Find by Distance");
    EXPECT_EQ(panel.distance->objectName(), "Distance");
    EXPECT_STREQ(panel.distance->Text(), "10");
    EXPECT_EQ(panel.distance->x(), 130);
    EXPECT_EQ(panel.referenceLabel->objectName(), "Ref Sys");
    EXPECT_EQ(panel.referenceLabel->text(), "parsecs from The Sun");
    EXPECT_EQ(panel.referenceLabel->x(), 175);
    EXPECT_EQ(panel.referenceLabel->geometry().right(), 360 - 52);
    EXPECT_STREQ(panel.referenceLabel->IGetInfo(), "Drop system here to set reference system");
    EXPECT_EQ(panel.ReferenceSystem(), 0);

    Choose(panel.modeMenu, kQueryLessThan);
    panel.distance->SetText("4");
    ASSERT_TRUE(PressHandle(&panel).has_value());
    EXPECT_EQ(panel.param.referenceIndex, 0);
    EXPECT_EQ(panel.GetSelectedItems(), 3); // the Sun, Sirius, Tau Ceti

    panel.SetReferenceSystem(-1);
    EXPECT_EQ(panel.referenceLabel->text(), "parsecs from origin");
    ASSERT_TRUE(PressHandle(&panel).has_value());
    EXPECT_EQ(panel.GetSelectedItems(), 3);
}

TEST_F(PanelTest, DroppingAStarOnTheDistancePanelMakesItTheReference)
{
    DistQueryView panel(kFrame, "Dist Query", &universe, nullptr);
    panel.distance->SetText("3.5");
    ASSERT_TRUE(DropSystem(&panel, altair));
    EXPECT_EQ(panel.referenceLabel->text(), "parsecs from Altair");
    EXPECT_EQ(panel.ReferenceSystem(), altair);
    EXPECT_STREQ(panel.distance->Text(), "3.5");
    // Measured from Altair now: itself at 0, nothing else within 3.5 pc.
    Choose(panel.modeMenu, kQueryLessThan);
    const std::optional<CaughtDrag> drag = PressHandle(&panel);
    ASSERT_TRUE(drag.has_value());
    EXPECT_EQ(drag->message.FindInt32(kSystemIndexString), altair);
}

TEST_F(PanelTest, DroppedSystemsFillTheOtherPanels)
{
    NameQueryView name(kFrame, "Name Query", &universe, nullptr);
    ASSERT_TRUE(DropSystem(&name, tauCeti));
    EXPECT_STREQ(name.starName->Text(), "Tau Ceti");

    SCQueryView sc(kFrame, "SC Query", &universe, nullptr);
    ASSERT_TRUE(DropSystem(&sc, tauCeti)); // G8V
    EXPECT_EQ(sc.harvardClass->text(), "G");
    EXPECT_EQ(sc.decimalClass->text(), "8");
    ASSERT_TRUE(DropSystem(&sc, sirius)); // the first star's: A1
    EXPECT_EQ(sc.harvardClass->MarkedIndex(), kClassA);
    EXPECT_EQ(sc.decimalClass->MarkedIndex(), 1);

    MGQueryView mg(kFrame, "SC Query", &universe, nullptr);
    ASSERT_TRUE(DropSystem(&mg, tauCeti));
    EXPECT_STREQ(mg.magnitude->Text(), "5.7");

    // Sirius, at this test's rounded place: 6h 45.1m, -16 deg 43.5'.
    RAQueryView ra(kFrame, "SC Query", &universe, nullptr);
    ASSERT_TRUE(DropSystem(&ra, sirius));
    const double raHours = std::atan2(2.477, -0.494) / kTurn * 24;
    char expected[32];
    std::snprintf(expected, sizeof expected, "%.1f", (raHours - std::trunc(raHours)) * 60);
    EXPECT_STREQ(ra.hours->Text(), "6");
    EXPECT_STREQ(ra.minutes->Text(), expected);
    EXPECT_STREQ(ra.minutes->Text(), "45.1");

    DECQueryView dec(kFrame, "SC Query", &universe, nullptr);
    ASSERT_TRUE(DropSystem(&dec, sirius));
    const double unitY = -0.759 / std::sqrt(0.494 * 0.494 + 0.759 * 0.759 + 2.477 * 2.477);
    const double decDegrees = std::asin(unitY) / kTurn * 360;
    std::snprintf(expected, sizeof expected, "%.1f", (std::trunc(decDegrees) - decDegrees) * 60);
    EXPECT_STREQ(dec.degrees->Text(), "-16");
    EXPECT_STREQ(dec.minutes->Text(), expected);
    EXPECT_STREQ(dec.minutes->Text(), "43.5");
    // A system to the north gets its sign too.
    ASSERT_TRUE(DropSystem(&dec, altair));
    EXPECT_STREQ(dec.degrees->Text(), "+9");
    // The Sun has no direction: the fields stay.
    ASSERT_TRUE(DropSystem(&dec, sun));
    EXPECT_STREQ(dec.degrees->Text(), "+9");

    // What a panel fills in finds the system again.
    ASSERT_TRUE(DropSystem(&ra, altair));
    ASSERT_TRUE(PressHandle(&ra).has_value());
    EXPECT_TRUE(ra.IsSystemSelected(altair));
}

TEST_F(PanelTest, OnlySingleSystemsAreTakenFromDrops)
{
    NameQueryView panel(kFrame, "Name Query", &universe, nullptr);
    // A set is refused when it arrives.
    EXPECT_FALSE(DropSystem(&panel, sirius, kStarArrayMessage));
    // A negative index, or one past the universe, is ignored.
    Message none(kStarMessage);
    none.AddInt32(kSystemIndexString, -1);
    panel.MessageReceived(&none);
    Message past(kStarMessage);
    past.AddInt32(kSystemIndexString, universe.CountItems());
    panel.MessageReceived(&past);
    EXPECT_STREQ(panel.starName->Text(), "The Sun");
    // A foreign drop (text) is refused.
    QMimeData text;
    text.setText("Sirius");
    QDragEnterEvent enter(QPoint(20, 20), Qt::CopyAction, &text, Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(&panel, &enter);
    EXPECT_FALSE(enter.isAccepted());
}

TEST_F(PanelTest, TheHandleSitsAtTheRightEdgeAndExplainsItself)
{
    RecordingHandler help;
    NameQueryView panel(kFrame, "Name Query", &universe, &help);
    panel.ISetTarget(&help);
    QueryDragger* handle = panel.Dragger();
    // 38 in from the right edge, on the row of the controls, inside the box.
    EXPECT_EQ(handle->x(), 360 - 38);
    EXPECT_EQ(handle->size(), QSize(32, 32));
    EXPECT_LE(
        std::abs(handle->geometry().center().y() - panel.queryType->geometry().center().y()), 1);
    EXPECT_GE(handle->y(), 0);
    EXPECT_LE(handle->geometry().bottom(), panel.height() - 1);
    EXPECT_STREQ(handle->IGetInfo(), "Drag this to another view to find stars");
    EXPECT_EQ(handle->IGetTarget(), &help);
    EXPECT_EQ(Pixels(*handle->Icon()), DragPicture(3));

    // Over the panel, then the handle (framed), then out of it again.
    QEnterEvent enterPanel(QPointF(2, 2), QPointF(2, 2), QPointF(2, 2));
    QCoreApplication::sendEvent(&panel, &enterPanel);
    QEnterEvent enterHandle(QPointF(2, 2), QPointF(2, 2), QPointF(2, 2));
    QCoreApplication::sendEvent(handle, &enterHandle);
    EXPECT_TRUE(handle->IsHighlighted());
    const QImage framed = handle->grab().toImage();
    QEvent leave(QEvent::Leave);
    QCoreApplication::sendEvent(handle, &leave);
    EXPECT_FALSE(handle->IsHighlighted());
    const QImage plain = handle->grab().toImage();
    EXPECT_NE(framed.pixel(0, 0), plain.pixel(0, 0));
    EXPECT_EQ(framed.pixel(0, 0), handle->palette().color(QPalette::WindowText).rgb());
    DeliverPostedMessages();

    ASSERT_GE(help.received.size(), 3u);
    EXPECT_EQ(help.received[0].what, kInfoMessage);
    EXPECT_STREQ(help.received[0].FindString(kInfoStringField), "Drop stars here to copy to query");
    EXPECT_EQ(help.received[1].what, kInfoMessage);
    EXPECT_STREQ(
        help.received[1].FindString(kInfoStringField), "Drag this to another view to find stars");
    EXPECT_EQ(help.received[2].what, kClearInfoMessage);
}

namespace {

// The help line of the control window, as wide as it is there, that a panel sends its help to.
class HelpLine {
public:
    HelpLine() { line.ISetTarget(&line); }

    // What the line shows once the posted help has arrived, checked against the pixels of a
    // line that was given that text directly, and that the text fits the line.
    std::string Shown()
    {
        DeliverPostedMessages();
        const QString text = line.text();
        InfoView drawn(BRect(2, 32, 317, 44), "Drawn", "");
        drawn.setText(text);
        EXPECT_EQ(line.grab().toImage(), drawn.grab().toImage());
        EXPECT_LE(QFontMetrics(line.font()).horizontalAdvance(text), line.width())
            << text.toStdString();
        return text.toStdString();
    }

    InfoView line { BRect(2, 32, 317, 44), "Info View", "" };
};

} // namespace

TEST_F(PanelTest, APressOfTheHandleSaysHowManySystemsItFound)
{
    HelpLine help;
    NameQueryView panel(kFrame, "Name Query", &universe, nullptr);
    panel.ISetTarget(&help.line);

    panel.starName->SetText("Nowhere");
    EXPECT_FALSE(PressHandle(&panel).has_value());
    EXPECT_EQ(help.Shown(), "No star systems found");

    panel.starName->SetText("the sun");
    EXPECT_TRUE(PressHandle(&panel).has_value());
    EXPECT_EQ(help.Shown(), "1 star system found");

    Choose(panel.queryType, 1); // contains
    panel.starName->SetText("i");
    EXPECT_TRUE(PressHandle(&panel).has_value());
    ASSERT_GE(panel.GetSelectedItems(), 2);
    EXPECT_EQ(help.Shown(), std::to_string(panel.GetSelectedItems()) + " star systems found");

    // The handle's own help is still what it shows when the mouse next comes over it.
    EXPECT_STREQ(panel.Dragger()->IGetInfo(), "Drag this to another view to find stars");
    Enter(panel.Dragger());
    EXPECT_EQ(help.Shown(), "Drag this to another view to find stars");
}

TEST_F(PanelTest, AResultLetGoOverItsOwnPanelChangesNothing)
{
    NameQueryView panel(kFrame, "Name Query", &universe, nullptr);
    panel.show();
    Choose(panel.queryType, 2); // starts with
    panel.starName->SetText("siri");
    // The drag, while it runs: the pointer goes from the handle over the panel's controls in
    // small steps and the button is let go there, the panel hearing what a drag tells a view
    // it passes over.
    bool entered = true, moved = true, dropped = true;
    std::optional<Message> carried;
    QueryDragger* handle = panel.Dragger();
    handle->SetDragStarter([&](const Message& message, RBitmap8*, BPoint) {
        carried = message;
        MessageMimeData data(message);
        QPoint at = handle->geometry().center();
        QDragEnterEvent enter(at, Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
        QCoreApplication::sendEvent(&panel, &enter);
        entered = enter.isAccepted();
        for (int step = 0; step < 10; step++) {
            at -= QPoint(12, step % 2);
            QDragMoveEvent move(at, Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
            QCoreApplication::sendEvent(&panel, &move);
            moved = moved && move.isAccepted();
        }
        QDropEvent drop(QPointF(at), Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
        QCoreApplication::sendEvent(&panel, &drop);
        dropped = drop.isAccepted();
    });
    PressMouse(handle, QPoint(5, 5));
    ASSERT_TRUE(carried.has_value());
    EXPECT_EQ(carried->what, kStarMessage);
    EXPECT_EQ(carried->FindInt32(kSystemIndexString), sirius);
    EXPECT_FALSE(entered);
    EXPECT_FALSE(moved);
    EXPECT_FALSE(dropped);
    // Not rewritten to "Sirius A", the name of the system found.
    EXPECT_STREQ(panel.starName->Text(), "siri");
    EXPECT_EQ(panel.queryType->MarkedIndex(), 2);

    // Once that drag is over, a system dragged from elsewhere is taken again.
    ASSERT_TRUE(DropSystem(&panel, tauCeti));
    EXPECT_STREQ(panel.starName->Text(), "Tau Ceti");
}
