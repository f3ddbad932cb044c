// The H-R diagram view: its scales, plotting systems that arrive in every way, the full plot
// list, clearing, naming the marker under the mouse and dragging systems out.
#include "ViewMessages.h"
#include "query/UniverseBuilder.h"

#include "core/MessageCodes.h"
#include "hrd/HRDView.h"
#include "platform/qt/RecordingHandler.h"
#include "resources/ResourceData.h"
#include "widgets/WidgetEvents.h"

#include <QCoreApplication>
#include <QMouseEvent>
#include <cmath>
#include <gtest/gtest.h>
#include <memory>
#include <optional>
#include <string>

namespace {

class HRDViewTest : public ::testing::Test {
protected:
    static void SetUpTestSuite() { InitResources(); }

    void SetUp() override
    {
        sun = AddTestSystem(universe, 0, 0, 0, { { "The Sun", "G2V", 4.83 } });
        sirius = AddTestSystem(universe, -0.494, -0.759, 2.477,
            { { "Sirius", "A1V", 1.43 }, { "Sirius B", "DA2", 11.3 } });
        vega = AddTestSystem(universe, 1.0, 4.9, -5.0, { { "Vega", "A0V", 0.58 } });
        // Two systems whose stars share a class and a magnitude: their markers coincide.
        first = AddTestSystem(universe, 5, 0, 0, { { "First Twin", "K0V", 5.9 } });
        second = AddTestSystem(universe, 6, 0, 0, { { "Second Twin", "K0V", 5.9 } });
        view = std::make_unique<HRDView>(BPoint(0, 0), "HRView");
        view->ISetTarget(&help);
        view->SetPlotNameTarget(&plotName);
        view->SetDragStarter(CatchDrag(caught));
    }

    void SendUniverse(Universe* sky = nullptr) { HandUniverse(*view, sky ? sky : &universe); }

    void Send(uint32_t what, const char* field, int32_t index)
    {
        Message message(what);
        message.AddInt32(field, index);
        view->MessageReceived(&message);
    }

    void SendSet(std::initializer_list<int32_t> members)
    {
        sets.push_back(std::make_unique<StarSysMask>(universe.CountItems(), false, 0));
        for (int32_t i : members)
            sets.back()->SetStateSafe(i, true);
        Message message(kStarArrayMessage);
        message.AddPointer(kSystemArrayPtrString, sets.back().get());
        view->MessageReceived(&message);
    }

    void MoveTo(QPoint where) { MoveMouse(view.get(), where); }

    void PressAt(QPoint where)
    {
        caught.reset();
        PressMouse(view.get(), where);
    }

    // Where the marker of star number star of system index is centred.
    QPoint MarkerOf(int32_t index, int32_t star = 0) const
    {
        const Star* s = universe.SystemAt(index)->StarAt(star);
        return QPoint(int(HRDView::SpectralClassToX(s->GetSpectralClass())),
            int(HRDView::AbsMagnitudeToY(s->GetMagnitude())));
    }

    bool CanvasIsEmpty() const { return Pixels(*view->Canvas()) == Pixels(*view->Background()); }

    Universe universe { 20 };
    int32_t sun = 0, sirius = 0, vega = 0, first = 0, second = 0;
    RecordingHandler help, plotName;
    std::unique_ptr<HRDView> view;
    std::optional<CaughtDrag> caught;
    std::vector<std::unique_ptr<StarSysMask>> sets;
};

} // namespace

TEST_F(HRDViewTest, MagnitudeZeroLiesAt93Point4AndMinusSevenAt15)
{
    EXPECT_FLOAT_EQ(HRDView::AbsMagnitudeToY(0.0), 93.4f);
    EXPECT_FLOAT_EQ(HRDView::AbsMagnitudeToY(-7.0), 15.0f);
    EXPECT_FLOAT_EQ(HRDView::AbsMagnitudeToY(1.0) - HRDView::AbsMagnitudeToY(0.0), 11.2f);

    // The same for plotted stars.
    Universe sky(4);
    AddTestSystem(sky, 1, 0, 0, { { "Zero", "A0V", 0.0 }, { "Minus Seven", "B0I", -7.0 } });
    SendUniverse(&sky);
    Send(kStarMessage, kSystemIndexString, 0);
    ASSERT_EQ(view->PlotCount(), 2);
    EXPECT_FLOAT_EQ(view->Plots()[0].y, 93.4f);
    EXPECT_FLOAT_EQ(view->Plots()[1].y, 15.0f);
}

TEST_F(HRDViewTest, EachClassIsFortyPixelsWideAndO0IsNudgedHalfAClassIn)
{
    const auto x = [](const char* text) {
        const SpectralClass sc(text);
        return HRDView::SpectralClassToX(&sc);
    };
    EXPECT_FLOAT_EQ(x("B0"), 60.0f);
    EXPECT_FLOAT_EQ(x("A0"), 100.0f);
    EXPECT_FLOAT_EQ(x("G2V"), 188.0f);
    EXPECT_FLOAT_EQ(x("M5"), 280.0f);
    EXPECT_FLOAT_EQ(x("O5"), 40.0f);
    // O0 would stand at 20, on the axis: it is put half a class in, where O5 is.
    EXPECT_FLOAT_EQ(x("O0"), 40.0f);
    EXPECT_FLOAT_EQ(x("O1"), 24.0f);
}

TEST_F(HRDViewTest, ADroppedSystemPlotsEveryStarButIsNotKeptInTheSet)
{
    SendUniverse();
    EXPECT_EQ(view->PlotCount(), 0);
    Send(kStarMessage, kSystemIndexString, sirius);
    ASSERT_EQ(view->PlotCount(), 2);
    for (int32_t i = 0; i < 2; i++) {
        const HRPlot& plot = view->Plots()[i];
        EXPECT_EQ(plot.systemIndex, sirius);
        EXPECT_EQ(plot.star, universe.SystemAt(sirius)->StarAt(i));
        EXPECT_FLOAT_EQ(plot.x, HRDView::SpectralClassToX(plot.star->GetSpectralClass()));
        EXPECT_FLOAT_EQ(plot.y, HRDView::AbsMagnitudeToY(plot.star->GetMagnitude()));
    }
    EXPECT_EQ(view->PlottedSystems()->CountItems(true), 0);
    // The white dwarf's class letter is A (the reader takes the first class letter), so it
    // stands in the A column, far below Sirius.
    EXPECT_EQ(view->Plots()[1].x, view->Plots()[0].x + 4.0f);
    EXPECT_GT(view->Plots()[1].y, view->Plots()[0].y + 100);

    // A system may be plotted again.
    Send(kStarMessage, kSystemIndexString, sirius);
    EXPECT_EQ(view->PlotCount(), 4);
}

TEST_F(HRDViewTest, EachMarkerIsOneBlitOfTheMarkerPicture)
{
    SendUniverse();
    ASSERT_TRUE(CanvasIsEmpty());
    Send(kStarMessage, kSystemIndexString, vega);
    const QPoint centre = MarkerOf(vega);
    RBitmap8 marker(BRect(0, 0, 7, 7));
    marker.LoadFromResource(int32_t(kRaw8Type), 4, 0, 64);
    const RBitmap8* canvas = view->Canvas();
    const RBitmap8* background = view->Background();
    int changed = 0;
    for (int y = 0; y < canvas->Height(); y++) {
        for (int x = 0; x < canvas->Width(); x++) {
            const int32_t at = y * canvas->BytesPerRow() + x;
            const int mx = x - (centre.x() - 3), my = y - (centre.y() - 3);
            const bool inMarker = mx >= 0 && mx < 8 && my >= 0 && my < 8;
            const uint8_t ink = inMarker ? marker.Bits()[my * marker.BytesPerRow() + mx] : 255;
            const uint8_t expected = ink == 255 ? background->Bits()[at] : ink;
            changed += canvas->Bits()[at] != background->Bits()[at];
            ASSERT_EQ(canvas->Bits()[at], expected) << "at " << x << ", " << y;
        }
    }
    EXPECT_GT(changed, 10) << "the marker is hardly visible";
}

TEST_F(HRDViewTest, TheChartsSelectionIsPlotted)
{
    SendUniverse();
    Send(kStarInfoBroadcast, kSISelectionIndexString, vega);
    ASSERT_EQ(view->PlotCount(), 1);
    EXPECT_EQ(view->Plots()[0].systemIndex, vega);
    // The selection given up: nothing.
    Send(kStarInfoBroadcast, kSISelectionIndexString, -1);
    EXPECT_EQ(view->PlotCount(), 1);
    Send(kStarInfoBroadcast, kSISelectionIndexString, sirius);
    EXPECT_EQ(view->PlotCount(), 3);
    // Selected systems are not part of the set a press drags.
    EXPECT_EQ(view->PlottedSystems()->CountItems(true), 0);
}

TEST_F(HRDViewTest, NegativeIndicesAreIgnored)
{
    SendUniverse();
    Send(kStarMessage, kSystemIndexString, -1);
    Send(kStarMessage, kSystemIndexString, -7);
    Send(kStarInfoBroadcast, kSISelectionIndexString, -2);
    EXPECT_EQ(view->PlotCount(), 0);
    // Past the end there is no system either.
    Send(kStarMessage, kSystemIndexString, universe.CountItems());
    EXPECT_EQ(view->PlotCount(), 0);
    EXPECT_TRUE(CanvasIsEmpty());
}

TEST_F(HRDViewTest, NothingIsPlottedBeforeTheUniverseArrives)
{
    Send(kStarMessage, kSystemIndexString, vega);
    Send(kStarInfoBroadcast, kSISelectionIndexString, vega);
    EXPECT_EQ(view->PlotCount(), 0);
    EXPECT_EQ(view->PlottedSystems(), nullptr);
    EXPECT_TRUE(CanvasIsEmpty());
    // A press with nothing plotted and no universe drags the set it does not have yet.
    PressAt(QPoint(150, 150));
    ASSERT_TRUE(caught.has_value());
    EXPECT_EQ(caught->message.what, kStarArrayMessage);
    EXPECT_EQ(caught->message.FindPointer(kSystemArrayPtrString), nullptr);
}

TEST_F(HRDViewTest, ADroppedSetIsPlottedInIndexOrderAndKept)
{
    SendUniverse();
    SendSet({ vega, sun, sirius });
    ASSERT_EQ(view->PlotCount(), 4);
    EXPECT_EQ(view->Plots()[0].systemIndex, sun);
    EXPECT_EQ(view->Plots()[1].systemIndex, sirius);
    EXPECT_EQ(view->Plots()[2].systemIndex, sirius);
    EXPECT_EQ(view->Plots()[3].systemIndex, vega);
    SendSet({ first });
    const StarSysMask* kept = view->PlottedSystems();
    EXPECT_EQ(kept->CountItems(true), 4);
    for (int32_t i : { sun, sirius, vega, first })
        EXPECT_TRUE(kept->GetStateSafe(i)) << i;
    EXPECT_FALSE(kept->GetStateSafe(second));
    // Not the dropped set itself: a copy the view owns.
    EXPECT_NE(kept, sets.front().get());
}

TEST_F(HRDViewTest, ClearingForgetsThePlotsAndTheSetAndShowsTheEmptyDiagram)
{
    SendUniverse();
    SendSet({ sun, vega });
    Send(kStarMessage, kSystemIndexString, sirius);
    ASSERT_FALSE(CanvasIsEmpty());
    Message clear(kHRDClear);
    view->MessageReceived(&clear);
    EXPECT_EQ(view->PlotCount(), 0);
    EXPECT_EQ(view->PlottedSystems()->CountItems(true), 0);
    EXPECT_TRUE(CanvasIsEmpty());
    EXPECT_EQ(
        view->FindPlot(BPoint(float(MarkerOf(vega).x()), float(MarkerOf(vega).y()))), nullptr);
}

TEST_F(HRDViewTest, APressOnEmptySpaceAfterAClearDragsAnEmptySet)
{
    SendUniverse();
    SendSet({ sun, vega, sirius });
    Message clear(kHRDClear);
    view->MessageReceived(&clear);
    PressAt(MarkerOf(vega));
    ASSERT_TRUE(caught.has_value());
    EXPECT_EQ(caught->message.what, kStarArrayMessage);
    const auto* set
        = static_cast<const StarSysMask*>(caught->message.FindPointer(kSystemArrayPtrString));
    ASSERT_NE(set, nullptr);
    EXPECT_EQ(set, view->PlottedSystems());
    EXPECT_EQ(set->CountItems(true), 0);
    EXPECT_EQ(caught->pixels, DragPicture(3));
    EXPECT_EQ(caught->hotSpot.x, 1);
    EXPECT_EQ(caught->hotSpot.y, 1);
}

TEST_F(HRDViewTest, APressOnAMarkerDragsItsSystemAndElsewhereEverySetDropped)
{
    SendUniverse();
    SendSet({ sun, vega });
    Send(kStarMessage, kSystemIndexString, sirius);
    // On Sirius B's marker, or up to three pixels from its centre either way: Sirius's system.
    const HRPlot& dwarf = view->Plots()[3];
    ASSERT_STREQ(dwarf.star->GetName(), "Sirius B");
    const int left = int(std::ceil(dwarf.x - 3)), right = int(std::floor(dwarf.x + 3));
    const int top = int(std::ceil(dwarf.y - 3)), bottom = int(std::floor(dwarf.y + 3));
    for (const QPoint where : { QPoint(left, top), QPoint(right, bottom), QPoint(left, bottom),
             QPoint(int(dwarf.x), int(dwarf.y)) }) {
        PressAt(where);
        ASSERT_TRUE(caught.has_value());
        EXPECT_EQ(caught->message.what, kStarMessage);
        EXPECT_EQ(caught->message.FindInt32(kSystemIndexString), sirius);
        EXPECT_EQ(caught->pixels, DragPicture(2));
        EXPECT_EQ(caught->hotSpot.x, 1);
    }
    // Four pixels off is outside it: the sets dropped, without the system dropped alone.
    PressAt(QPoint(right + 1, bottom));
    ASSERT_TRUE(caught.has_value());
    EXPECT_EQ(caught->message.what, kStarArrayMessage);
    const auto* set
        = static_cast<const StarSysMask*>(caught->message.FindPointer(kSystemArrayPtrString));
    ASSERT_NE(set, nullptr);
    EXPECT_EQ(set->CountItems(true), 2);
    EXPECT_TRUE(set->GetStateSafe(sun));
    EXPECT_TRUE(set->GetStateSafe(vega));
    EXPECT_EQ(caught->pixels, DragPicture(3));
}

TEST_F(HRDViewTest, OverlappingMarkersNameTheStarPlottedLast)
{
    SendUniverse();
    Send(kStarMessage, kSystemIndexString, first);
    Send(kStarMessage, kSystemIndexString, second);
    ASSERT_EQ(MarkerOf(first), MarkerOf(second));
    MoveTo(MarkerOf(first) + QPoint(1, 0));
    EXPECT_EQ(view->HoverIndex(), second);
    ASSERT_EQ(plotName.received.size(), 1u);
    EXPECT_EQ(plotName.received[0].what, kInfoMessage);
    EXPECT_STREQ(plotName.received[0].FindString(kInfoStringField), "Second Twin ( 5.9 K0.0 )");
    EXPECT_EQ(
        view->FindPlot(BPoint(float(MarkerOf(first).x()), float(MarkerOf(first).y())))->systemIndex,
        second);

    // Plotted again, the first is on top.
    Send(kStarMessage, kSystemIndexString, first);
    MoveTo(QPoint(20, 20));
    MoveTo(MarkerOf(first));
    ASSERT_FALSE(plotName.received.empty());
    EXPECT_STREQ(plotName.received.back().FindString(kInfoStringField), "First Twin ( 5.9 K0.0 )");
}

TEST_F(HRDViewTest, HoveringNamesTheStarAndTheHelpFollowsWhatIsUnderTheMouse)
{
    SendUniverse();
    // Over nothing with nothing plotted.
    MoveTo(QPoint(150, 20));
    EXPECT_EQ(view->HoverIndex(), -1);
    EXPECT_STREQ(view->IGetInfo(), "Drag & drop stars from other views here");
    ASSERT_EQ(plotName.received.size(), 1u);
    EXPECT_EQ(plotName.received[0].what, kClearInfoMessage);

    Send(kStarMessage, kSystemIndexString, sirius);
    MoveTo(MarkerOf(sirius, 1));
    EXPECT_EQ(view->HoverIndex(), sirius);
    ASSERT_EQ(plotName.received.size(), 2u);
    EXPECT_STREQ(plotName.received[1].FindString(kInfoStringField), "Sirius B ( 11.3 A2.0 )");
    EXPECT_STREQ(view->IGetInfo(), "Click to drag & drop star");

    // Moving over the same system's other marker changes nothing.
    MoveTo(MarkerOf(sirius, 0));
    EXPECT_EQ(plotName.received.size(), 2u);

    // Off the markers, with some plotted: the plot name goes, the help offers them all.
    MoveTo(QPoint(150, 20));
    EXPECT_EQ(view->HoverIndex(), -1);
    ASSERT_EQ(plotName.received.size(), 3u);
    EXPECT_EQ(plotName.received[2].what, kClearInfoMessage);
    EXPECT_STREQ(view->IGetInfo(), "Click to drag & drop all stars");

    // Entering broadcasts the help the view holds; leaving clears it and forgets the marker.
    help.received.clear();
    Enter(view.get());
    DeliverPostedMessages();
    ASSERT_EQ(help.received.size(), 1u);
    EXPECT_EQ(help.received[0].what, kInfoMessage);
    EXPECT_STREQ(help.received[0].FindString(kInfoStringField), "Click to drag & drop all stars");
    Leave(view.get());
    DeliverPostedMessages();
    EXPECT_EQ(view->HoverIndex(), -2);
    ASSERT_EQ(help.received.size(), 2u);
    EXPECT_EQ(help.received[1].what, kClearInfoMessage);
}

TEST_F(HRDViewTest, The5001stStarReplacesThe5000th)
{
    // 5,001 systems of one star each, every one a magnitude apart in turn so that markers can
    // be told apart.
    Universe many(5001);
    for (int i = 0; i < 5001; i++) {
        const std::string name = "Star " + std::to_string(i);
        AddTestSystem(many, i + 1, 0, 0, { { name.c_str(), "G2V", double(i % 20) } });
    }
    SendUniverse(&many);
    for (int32_t i = 0; i < 4999; i++)
        Send(kStarMessage, kSystemIndexString, i);
    EXPECT_EQ(view->PlotCount(), 4999);
    Send(kStarMessage, kSystemIndexString, 4999);
    // The 5,000th star takes the last slot; the count stops one short of it.
    EXPECT_EQ(view->PlotCount(), 4999);
    EXPECT_EQ(view->Plots()[4999].systemIndex, 4999);
    Send(kStarMessage, kSystemIndexString, 5000);
    EXPECT_EQ(view->PlotCount(), 4999);
    EXPECT_EQ(view->Plots()[4999].systemIndex, 5000);
    EXPECT_EQ(view->Plots()[4999].star, many.SystemAt(5000)->StarAt(0));
    EXPECT_EQ(view->Plots()[4998].systemIndex, 4998);
    // Further stars keep overwriting the last slot and nothing else.
    Send(kStarMessage, kSystemIndexString, 7);
    EXPECT_EQ(view->Plots()[4999].systemIndex, 7);
    EXPECT_EQ(view->Plots()[4998].systemIndex, 4998);
    EXPECT_EQ(view->PlotCount(), 4999);
}

TEST_F(HRDViewTest, AStarWhoseClassPlacesItAtMinusOneIsSkipped)
{
    // x = -1 for a class value a shade above W4.7; find the subclass that gives it exactly.
    std::string text;
    for (int hundredths = 400; hundredths < 550 && text.empty(); hundredths++) {
        char candidate[16];
        std::snprintf(candidate, sizeof candidate, "W%d.%02d", hundredths / 100, hundredths % 100);
        const SpectralClass sc(candidate);
        if (HRDView::SpectralClassToX(&sc) == -1.0f)
            text = candidate;
    }
    if (text.empty())
        GTEST_SKIP() << "no W subclass in hundredths gives exactly -1 on this machine";
    Universe sky(4);
    AddTestSystem(sky, 1, 0, 0, { { "Placed", "G2V", 4.8 }, { "Skipped", text.c_str(), 4.8 } });
    SendUniverse(&sky);
    Send(kStarMessage, kSystemIndexString, 0);
    ASSERT_EQ(view->PlotCount(), 1);
    EXPECT_STREQ(view->Plots()[0].star->GetName(), "Placed");
}

TEST_F(HRDViewTest, StarsOffTheDiagramAreKeptButNotDrawn)
{
    Universe sky(4);
    // Fainter than the diagram reaches, and of no class at all (left of the axis).
    AddTestSystem(sky, 1, 0, 0, { { "Faint", "M9V", 30.0 }, { "Classless", "??", 4.0 } });
    SendUniverse(&sky);
    Send(kStarMessage, kSystemIndexString, 0);
    EXPECT_EQ(view->PlotCount(), 2);
    EXPECT_TRUE(CanvasIsEmpty());
}

TEST_F(HRDViewTest, ANewUniverseStartsAfresh)
{
    SendUniverse();
    SendSet({ sun, vega });
    Universe other(4);
    AddTestSystem(other, 1, 0, 0, { { "Alone", "G2V", 4.8 } });
    SendUniverse(&other);
    EXPECT_EQ(view->PlotCount(), 0);
    ASSERT_NE(view->PlottedSystems(), nullptr);
    EXPECT_EQ(view->PlottedSystems()->GetSystemCount(), 1);
    EXPECT_EQ(view->PlottedSystems()->CountItems(true), 0);
}

TEST_F(HRDViewTest, SetsAndSystemsDroppedByDragArePlotted)
{
    SendUniverse();
    view->show();
    Message star(kStarMessage);
    star.AddInt32(kSystemIndexString, vega);
    MessageMimeData data(star);
    QDragEnterEvent enter(QPoint(50, 50), Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(view.get(), &enter);
    EXPECT_TRUE(enter.isAccepted());
    QDropEvent drop(QPointF(50, 50), Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(view.get(), &drop);
    ASSERT_EQ(view->PlotCount(), 1);
    EXPECT_EQ(view->Plots()[0].systemIndex, vega);

    // Text from another program is refused.
    QMimeData text;
    text.setText("Vega");
    QDragEnterEvent foreign(QPoint(50, 50), Qt::CopyAction, &text, Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(view.get(), &foreign);
    EXPECT_FALSE(foreign.isAccepted());
}

TEST_F(HRDViewTest, AMagnitudeThatIsNoNumberOrAbsurdIsKeptButNotDrawn)
{
    Universe sky(4);
    AddTestSystem(sky, 1, 0, 0,
        { { "Not A Number", "G2V", std::nan("") }, { "Endless", "K0V", HUGE_VAL },
            { "Boundless", "K0V", -HUGE_VAL }, { "Absurd", "M0V", 4.0e8 } });
    SendUniverse(&sky);
    Send(kStarMessage, kSystemIndexString, 0);
    EXPECT_EQ(view->PlotCount(), 4);
    EXPECT_TRUE(CanvasIsEmpty());
    EXPECT_EQ(view->FindPlot(BPoint(150, 150)), nullptr);
}

TEST_F(HRDViewTest, AClickOrADragLetGoOverTheDiagramItselfPlotsNothingMore)
{
    SendUniverse();
    SendSet({ sun, vega });
    Send(kStarMessage, kSystemIndexString, sirius);
    const int32_t plotted = view->PlotCount();
    const int32_t kept = view->PlottedSystems()->CountItems(true);
    bool taken = true;

    // A click on empty space: the set's drag starts and is let go where it began.
    view->SetDragStarter(LetGoOver(view.get(), QPoint(150, 150), taken));
    PressMouse(view.get(), QPoint(150, 150));
    EXPECT_FALSE(taken);
    EXPECT_EQ(view->PlotCount(), plotted);
    EXPECT_EQ(view->PlottedSystems()->CountItems(true), kept);

    // A marker dragged a little way and let go over the diagram.
    taken = true;
    view->SetDragStarter(LetGoOver(view.get(), MarkerOf(vega) + QPoint(30, 10), taken));
    PressMouse(view.get(), MarkerOf(vega));
    EXPECT_FALSE(taken);
    EXPECT_EQ(view->PlotCount(), plotted);

    // Another diagram's drag let go here is plotted.
    HRDView other(BPoint(0, 0), "Other");
    HandUniverse(other, &universe);
    HandSystem(other, vega);
    other.SetDragStarter(LetGoOver(view.get(), QPoint(150, 150), taken));
    PressMouse(&other, MarkerOf(vega));
    EXPECT_TRUE(taken);
    EXPECT_EQ(view->PlotCount(), plotted + 1);
}
