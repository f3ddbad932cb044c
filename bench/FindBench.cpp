// Pressing the drag handle of each query panel of the find window, up to the drag starting, over
// a universe of a million systems with named stars; one core. Each panel's controls hold a
// search a user might make. Press is the whole of it: a real mouse press sent to the handle,
// which runs the query and builds the real QDrag of the result (deleted again instead of run,
// since a running drag waits for the button to be let go). PerformQuery and MakeDrag time its
// two halves apart: reading the controls and running the query, and making the message, the
// image and the drag of a result already found.
#include "bench/MillionSystems.h"
#include "bench/WidgetBenchMain.h"
#include "core/MessageCodes.h"
#include "platform/qt/MessageDrag.h"
#include "query/panels/DECQueryView.h"
#include "query/panels/DistQueryView.h"
#include "query/panels/MGQueryView.h"
#include "query/panels/NameQueryView.h"
#include "query/panels/PopUpMenuButton.h"
#include "query/panels/QueryDragger.h"
#include "query/panels/RAQueryView.h"
#include "query/panels/SCQueryView.h"
#include "query/panels/TextControl.h"

#include <QDrag>
#include <QMouseEvent>
#include <benchmark/benchmark.h>
#include <memory>
#include <string>
#include <utility>

namespace {

// A panel's frame: 50 high, as the find window stacks them, and wide enough for every panel's
// controls.
const BRect kPanelFrame(10, 10, 515, 60);

// A panel with its controls set, and the drag its search makes: kStarMessage for exactly one
// system, kStarArrayMessage for a set.
struct Search {
    const char* name;
    uint32_t drag;
    std::unique_ptr<StarQueryView> (*make)();
};

template <typename Panel>
std::unique_ptr<Panel> NewPanel(const char* name, Universe* universe = &MillionSystems())
{
    return std::make_unique<Panel>(kPanelFrame, name, universe, nullptr);
}

// otherNames: over the universe whose stars go by other names too.
std::unique_ptr<StarQueryView> NameSearch(int queryType, const char* text, bool otherNames = false)
{
    auto panel = NewPanel<NameQueryView>(
        "Name Query", otherNames ? &MillionSystemsWithOtherNames() : &MillionSystems());
    panel->queryType->SetMarked(queryType);
    panel->starName->SetText(text);
    return panel;
}

// Any star of class G2.
std::unique_ptr<StarQueryView> SCSearch()
{
    auto panel = NewPanel<SCQueryView>("SC Query");
    panel->starMode->SetMarked(kAnyStarInSystem);
    panel->modeMenu->SetMarked(kQueryIs);
    panel->harvardClass->SetMarked(kClassG);
    panel->decimalClass->SetMarked(2);
    return panel;
}

// The first star brighter than absolute magnitude 1.
std::unique_ptr<StarQueryView> MGSearch()
{
    auto panel = NewPanel<MGQueryView>("SC Query");
    panel->starMode->SetMarked(kFirstStarInSystem);
    panel->modeMenu->SetMarked(kQueryLessThan);
    panel->magnitude->SetText("1");
    return panel;
}

// Right ascension before 2h 30m.
std::unique_ptr<StarQueryView> RASearch()
{
    auto panel = NewPanel<RAQueryView>("SC Query");
    panel->modeMenu->SetMarked(kQueryLessThan);
    panel->hours->SetText("2");
    panel->minutes->SetText("30");
    return panel;
}

// North of declination +60° 0'.
std::unique_ptr<StarQueryView> DECSearch()
{
    auto panel = NewPanel<DECQueryView>("SC Query");
    panel->modeMenu->SetMarked(kQueryGreaterThan);
    panel->degrees->SetText("+60");
    panel->minutes->SetText("0");
    return panel;
}

// Within 50 parsecs of the origin.
std::unique_ptr<StarQueryView> DistSearch()
{
    auto panel = NewPanel<DistQueryView>("Dist Query");
    panel->SetReferenceSystem(-1);
    panel->modeMenu->SetMarked(kQueryLessThan);
    panel->distance->SetText("50");
    return panel;
}

// The name panel three ways, the others once; every search but "Name is" finds a set. The name
// panel always searches without regard to case.
const Search kSearches[] = {
    // A tenth of the universe: HIP 400000 to HIP 499999.
    { "Name/StartsWith", kStarArrayMessage, [] { return NameSearch(kNameStartsWith, "hip 4"); } },
    // A few hundred: every number with 2345 in it.
    { "Name/Contains", kStarArrayMessage, [] { return NameSearch(kNameContains, "2345"); } },
    // One system; its second star, if it has one, is "HIP 123456 B".
    { "Name/Is", kStarMessage, [] { return NameSearch(kNameIs, "HIP 123456"); } },
    // The same where every star also goes by about 3.5 other names (Gaia DR3, Tycho, HD, GJ).
    { "NameOther/StartsWith", kStarArrayMessage,
        [] { return NameSearch(kNameStartsWith, "hip 4", true); } },
    { "NameOther/Contains", kStarArrayMessage,
        [] { return NameSearch(kNameContains, "2345", true); } },
    { "NameOther/Is", kStarMessage, [] { return NameSearch(kNameIs, "HIP 123456", true); } },
    { "SC", kStarArrayMessage, SCSearch },
    { "MG", kStarArrayMessage, MGSearch },
    { "RA", kStarArrayMessage, RASearch },
    { "DEC", kStarArrayMessage, DECSearch },
    { "Dist", kStarArrayMessage, DistSearch },
};

// What the handle does with a drag it starts, short of running it: builds the QDrag with its
// payload and picture, then throws it away. Answers the kind of drag.
uint32_t StartDrag(QWidget* source, const Message& message, RBitmap8* image, BPoint hotSpot)
{
    delete MakeMessageDrag(source, message, image, hotSpot);
    return message.what;
}

// Times step, once an iteration, on panel, which has run its search once already; step answers
// the kind of drag the panel's result makes, 0 for none, which must be the search's.
template <typename Step>
void RunSearch(benchmark::State& state, const Search& search, StarQueryView& panel, Step step)
{
    panel.PerformQuery();
    uint32_t drag = 0;
    for (auto _ : state) {
        drag = step();
        benchmark::ClobberMemory();
    }
    state.counters["systems"] = MillionSystems().CountItems();
    state.counters["found"] = panel.GetSelectedItems();
    if (drag != search.drag)
        state.SkipWithError("the search did not make the drag it should");
}

void BM_Press(benchmark::State& state, const Search& search)
{
    std::unique_ptr<StarQueryView> panel = search.make();
    QueryDragger* handle = panel->Dragger();
    uint32_t started = 0;
    handle->SetDragStarter(
        [handle, &started](const Message& message, RBitmap8* image, BPoint hotSpot) {
            started = StartDrag(handle, message, image, hotSpot);
        });
    RunSearch(state, search, *panel, [handle, &started] {
        started = 0;
        QMouseEvent press(QEvent::MouseButtonPress, QPointF(5, 5),
            handle->mapToGlobal(QPointF(5, 5)), Qt::LeftButton, Qt::LeftButton, Qt::NoModifier);
        QCoreApplication::sendEvent(handle, &press);
        return started;
    });
}

void BM_PerformQuery(benchmark::State& state, const Search& search)
{
    std::unique_ptr<StarQueryView> panel = search.make();
    RunSearch(state, search, *panel, [&panel] {
        const int32_t found = panel->PerformQuery();
        return found == 0 ? 0 : found == 1 ? kStarMessage : kStarArrayMessage;
    });
}

void BM_MakeDrag(benchmark::State& state, const Search& search)
{
    std::unique_ptr<StarQueryView> panel = search.make();
    RunSearch(state, search, *panel, [&panel] {
        std::unique_ptr<Message> message(panel->GetDragMessage());
        BRect rect;
        RBitmap8* image = panel->GetDragBitmap(&rect);
        return StartDrag(panel->Dragger(), *message, image, BPoint(1, 1));
    });
}

} // namespace

int main(int argc, char** argv)
{
    return RunWidgetBenchmarks(argc, argv, [] {
        for (const auto& [stage, run] : { std::pair { "BM_Press/", &BM_Press },
                 std::pair { "BM_PerformQuery/", &BM_PerformQuery },
                 std::pair { "BM_MakeDrag/", &BM_MakeDrag } }) {
            for (const Search& search : kSearches) {
                benchmark::RegisterBenchmark(
                    (std::string(stage) + search.name).c_str(), run, search)
                    ->Unit(benchmark::kMillisecond);
            }
        }
    });
}
