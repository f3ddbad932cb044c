// One whole frame of the chart (erase, star pass on all threads, foreground) for the real
// catalogue and for synthetic universes of 100,000 and 1,000,000 systems, with 1 to 8 threads,
// in the default view and in a view with every system in front of the camera, in the chart's
// own window size and in a maximised one. Every frame benchmark also times the least work the
// frame must do (LimitKernel.h) on the same view and reports it as limit_ms, and the frame's
// ratio to it as over_limit: milliseconds move with the machine and the minute, the ratio
// much less.
#include "LimitKernel.h"

#include "catalog/Universe.h"
#include "chart/UniverseView.h"
#include "core/Constants.h"
#include "render/SpectralTables.h"
#include "resources/ResourceData.h"

#include <QApplication>
#include <QCoreApplication>
#include <algorithm>
#include <benchmark/benchmark.h>
#include <chrono>
#include <cmath>
#include <map>
#include <memory>
#include <mutex>
#include <random>
#include <utility>

namespace {

// Systems spread evenly through a sphere at the Sun's neighbourhood's density (about 0.07 a
// cubic parsec), with magnitudes and classes spread like a catalogue's.
std::unique_ptr<Universe> Synthetic(int32_t count)
{
    auto universe = std::make_unique<Universe>(5000);
    const double radius = std::cbrt(3.0 * count / (4 * kPI * 0.07));
    std::mt19937_64 random(42);
    auto uniform = [&] { return double(random() >> 11) * 0x1.0p-53; };
    universe->AddItem(
        new StarSystem("The Sun", SVector(0, 0, 0), 0.887, SpectralTableFor(kClassG), 2));
    for (int32_t i = 1; i < count; i++) {
        const double r = radius * std::cbrt(uniform());
        const double ra = (kPI + kPI) * uniform(), dec = std::asin(2 * uniform() - 1);
        const double magnitude = -2 + 16 * uniform();
        universe->AddItem(new StarSystem("",
            SVector(r * std::cos(dec) * std::cos(ra), r * std::sin(dec),
                r * std::cos(dec) * std::sin(ra)),
            std::pow(2.512, 4.7 - magnitude), SpectralTableFor(HarvardClass(1 + random() % 7)), 2));
    }
    return universe;
}

Universe* UniverseOf(int64_t which)
{
    static std::map<int64_t, std::unique_ptr<Universe>> universes;
    auto& u = universes[which];
    if (!u) {
        if (which == 0)
            u = std::make_unique<Universe>(ND_APP_DIR "/stars.dat", 1000000, 5000);
        else
            u = Synthetic(int32_t(which));
    }
    return u.get();
}

// The chart's frame in milliseconds of the limit kernel on one thread: the median of several
// runs over the view's data as it stands.
double LimitMilliseconds(UniverseView& view)
{
    const BRect& frame = view.Frame();
    const int32_t pitch = int32_t(frame.right) + 1;
    std::vector<uint8_t> pixels(size_t(pitch) * size_t(frame.bottom + 1));
    std::vector<double> runs;
    int64_t visible = 0;
    for (int run = 0; run < 9; run++) {
        const auto start = std::chrono::steady_clock::now();
        visible += LimitKernel(
            view.PassData(), view.transform, view.focalLength, frame, pixels.data(), pitch);
        runs.push_back(
            std::chrono::duration<double, std::milli>(std::chrono::steady_clock::now() - start)
                .count());
    }
    benchmark::DoNotOptimize(visible);
    benchmark::DoNotOptimize(pixels.data());
    std::nth_element(runs.begin(), runs.begin() + 4, runs.end());
    return runs[4];
}

// A view of the frame benchmarks, set up for its first frame: the default view, or (front) far
// enough back that the whole universe lies in front of the camera and on screen.
std::unique_ptr<UniverseView> FrameView(
    Universe* universe, int32_t threads, bool front, bool blocks, bool big)
{
    auto view = std::make_unique<UniverseView>(
        BRect(0, 0, big ? 1919 : 639, big ? 1060 : 479), "UniverseView", universe, threads);
    view->interleaveBlocks = blocks;
    view->InitOffscreen();
    if (front) {
        double farthest = 0;
        for (int32_t i = 0; i < universe->CountItems(); i++)
            farthest = std::max(farthest, universe->SystemAt(i)->position.Magnitude());
        view->cameraDistance = 2.5 * farthest + 1;
        *view->GetRadialVelocityY() = 0;
        view->NextTransform();
    }
    view->HideGreaterThan(*view->GetDistanceFilter());
    view->CalculateLumCache();
    return view;
}

// Milliseconds a frame of each view, drawn in turns of a few frames, one view after the other,
// so that both meet the machine as it is in the same few milliseconds: the ratio of the two is
// what a second thread gains, free of the minutes-long swings of a shared machine.
std::pair<double, double> PairedMilliseconds(UniverseView& a, UniverseView& b)
{
    constexpr int kTurns = 12, kWarm = 2, kTimed = 6;
    double ms[2] = {};
    for (int turn = 0; turn < kTurns; turn++) {
        int k = 0;
        for (UniverseView* view : { &a, &b }) {
            for (int frame = 0; frame < kWarm; frame++)
                view->Render();
            const auto start = std::chrono::steady_clock::now();
            for (int frame = 0; frame < kTimed; frame++)
                view->Render();
            ms[k++] += std::chrono::duration<double, std::milli>(
                std::chrono::steady_clock::now() - start)
                           .count();
        }
    }
    return { ms[0] / (kTurns * kTimed), ms[1] / (kTurns * kTimed) };
}

// range(0): 0 for the real catalogue, else a synthetic universe of that many systems;
// range(1): threads; range(2): 0 the default view, 1 every system in front; range(3): 1 blocks
// of systems for each thread, 0 single systems in turn; range(4): the frame's width, 640 the
// chart's own 640 x 480, 1920 a maximised 1920 x 1061. With more than one thread, speedup is
// the one-thread frame's time over this one's, the two drawn in turns (PairedMilliseconds).
void BM_Frame(benchmark::State& state)
{
    Universe* universe = UniverseOf(state.range(0));
    const int32_t threads = int32_t(state.range(1));
    const bool front = state.range(2) == 1, blocks = state.range(3) != 0;
    const bool big = state.range(4) == 1920;
    const auto view = FrameView(universe, threads, front, blocks, big);
    const double limit = LimitMilliseconds(*view);
    const auto start = std::chrono::steady_clock::now();
    for (auto _ : state)
        view->Render();
    const double frame
        = std::chrono::duration<double, std::milli>(std::chrono::steady_clock::now() - start)
              .count()
        / double(std::max<benchmark::IterationCount>(state.iterations(), 1));
    state.counters["systems"] = double(universe->CountItems());
    state.counters["limit_ms"] = limit;
    state.counters["over_limit"] = frame / limit;
    if (threads > 1) {
        const auto single = FrameView(universe, 1, front, blocks, big);
        const auto [one, many] = PairedMilliseconds(*single, *view);
        state.counters["speedup"] = one / many;
    }
}

// A chart running as in the program, shown (on the offscreen platform) and turning, its frames
// handed over and painted on this thread: the time from one frame's start to the next's, as
// the render threads meet them, over three seconds. range(0), range(1), range(4) as for
// BM_Frame; two threads or more (a worker marks each frame's start).
void BM_RunningChart(benchmark::State& state)
{
    Universe* universe = UniverseOf(state.range(0));
    const bool big = state.range(4) == 1920;
    const int32_t width = big ? 1920 : 640, height = big ? 1061 : 480;
    std::mutex lock;
    std::vector<std::chrono::steady_clock::time_point> starts;
    for (auto _ : state) {
        UniverseView view(BRect(0, 0, float(width - 1), float(height - 1)), "UniverseView",
            universe, int32_t(state.range(1)));
        view.resize(width, height);
        view.SetShareHook([&](int32_t share) {
            if (share == 1) {
                std::lock_guard hold(lock);
                starts.push_back(std::chrono::steady_clock::now());
            }
        });
        view.show();
        view.AttachedToWindow();
        const auto end = std::chrono::steady_clock::now() + std::chrono::seconds(3);
        while (std::chrono::steady_clock::now() < end)
            QCoreApplication::processEvents(QEventLoop::AllEvents, 5);
        view.DetachedFromWindow();
    }
    std::vector<double> gaps;
    for (size_t i = 1; i < starts.size(); i++)
        gaps.push_back(
            std::chrono::duration<double, std::milli>(starts[i] - starts[i - 1]).count());
    std::sort(gaps.begin(), gaps.end());
    state.counters["frames"] = double(starts.size());
    state.counters["max_ms"] = gaps.empty() ? 0 : gaps.back();
    state.counters["p99_ms"] = gaps.empty() ? 0 : gaps[gaps.size() * 99 / 100];
    state.counters["median_ms"] = gaps.empty() ? 0 : gaps[gaps.size() / 2];
}

// The limit kernel alone over a million systems in the default view: systems a second.
void BM_LimitKernel(benchmark::State& state)
{
    Universe* universe = UniverseOf(1000000);
    UniverseView view(BRect(0, 0, 639, 479), "UniverseView", universe, 1);
    view.InitOffscreen();
    view.HideGreaterThan(*view.GetDistanceFilter());
    std::vector<uint8_t> pixels(640 * 480);
    int64_t onScreen = 0;
    for (auto _ : state) {
        onScreen = LimitKernel(
            view.PassData(), view.transform, view.focalLength, view.Frame(), pixels.data(), 640);
        benchmark::DoNotOptimize(onScreen);
        benchmark::ClobberMemory();
    }
    state.SetItemsProcessed(state.iterations() * universe->CountItems());
    state.counters["on_screen"] = double(onScreen);
}

} // namespace

BENCHMARK(BM_Frame)
    ->ArgNames({ "systems", "threads", "front", "blocks", "width" })
    ->ArgsProduct({ { 0, 100000, 1000000 }, { 1, 2 }, { 0, 1 }, { 1 }, { 640 } })
    ->ArgsProduct({ { 1000000 }, { 4, 8 }, { 0, 1 }, { 1 }, { 640 } })
    ->ArgsProduct({ { 0, 1000000 }, { 1, 2 }, { 0 }, { 1 }, { 1920 } })
    ->Args({ 1000000, 2, 0, 0, 640 })
    ->Args({ 1000000, 2, 1, 0, 640 })
    ->Unit(benchmark::kMillisecond)
    ->UseRealTime();

BENCHMARK(BM_LimitKernel)->Unit(benchmark::kMillisecond)->UseRealTime();

BENCHMARK(BM_RunningChart)
    ->ArgNames({ "systems", "threads", "front", "blocks", "width" })
    ->Args({ 1000000, 2, 0, 1, 1920 })
    ->Args({ 1000000, 2, 0, 1, 640 })
    ->Args({ 0, 2, 0, 1, 1920 })
    ->Iterations(1)
    ->Unit(benchmark::kMillisecond)
    ->UseRealTime();

int main(int argc, char** argv)
{
    qputenv("QT_QPA_PLATFORM", "offscreen");
    QApplication application(argc, argv);
    InitResources();
    ScopedSpectralTables tables;
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    return 0;
}
