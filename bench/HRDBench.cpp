// The H-R diagram over a universe of a million systems (about one in eight a pair); one core.
// Sets and systems reach the diagram the way a drag ending on it does, and every case goes on
// until the diagram has been painted on the (offscreen) screen.
//
// BM_DropSet/<systems>: a set of that many systems, spread over the universe, dropped on an
// empty diagram: each member star placed and blitted (past 5,000 stars every one overwrites the
// last plot), the set kept, the canvas painted. The diagram is cleared, clock stopped, before
// each drop.
// BM_Selection: one system plotted as a chart's selection arrives, on a diagram of 5,000 plots.
// BM_Hover/<where>: the pointer moved over a diagram of 5,000 plots, to empty space (every
// plot is looked at) or between two markers in turn (the plot-name line is rewritten each
// time).
// BM_Clear: the clear button's message on a full diagram.
#include "bench/MillionSystems.h"
#include "bench/WidgetBenchMain.h"
#include "core/MessageCodes.h"
#include "hrd/HRDView.h"
#include "hrd/HRDWindow.h"

#include <QMouseEvent>
#include <memory>
#include <random>

namespace {

// A set of count systems picked at random from the universe.
std::unique_ptr<StarSysMask> RandomSet(int32_t count)
{
    const int32_t systems = MillionSystems().CountItems();
    auto set = std::make_unique<StarSysMask>(systems, count >= systems, 0);
    std::mt19937 random { uint32_t(count) };
    for (int32_t picked = 0; picked < count && count < systems;) {
        const auto index = int32_t(random() % uint32_t(systems));
        if (!set->GetStateSafe(index)) {
            set->SetStateSafe(index, true);
            picked++;
        }
    }
    return set;
}

Message SetMessage(StarSysMask* set)
{
    Message message(kStarArrayMessage);
    message.AddPointer(kSystemArrayPtrString, set);
    return message;
}

// An H-R window on the million systems, shown, its view given the universe.
struct DiagramUnderTest {
    DiagramUnderTest()
        : window(std::make_unique<HRDWindow>(BPoint(150, 150), "H-R Diagram", nullptr))
        , view(window->View())
    {
        Message universe(kUniversePointer);
        universe.AddPointer(kUniversePtrString, &MillionSystems());
        view->MessageReceived(&universe);
        QCoreApplication::processEvents();
    }

    void Clear()
    {
        Message clear(kHRDClear);
        view->MessageReceived(&clear);
    }

    // Plots systems from the start of the universe until the plot list is full.
    void Fill()
    {
        for (int32_t i = 0; view->PlotCount() < HRDView::kMaxPlots - 1; i++) {
            Message star(kStarMessage);
            star.AddInt32(kSystemIndexString, i);
            view->MessageReceived(&star);
        }
    }

    void MoveTo(QPointF where)
    {
        QMouseEvent move(QEvent::MouseMove, where, view->mapToGlobal(where), Qt::NoButton,
            Qt::NoButton, Qt::NoModifier);
        QCoreApplication::sendEvent(view, &move);
    }

    std::unique_ptr<HRDWindow> window;
    HRDView* view;
};

void BM_DropSet(benchmark::State& state)
{
    DiagramUnderTest under;
    const std::unique_ptr<StarSysMask> set = RandomSet(int32_t(state.range(0)));
    const Message message = SetMessage(set.get());
    for (auto _ : state) {
        state.PauseTiming();
        under.Clear();
        state.ResumeTiming();
        DropMessage(under.view, message);
    }
    state.counters["systems"] = set->CountItems(true);
    state.counters["plots"] = under.view->PlotCount();
    if (under.view->PlottedSystems()->CountItems(true) != set->CountItems(true))
        state.SkipWithError("the diagram did not keep the set");
}

void BM_Selection(benchmark::State& state)
{
    DiagramUnderTest under;
    under.Fill();
    Message selection(kStarInfoBroadcast);
    selection.AddInt32(kSISelectionIndexString, 12345);
    for (auto _ : state)
        under.view->MessageReceived(&selection);
    if (under.view->Plots()[HRDView::kMaxPlots - 1].systemIndex != 12345)
        state.SkipWithError("the selection was not plotted");
}

void BM_Hover(benchmark::State& state)
{
    DiagramUnderTest under;
    under.Fill();
    const HRPlot* plots = under.view->Plots();
    const bool onMarkers = state.range(0) != 0;
    // Two markers of different systems, the later ones so that they are found at once; or a
    // corner no marker reaches.
    const HRPlot& a = plots[HRDView::kMaxPlots - 2];
    const HRPlot* b = &plots[HRDView::kMaxPlots - 3];
    for (int32_t i = HRDView::kMaxPlots - 3; i >= 0 && b->systemIndex == a.systemIndex; i--)
        b = &plots[i];
    const QPointF first = onMarkers ? QPointF(a.x, a.y) : QPointF(1, 1);
    const QPointF second = onMarkers ? QPointF(b->x, b->y) : QPointF(2, 1);
    if (!onMarkers && under.view->FindPlot(BPoint(1, 1)))
        state.SkipWithError("a marker stands in the corner");
    bool toFirst = true;
    for (auto _ : state) {
        under.MoveTo(toFirst ? first : second);
        toFirst = !toFirst;
    }
    DeliverPostedMessages();
}

void BM_Clear(benchmark::State& state)
{
    DiagramUnderTest under;
    under.Fill();
    for (auto _ : state)
        under.Clear();
    if (under.view->PlotCount() != 0)
        state.SkipWithError("the diagram was not cleared");
}

} // namespace

int main(int argc, char** argv)
{
    return RunWidgetBenchmarks(argc, argv, [] {
        benchmark::RegisterBenchmark("BM_DropSet", BM_DropSet)
            ->Arg(1700)
            ->Arg(100000)
            ->Arg(MillionSystems().CountItems())
            ->Unit(benchmark::kMillisecond);
        benchmark::RegisterBenchmark("BM_Selection", BM_Selection)->Unit(benchmark::kMicrosecond);
        benchmark::RegisterBenchmark("BM_Hover/empty", BM_Hover)
            ->Arg(0)
            ->Unit(benchmark::kMicrosecond);
        benchmark::RegisterBenchmark("BM_Hover/markers", BM_Hover)
            ->Arg(1)
            ->Unit(benchmark::kMicrosecond);
        benchmark::RegisterBenchmark("BM_Clear", BM_Clear)->Unit(benchmark::kMicrosecond);
    });
}
