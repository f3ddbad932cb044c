// One whole frame of the chart (erase, star pass on all threads, foreground) for the real
// catalogue and for synthetic universes of 100,000 and 1,000,000 systems, with 1 and 2 threads,
// in the default view and in a view with every system in front of the camera.
#include "catalog/Universe.h"
#include "chart/UniverseView.h"
#include "core/Constants.h"
#include "render/SpectralTables.h"
#include "resources/ResourceData.h"

#include <QApplication>
#include <benchmark/benchmark.h>
#include <cmath>
#include <map>
#include <memory>
#include <random>

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

// range(0): 0 for the real catalogue, else a synthetic universe of that many systems;
// range(1): threads; range(2): 0 the default view, 1 every system in front; range(3): 1 blocks
// of systems for each thread, 0 single systems in turn.
void BM_Frame(benchmark::State& state)
{
    Universe* universe = UniverseOf(state.range(0));
    UniverseView view(BRect(0, 0, 639, 479), "UniverseView", universe, int32_t(state.range(1)));
    view.interleaveBlocks = state.range(3) != 0;
    view.InitOffscreen();
    if (state.range(2) == 1) {
        // Far enough back that the whole universe lies in front of the camera and on screen.
        double farthest = 0;
        for (int32_t i = 0; i < universe->CountItems(); i++)
            farthest = std::max(farthest, universe->SystemAt(i)->position.Magnitude());
        view.cameraDistance = 2.5 * farthest + 1;
        *view.GetRadialVelocityY() = 0;
        view.NextTransform();
    }
    view.HideGreaterThan(*view.GetDistanceFilter());
    view.CalculateLumCache();
    for (auto _ : state)
        view.Render();
    state.counters["systems"] = double(universe->CountItems());
}

} // namespace

BENCHMARK(BM_Frame)
    ->ArgNames({ "systems", "threads", "front", "blocks" })
    ->ArgsProduct({ { 0, 100000, 1000000 }, { 1, 2 }, { 0, 1 }, { 1 } })
    ->Args({ 1000000, 2, 0, 0 })
    ->Args({ 1000000, 2, 1, 0 })
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
