// The star information terminal, driven without its thread: the headers, filling the two slots by
// message and by drop, what is typed where, what is retyped when, dragging systems out and the
// help line for the half under the mouse.
#include "CommaLocale.h"
#include "ViewMessages.h"
#include "info/StarInfoScreen.h"
#include "query/UniverseBuilder.h"

#include "catalog/Star.h"
#include "core/MessageCodes.h"
#include "info/StarIView.h"
#include "platform/qt/RecordingHandler.h"
#include "query/StarSysMask.h"
#include "resources/ResourceData.h"
#include "widgets/WidgetEvents.h"

#include <QCoreApplication>
#include <QDropEvent>
#include <QMouseEvent>
#include <cmath>
#include <gtest/gtest.h>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace {

constexpr double kPi = 3.14159265358979323846;

// The screen as the headers leave it, row by row; tab stops every four columns put the column
// titles at 28 and 40.
std::string HeaderRow(int32_t row)
{
    switch (row) {
    case 0:
        return RowOf({ { 0, "STAR 1" }, { 28, "SPECTRAL" }, { 40, "VISUAL" } });
    case 1:
        return RowOf({ { 0, "NAME" }, { 28, "CLASS" }, { 40, "LUMINOSITY" } });
    case 2:
    case 10:
        return " A:";
    case 3:
    case 11:
        return " B:";
    case 4:
    case 12:
        return " C:";
    case 6:
        return "  DISTANCE:";
    case 8:
        return RowOf({ { 0, "STAR 2" }, { 28, "SPECTRAL" }, { 40, "R ASCENSION" } });
    case 9:
        return RowOf({ { 0, "NAME" }, { 28, "CLASS" }, { 40, "DECLINATION" } });
    default:
        return "";
    }
}

// What the Star 1 block shows of a star: magnitude and class, luminosity in Suns (the Sun's
// absolute magnitude taken as 4.7), each cut to ten characters.
std::string ClassText(const Star* star)
{
    return Format("%.1f %s", star->GetMagnitude(), star->GetSpectralClassString()).substr(0, 10);
}
std::string LuminosityText(const Star* star)
{
    return Format("%f", std::pow(2.512, 4.7 - star->GetMagnitude())).substr(0, 10);
}

class StarIViewTest : public ::testing::Test {
protected:
    static void SetUpTestSuite() { InitResources(); }

    void SetUp() override
    {
        sun = AddTestSystem(universe, 0, 0, 0, { { "The Sun", "G2V", 4.83 } });
        sirius = AddTestSystem(universe, -0.494, -0.759, 2.477,
            { { "Sirius", "A1V", 1.43 }, { "Sirius B", "DA2", 11.3 } });
        // Ten parsecs apart: (6, -4.8, 6.4) from one to the other.
        near = AddTestSystem(universe, 1, 2, 3, { { "Solar Twin", "G2V", 4.7 } });
        far = AddTestSystem(universe, 7, -2.8, 9.4,
            { { "Ten Away", "A1V", 1.43 }, { "Ten Away B", "G5V", 5.12 },
                { "Ten Away C", "M4V", 12.33 } });
        quad = AddTestSystem(universe, 20, 0, 0,
            { { "Member 1", "K0V", 5.9 }, { "Member 2", "K1V", 6.1 }, { "Member 3", "K2V", 6.3 },
                { "Member 4", "K3V", 6.6 } });
        five = AddTestSystem(universe, 0, 20, 0,
            { { "Member 1", "M0V", 8.9 }, { "Member 2", "M1V", 9.6 }, { "Member 3", "M2V", 10.3 },
                { "Member 4", "M3V", 11.2 }, { "Member 5", "M4V", 12.8 } });
        view = std::make_unique<StarIView>(BPoint(0, 0), "Star Info View");
        view->ISetTarget(&help);
        view->SetDragStarter(CatchDrag(caught));
    }

    void SendUniverse() { HandUniverse(*view, &universe); }

    // A 'StaR' that was not dropped.
    void Send(int32_t index) { HandSystem(*view, index); }

    // A 'StaR' let go at where (view coordinates).
    void Drop(int32_t index, QPoint where)
    {
        Message message(kStarMessage);
        message.AddInt32(kSystemIndexString, index);
        const QPoint screen = view->mapToGlobal(where);
        message.SetDropped(BPoint(float(screen.x()), float(screen.y())));
        view->MessageReceived(&message);
    }
    void DropUpper(int32_t index) { Drop(index, QPoint(100, 30)); }
    void DropLower(int32_t index) { Drop(index, QPoint(100, 150)); }

    void MoveTo(QPoint where) { MoveMouse(view.get(), where); }

    void PressAt(QPoint where)
    {
        caught.reset();
        PressMouse(view.get(), where);
    }

    void ExpectHeadersOnly()
    {
        for (int32_t row = 0; row < view->Rows(); row++)
            EXPECT_EQ(ScreenRow(*view, row), HeaderRow(row)) << "row " << row;
    }

    // The Star 1 block's row for member i of system.
    std::string Star1Row(int32_t system, int32_t i)
    {
        const Star* star = universe.SystemAt(system)->StarAt(i);
        return RowOf({ { 0, HeaderRow(2 + i) }, { 4, std::string(star->GetName()).substr(0, 23) },
            { 28, ClassText(star) }, { 40, LuminosityText(star) } });
    }

    // The distance in parsecs between two systems, from their positions.
    double Distance(int32_t a, int32_t b)
    {
        const SVector& p = universe.SystemAt(a)->position;
        const SVector& q = universe.SystemAt(b)->position;
        return std::sqrt(
            (q.x - p.x) * (q.x - p.x) + (q.y - p.y) * (q.y - p.y) + (q.z - p.z) * (q.z - p.z));
    }

    // Rows 10 to 12 and the distance are as the headers left them.
    void ExpectNoStar2()
    {
        EXPECT_EQ(ScreenRow(*view, 6), HeaderRow(6));
        for (int32_t row = 10; row <= 12; row++)
            EXPECT_EQ(ScreenRow(*view, row), HeaderRow(row)) << "row " << row;
    }

    Universe universe { 20 };
    int32_t sun = 0, sirius = 0, near = 0, far = 0, quad = 0, five = 0;
    RecordingHandler help;
    std::unique_ptr<StarIView> view;
    std::optional<CaughtDrag> caught;
};

} // namespace

TEST_F(StarIViewTest, TheScreenIsBlankUntilTheUniverseArrivesWithTheHeaders)
{
    EXPECT_EQ(view->Cols(), 52);
    EXPECT_EQ(view->Rows(), 13);
    EXPECT_EQ(view->geometry(), QRect(0, 0, 365, 186));
    EXPECT_EQ(view->objectName(), "Star Info View");
    EXPECT_EQ(view->Index1(), -1);
    EXPECT_EQ(view->Index2(), -1);
    EXPECT_EQ(view->Systems(), nullptr);
    EXPECT_EQ(view->PendingBytes(), 0);
    TypeAll(*view);
    for (int32_t row = 0; row < view->Rows(); row++)
        EXPECT_EQ(ScreenRow(*view, row), "") << "row " << row;

    SendUniverse();
    EXPECT_EQ(view->Systems(), &universe);
    EXPECT_EQ(view->Count(), universe.CountItems());
    // Typed at 60 characters a second, the trail 16 steps long and fading 60 steps a second.
    EXPECT_EQ(view->FollowLength(), 16);
    EXPECT_EQ(view->DecayDelay(), 1000000 / 60);
    TypeAll(*view);
    EXPECT_EQ(view->CharDelay(), 1000000 / 60);
    ExpectHeadersOnly();
    EXPECT_EQ(ScreenRow(*view, 0).find("SPECTRAL"), 28u);
    EXPECT_EQ(ScreenRow(*view, 0).find("VISUAL"), 40u);
    EXPECT_EQ(ScreenRow(*view, 9).find("DECLINATION"), 40u);
    // Everything was freshly typed, and the last row ends without a new line: no scroll.
    EXPECT_EQ(view->IntensityAt(0, 0), view->FollowLength() + 1);
    EXPECT_EQ(view->IntensityAt(12, 2), view->FollowLength() + 1);
    EXPECT_EQ(view->CursorRow(), 12);
    EXPECT_EQ(view->CursorCol(), 3);
}

TEST_F(StarIViewTest, ANewUniversePointerResetsTheScreenAndDropsWhatWasStillToBeTyped)
{
    SendUniverse();
    DropUpper(sirius);
    DropLower(far);
    TypeAll(*view);
    ASSERT_NE(ScreenRow(*view, 2), HeaderRow(2));
    DropLower(near); // queued, not typed yet
    ASSERT_GT(view->PendingBytes(), 0);
    SendUniverse();
    TypeAll(*view);
    ExpectHeadersOnly();
    // The slots are not emptied: the screen only.
    EXPECT_EQ(view->Index1(), sirius);
    EXPECT_EQ(view->Index2(), near);
}

TEST_F(StarIViewTest, NegativeIndicesAndMessagesTheViewDoesNotFollowTypeNothing)
{
    SendUniverse();
    TypeAll(*view);
    Send(-1);
    Drop(-7, QPoint(100, 150));
    // Past the end of the universe there is no system either.
    Send(universe.CountItems());
    Message selection(kStarInfoBroadcast);
    selection.AddInt32(kSISelectionIndexString, sirius);
    view->MessageReceived(&selection);
    StarSysMask set(universe.CountItems(), true, 0);
    Message array(kStarArrayMessage);
    array.AddPointer(kSystemArrayPtrString, &set);
    view->MessageReceived(&array);
    EXPECT_EQ(view->PendingBytes(), 0);
    EXPECT_EQ(view->Index1(), -1);
    EXPECT_EQ(view->Index2(), -1);
    ExpectHeadersOnly();
}

TEST_F(StarIViewTest, NothingIsShownBeforeTheUniverseArrives)
{
    Send(sirius);
    EXPECT_EQ(view->Index1(), -1);
    EXPECT_EQ(view->PendingBytes(), 0);
}

TEST_F(StarIViewTest, TheFirstDropOnTheLowerHalfFillsTheStar1Block)
{
    SendUniverse();
    DropLower(sirius);
    EXPECT_EQ(view->Index1(), sirius);
    EXPECT_EQ(view->System1(), universe.SystemAt(sirius));
    EXPECT_EQ(view->Index2(), -1);
    EXPECT_EQ(view->System2(), nullptr);
    EXPECT_EQ(view->LastShown1(), universe.SystemAt(sirius));
    TypeAll(*view);
    EXPECT_EQ(ScreenRow(*view, 2), Star1Row(sirius, 0));
    EXPECT_EQ(ScreenRow(*view, 3), Star1Row(sirius, 1));
    EXPECT_EQ(ScreenRow(*view, 4), HeaderRow(4));
    ExpectNoStar2();
}

TEST_F(StarIViewTest, AMessageThatWasNotDroppedGoesToSlot1)
{
    SendUniverse();
    Send(sirius);
    Send(far);
    EXPECT_EQ(view->Index1(), far);
    EXPECT_EQ(view->Index2(), -1);
}

TEST_F(StarIViewTest, DropsOnEachHalfByDragAndDrop)
{
    SendUniverse();
    const auto dropAt = [this](int32_t index, QPoint where) {
        Message star(kStarMessage);
        star.AddInt32(kSystemIndexString, index);
        MessageMimeData data(star);
        QDragEnterEvent enter(where, Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
        QCoreApplication::sendEvent(view.get(), &enter);
        EXPECT_TRUE(enter.isAccepted());
        QDropEvent drop(QPointF(where), Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
        QCoreApplication::sendEvent(view.get(), &drop);
        EXPECT_TRUE(drop.isAccepted());
    };
    // The last row of the upper half, then the first of the lower.
    dropAt(sirius, QPoint(50, StarIView::kHalfBoundary - 1));
    dropAt(near, QPoint(50, StarIView::kHalfBoundary - 1));
    EXPECT_EQ(view->Index1(), near);
    EXPECT_EQ(view->Index2(), -1);
    dropAt(far, QPoint(300, StarIView::kHalfBoundary));
    EXPECT_EQ(view->Index1(), near);
    EXPECT_EQ(view->Index2(), far);
    TypeAll(*view);
    EXPECT_EQ(ScreenRow(*view, 2), Star1Row(near, 0));
    EXPECT_EQ(ScreenText(*view, 10, 4, 23), "Ten Away");

    // Text from another program is refused.
    QMimeData text;
    text.setText("Vega");
    QDragEnterEvent foreign(QPoint(50, 50), Qt::CopyAction, &text, Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(view.get(), &foreign);
    EXPECT_FALSE(foreign.isAccepted());
}

TEST_F(StarIViewTest, TwoSystemsTenParsecsApart)
{
    SendUniverse();
    DropUpper(near);
    DropLower(far);
    TypeAll(*view);
    const double d = Distance(near, far);
    ASSERT_NEAR(d, 10.0, 1e-9);
    EXPECT_EQ(ScreenRow(*view, 6),
        RowOf({ { 0, HeaderRow(6) },
            { 12, Format("%.2f parsecs ( %.2f light-years )", d, d * 3.26) } }));
    EXPECT_EQ(ScreenText(*view, 6, 12, 40), "10.00 parsecs ( 32.60 light-years )");

    // At 10 parsecs a star shows its absolute magnitude.
    const StarSystem* system = universe.SystemAt(far);
    for (int32_t i = 0; i < 3; i++) {
        const Star* star = system->StarAt(i);
        EXPECT_EQ(ScreenText(*view, 10 + i, 4, 23), star->GetName());
        EXPECT_EQ(ScreenText(*view, 10 + i, 28, 10), ClassText(star)) << star->GetName();
    }
    EXPECT_EQ(ScreenText(*view, 11, 28, 10), "5.1 G5V");

    // Its direction from the first, with x toward 0 h, z toward 6 h and y toward the north
    // celestial pole.
    const SVector& from = universe.SystemAt(near)->position;
    const SVector& to = system->position;
    const double dx = to.x - from.x, dy = to.y - from.y, dz = to.z - from.z;
    double ra = std::atan2(dz, dx);
    if (ra < 0)
        ra += 2 * kPi;
    const double hours = ra * 12 / kPi;
    const double declination = std::asin(dy / d) * 180 / kPi;
    const double wholeHours = std::floor(hours);
    const double wholeDegrees = std::trunc(declination);
    EXPECT_EQ(ScreenText(*view, 10, 41, 3), Format("%.0fh", wholeHours));
    EXPECT_EQ(ScreenText(*view, 10, 45, 5), Format("%.1fm", (hours - wholeHours) * 60));
    EXPECT_EQ(ScreenText(*view, 11, 40, 4), Format("%+.0fd", wholeDegrees));
    EXPECT_EQ(
        ScreenText(*view, 11, 45, 5), Format("%.1f'", std::abs(declination - wholeDegrees) * 60));
    // 46.8 degrees from 0 h toward 6 h, 28.7 degrees south.
    EXPECT_EQ(ScreenText(*view, 10, 41, 11), "3h  7.4m");
    EXPECT_EQ(ScreenText(*view, 11, 40, 12), "-28d 41.1'");
}

TEST_F(StarIViewTest, AStarOfMagnitude4Point7ShinesLikeTheSun)
{
    SendUniverse();
    DropUpper(near);
    TypeAll(*view);
    EXPECT_EQ(ScreenText(*view, 2, 40, 12), "1.000000");
    EXPECT_EQ(ScreenRow(*view, 2), Star1Row(near, 0));
    // Each magnitude brighter is 2.512 times as luminous.
    DropUpper(far);
    TypeAll(*view);
    EXPECT_EQ(ScreenRow(*view, 2), Star1Row(far, 0));
    EXPECT_EQ(ScreenRow(*view, 3), Star1Row(far, 1));
    EXPECT_EQ(ScreenRow(*view, 4), Star1Row(far, 2));
    EXPECT_NEAR(std::stod(ScreenText(*view, 2, 40, 10)), std::pow(10.0, 0.4 * (4.7 - 1.43)), 0.05);
}

TEST_F(StarIViewTest, TheSameSystemInBothHalvesLeavesSlot2Empty)
{
    SendUniverse();
    DropUpper(near);
    DropLower(far);
    TypeAll(*view);
    ASSERT_NE(ScreenRow(*view, 6), HeaderRow(6));
    ASSERT_NE(ScreenRow(*view, 10), HeaderRow(10));

    DropLower(near);
    EXPECT_EQ(view->Index2(), -1);
    EXPECT_EQ(view->System2(), nullptr);
    EXPECT_EQ(view->Index1(), near);
    TypeAll(*view);
    ExpectNoStar2();
    EXPECT_EQ(ScreenRow(*view, 2), Star1Row(near, 0));

    // The same from the other side: slot 1 given the system slot 2 holds.
    DropLower(far);
    TypeAll(*view);
    ASSERT_EQ(view->Index2(), far);
    DropUpper(far);
    EXPECT_EQ(view->Index1(), far);
    EXPECT_EQ(view->Index2(), -1);
    TypeAll(*view);
    ExpectNoStar2();
    for (int32_t i = 0; i < 3; i++)
        EXPECT_EQ(ScreenRow(*view, 2 + i), Star1Row(far, i));
}

TEST_F(StarIViewTest, TheStar1BlockIsRetypedOnlyWhenSystem1Changes)
{
    SendUniverse();
    DropUpper(near);
    DropLower(far);
    TypeAll(*view);
    const int32_t fresh = view->FollowLength() + 1;
    // Settle every trail: a retyped cell glows again, one left alone stays at 0.
    view->Fade(255);
    ASSERT_EQ(view->IntensityAt(2, 4), 0);

    DropLower(sirius);
    TypeAll(*view);
    EXPECT_EQ(view->IntensityAt(2, 4), 0) << "the Star 1 block was retyped";
    EXPECT_EQ(view->IntensityAt(2, 28), 0);
    // The distance and the Star 2 block are retyped on every drop.
    EXPECT_EQ(view->IntensityAt(6, 12), fresh);
    EXPECT_EQ(view->IntensityAt(10, 4), fresh);
    EXPECT_EQ(ScreenText(*view, 10, 4, 23), "Sirius");
    EXPECT_EQ(ScreenText(*view, 11, 4, 23), "Sirius B");
    // Sirius has two members: the third row of the block was cleared.
    EXPECT_EQ(ScreenRow(*view, 12), HeaderRow(12));

    // The same system dropped on the upper half again changes nothing in its block.
    view->Fade(255);
    DropUpper(near);
    TypeAll(*view);
    EXPECT_EQ(view->IntensityAt(2, 4), 0);
    EXPECT_EQ(view->IntensityAt(10, 4), fresh);

    // Another one does.
    view->Fade(255);
    DropUpper(sun);
    TypeAll(*view);
    EXPECT_EQ(view->IntensityAt(2, 4), fresh);
    EXPECT_EQ(ScreenRow(*view, 2), Star1Row(sun, 0));
    EXPECT_EQ(view->LastShown1(), universe.SystemAt(sun));
    EXPECT_EQ(ScreenText(*view, 6, 12, 40),
        Format("%.2f parsecs ( %.2f light-years )", Distance(sun, sirius),
            Distance(sun, sirius) * 3.26));
}

TEST_F(StarIViewTest, LongTextsAreCut)
{
    const int32_t giant = AddTestSystem(
        universe, 12000, 0, 0, { { "Aldebaranius Maximilianus Secundus", "K1.5III", -10.5 } });
    SendUniverse();
    DropUpper(giant);
    DropLower(sun);
    TypeAll(*view);
    const Star* star = universe.SystemAt(giant)->StarAt(0);
    const std::string name = star->GetName();
    ASSERT_GT(name.size(), 23u);
    EXPECT_EQ(ScreenText(*view, 2, 4, 24), name.substr(0, 23));
    EXPECT_EQ(view->CharAt(2, 27), 0) << "the name runs into the class";
    const std::string magnitudeAndClass = Format("%.1f %s", -10.5, "K1.5III");
    ASSERT_GT(magnitudeAndClass.size(), 10u);
    EXPECT_EQ(ScreenText(*view, 2, 28, 12), magnitudeAndClass.substr(0, 10));
    const std::string luminosity = Format("%f", std::pow(2.512, 4.7 + 10.5));
    ASSERT_GT(luminosity.size(), 10u);
    EXPECT_EQ(ScreenText(*view, 2, 40, 12), luminosity.substr(0, 10));

    const double d = Distance(giant, sun);
    const std::string distance = Format("%.2f parsecs ( %.2f light-years )", d, d * 3.26);
    ASSERT_GT(distance.size(), 35u);
    EXPECT_EQ(ScreenText(*view, 6, 12, 40), distance.substr(0, 35));

    // The other way round: the giant's apparent magnitude, seen from the Sun.
    DropUpper(sun);
    DropLower(giant);
    ASSERT_EQ(view->Index2(), giant);
    TypeAll(*view);
    EXPECT_EQ(ScreenText(*view, 10, 4, 24), name.substr(0, 23));
    EXPECT_EQ(ScreenText(*view, 10, 28, 12),
        Format("%.1f %s", -10.5 + 5 * std::log10(d / 10), "K1.5III").substr(0, 10));
}

TEST_F(StarIViewTest, MoreThanThreeMembersListTheFirstThreeAndCountTheRest)
{
    SendUniverse();
    DropUpper(five);
    TypeAll(*view);
    const Star* third = universe.SystemAt(five)->StarAt(2);
    EXPECT_EQ(ScreenRow(*view, 2), Star1Row(five, 0));
    EXPECT_EQ(ScreenRow(*view, 3), Star1Row(five, 1));
    EXPECT_EQ(ScreenRow(*view, 4),
        RowOf({ { 0, " C:" }, { 4, "Member 3  +2" }, { 28, ClassText(third) },
            { 40, LuminosityText(third) } }));
    // Nothing typed below the block, and the headers stand where they were.
    for (int32_t row : { 0, 1, 5, 6, 7, 8, 9, 10, 11, 12 })
        EXPECT_EQ(ScreenRow(*view, row), HeaderRow(row)) << "row " << row;

    // Four members in the Star 2 block: three rows and one more, nothing scrolls.
    DropLower(quad);
    TypeAll(*view);
    const double d = Distance(five, quad);
    const auto apparent = [&](int32_t i) {
        const Star* star = universe.SystemAt(quad)->StarAt(i);
        return Format("%.1f %s", star->GetMagnitude() + 5 * std::log10(d / 10),
            star->GetSpectralClassString());
    };
    const std::string star1Third = ScreenRow(*view, 4);
    EXPECT_EQ(star1Third,
        RowOf({ { 0, " C:" }, { 4, "Member 3  +2" }, { 28, ClassText(third) },
            { 40, LuminosityText(third) } }));
    for (int32_t row : { 0, 1 })
        EXPECT_EQ(ScreenRow(*view, row), HeaderRow(row)) << "row " << row;
    EXPECT_EQ(ScreenRow(*view, 2), Star1Row(five, 0));
    EXPECT_EQ(ScreenRow(*view, 3), Star1Row(five, 1));
    for (int32_t row : { 5, 7, 8, 9 })
        EXPECT_EQ(ScreenRow(*view, row), HeaderRow(row)) << "row " << row;
    EXPECT_EQ(ScreenText(*view, 6, 0, 12), "  DISTANCE:");
    EXPECT_EQ(ScreenText(*view, 10, 0, 40),
        RowOf({ { 0, " A:" }, { 4, "Member 1" }, { 28, apparent(0) } }));
    EXPECT_EQ(ScreenText(*view, 11, 0, 40),
        RowOf({ { 0, " B:" }, { 4, "Member 2" }, { 28, apparent(1) } }));
    EXPECT_EQ(ScreenText(*view, 12, 0, 52),
        RowOf({ { 0, " C:" }, { 4, "Member 3  +1" }, { 28, apparent(2) } }));

    // Systems of fewer members after them leave every row clean: no mark, no fragment.
    DropUpper(sirius);
    DropLower(sun);
    TypeAll(*view);
    EXPECT_EQ(ScreenRow(*view, 2), Star1Row(sirius, 0));
    EXPECT_EQ(ScreenRow(*view, 3), Star1Row(sirius, 1));
    EXPECT_EQ(ScreenRow(*view, 4), HeaderRow(4));
    EXPECT_EQ(ScreenText(*view, 10, 0, 40),
        RowOf({ { 0, " A:" }, { 4, "The Sun" },
            { 28, Format("%.1f %s", 4.83 + 5 * std::log10(Distance(sirius, sun) / 10), "G2V") } }));
    EXPECT_EQ(ScreenText(*view, 11, 0, 40), " B:");
    EXPECT_EQ(ScreenRow(*view, 12), HeaderRow(12));
    for (int32_t row : { 0, 1, 5, 7, 8, 9 })
        EXPECT_EQ(ScreenRow(*view, row), HeaderRow(row)) << "row " << row;
}

TEST_F(StarIViewTest, ALongNameOfTheThirdOfManyMembersIsShortenedForTheCount)
{
    Universe sky(4);
    const int32_t many = AddTestSystem(sky, 1, 0, 0,
        { { "A", "M0V", 9 }, { "B", "M0V", 9 }, { "A Name Far Too Long For Its Field", "M0V", 9 },
            { "D", "M0V", 9 } });
    Message message(kUniversePointer);
    message.AddPointer(kUniversePtrString, &sky);
    view->MessageReceived(&message);
    DropUpper(many);
    TypeAll(*view);
    EXPECT_EQ(ScreenText(*view, 4, 4, 24), "A Name Far Too Long  +1");
}

TEST_F(StarIViewTest, NamesWithAccentsAreSpelledInAsciiLetters)
{
    Universe sky(4);
    // Two real names with accents, in UTF-8: HD 8574 and HD 130322.
    const int32_t belenos
        = AddTestSystem(sky, 1, 0, 0, { { "B\xc3\xa9l\xc3\xa9nos", "F8V", 3.7 } });
    const int32_t monch = AddTestSystem(sky, 5, 0, 0, { { "M\xc3\xb6nch", "K0V", 5.7 } });
    Message message(kUniversePointer);
    message.AddPointer(kUniversePtrString, &sky);
    view->MessageReceived(&message);
    DropUpper(belenos);
    DropLower(monch);
    TypeAll(*view);
    EXPECT_EQ(ScreenText(*view, 2, 0, 28), " A: Belenos");
    EXPECT_EQ(ScreenText(*view, 10, 0, 28), " A: Monch");
}

TEST_F(StarIViewTest, NumbersAreWrittenWithAPointInADecimalCommaLocale)
{
    const CommaLocale comma;
    ASSERT_TRUE(comma.Active()) << "the de_DE.UTF-8 locale is missing: run scripts/setup";
    SendUniverse();
    DropUpper(near);
    DropLower(far);
    TypeAll(*view);
    EXPECT_EQ(ScreenText(*view, 6, 12, 40), "10.00 parsecs ( 32.60 light-years )");
    EXPECT_EQ(ScreenText(*view, 2, 28, 24), RowOf({ { 0, "4.7 G2V" }, { 12, "1.000000" } }));
    EXPECT_EQ(ScreenText(*view, 11, 28, 10), "5.1 G5V");
    EXPECT_EQ(ScreenText(*view, 10, 41, 11), "3h  7.4m");
    EXPECT_EQ(ScreenText(*view, 11, 40, 12), "-28d 41.1'");
}

TEST_F(StarIViewTest, APressDragsTheSystemOfTheHalfUnderIt)
{
    // Both slots empty: nothing to drag.
    PressAt(QPoint(50, 30));
    EXPECT_FALSE(caught.has_value());
    PressAt(QPoint(50, 150));
    EXPECT_FALSE(caught.has_value());

    SendUniverse();
    DropUpper(sirius);
    // Slot 2 empty: the lower half drags slot 1's system.
    for (const QPoint where : { QPoint(50, 30), QPoint(50, 150) }) {
        PressAt(where);
        ASSERT_TRUE(caught.has_value());
        EXPECT_EQ(caught->message.what, kStarMessage);
        EXPECT_EQ(caught->message.FindInt32(kSystemIndexString), sirius);
        EXPECT_EQ(caught->pixels, DragPicture(2));
        EXPECT_EQ(caught->hotSpot.x, 16);
        EXPECT_EQ(caught->hotSpot.y, 16);
    }

    DropLower(far);
    PressAt(QPoint(300, StarIView::kHalfBoundary));
    ASSERT_TRUE(caught.has_value());
    EXPECT_EQ(caught->message.FindInt32(kSystemIndexString), far);
    EXPECT_EQ(caught->pixels, DragPicture(2));
    EXPECT_EQ(caught->hotSpot.x, 16);
    PressAt(QPoint(300, StarIView::kHalfBoundary - 1));
    ASSERT_TRUE(caught.has_value());
    EXPECT_EQ(caught->message.FindInt32(kSystemIndexString), sirius);
}

TEST_F(StarIViewTest, TheHelpLineNamesTheHalfUnderTheMouse)
{
    view->ISetInfo("Drop star here");
    // The half last remembered by any view gives no news; start from the other one.
    const bool lowerFirst = StarIView::RememberedHalf() != 2;
    const QPoint upper(100, StarIView::kHalfBoundary - 1);
    const QPoint lower(100, StarIView::kHalfBoundary);
    const char* upperText = "Star 1: Drop star here";
    const char* lowerText = "Star 2: Drop star here";

    Enter(view.get());
    DeliverPostedMessages();
    ASSERT_EQ(help.received.size(), 1u);
    EXPECT_EQ(help.received[0].what, kInfoMessage);
    EXPECT_STREQ(help.received[0].FindString(kInfoStringField), "Drop star here");

    MoveTo(lowerFirst ? lower : upper);
    ASSERT_EQ(help.received.size(), 2u);
    EXPECT_STREQ(help.received[1].FindString(kInfoStringField), lowerFirst ? lowerText : upperText);
    EXPECT_EQ(StarIView::RememberedHalf(), lowerFirst ? 2 : 1);
    // Within the same half: nothing new.
    MoveTo(lowerFirst ? QPoint(10, 180) : QPoint(10, 0));
    EXPECT_EQ(help.received.size(), 2u);
    // Across y = 92 and back.
    MoveTo(lowerFirst ? upper : lower);
    ASSERT_EQ(help.received.size(), 3u);
    EXPECT_STREQ(help.received[2].FindString(kInfoStringField), lowerFirst ? upperText : lowerText);
    MoveTo(lowerFirst ? lower : upper);
    ASSERT_EQ(help.received.size(), 4u);
    EXPECT_STREQ(help.received[3].FindString(kInfoStringField), lowerFirst ? lowerText : upperText);
    EXPECT_STREQ(view->IGetInfo(), lowerFirst ? lowerText : upperText);

    // Leaving clears the line; coming back shows the last half's text.
    Leave(view.get());
    DeliverPostedMessages();
    ASSERT_EQ(help.received.size(), 5u);
    EXPECT_EQ(help.received[4].what, kClearInfoMessage);
    Enter(view.get());
    DeliverPostedMessages();
    ASSERT_EQ(help.received.size(), 6u);
    EXPECT_STREQ(help.received[5].FindString(kInfoStringField), lowerFirst ? lowerText : upperText);
}

TEST_F(StarIViewTest, TheRememberedHalfIsOneForEveryView)
{
    StarIView other(BPoint(0, 0), "Other Star Info View");
    RecordingHandler otherHelp;
    other.ISetTarget(&otherHelp);
    other.ISetInfo("Drop star here");
    MoveTo(QPoint(100, 20));
    MoveTo(QPoint(100, 150));
    ASSERT_EQ(StarIView::RememberedHalf(), 2);
    // Over the other view's lower half: the half is not new, so its line says nothing of it.
    QMouseEvent move(QEvent::MouseMove, QPointF(100, 150), other.mapToGlobal(QPointF(100, 150)),
        Qt::NoButton, Qt::NoButton, Qt::NoModifier);
    QCoreApplication::sendEvent(&other, &move);
    DeliverPostedMessages();
    EXPECT_TRUE(otherHelp.received.empty());
    EXPECT_STREQ(other.IGetInfo(), "Drop star here");
}

TEST_F(StarIViewTest, ASystemDraggedOutAndLetGoOverTheViewItselfChangesNothing)
{
    SendUniverse();
    DropUpper(sirius);
    DropLower(far);
    TypeAll(*view);
    std::vector<std::string> before;
    for (int32_t row = 0; row < view->Rows(); row++)
        before.push_back(ScreenRow(*view, row));
    bool taken = true;

    // Star 1 dragged down to the lower half, and Star 2 clicked where it is.
    view->SetDragStarter(LetGoOver(view.get(), QPoint(100, 150), taken));
    PressMouse(view.get(), QPoint(100, 30));
    EXPECT_FALSE(taken);
    PressMouse(view.get(), QPoint(100, 150));
    EXPECT_FALSE(taken);
    EXPECT_EQ(view->Index1(), sirius);
    EXPECT_EQ(view->Index2(), far);
    EXPECT_EQ(view->PendingBytes(), 0) << "something was typed";
    TypeAll(*view);
    for (int32_t row = 0; row < view->Rows(); row++)
        EXPECT_EQ(ScreenRow(*view, row), before[size_t(row)]) << "row " << row;

    // Another view's system let go over the lower half goes there.
    StarIView other(BPoint(0, 0), "Other View");
    HandUniverse(other, &universe);
    HandSystem(other, near);
    other.SetDragStarter(LetGoOver(view.get(), QPoint(100, 150), taken));
    PressMouse(&other, QPoint(100, 30));
    EXPECT_TRUE(taken);
    EXPECT_EQ(view->Index2(), near);
}
