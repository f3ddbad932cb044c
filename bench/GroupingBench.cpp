// The importer's grouping of stars into systems over three million stars, on one core: a sky
// like the real one, the same with one star far nearer than any real one, and a sky crowded
// with near stars.
#include "core/Constants.h"
#include "tools/importer/SystemGrouping.h"

#include <benchmark/benchmark.h>

#include <cmath>
#include <random>
#include <string>
#include <vector>

namespace {

constexpr size_t kStars = 3000000;
// The widest angle (radians) the grouping allows a pair at one parsec.
constexpr double kAngleAtOneParsec = kMaxSeparationAU / 206264.806;

enum class Spread {
    EvenInSpace, // distances 2 to 1,000 pc, as many stars in each cubic parsec
    EvenInParallax, // parallaxes 1 to 500 mas, as many stars in each mas: crowded near the Sun
};

// Stars on a random sky with parallaxes from 1 to 500 mas, one in eight with a companion
// closer than the grouping's limit whose parallax is 1% larger.
std::vector<ImportStar> Catalogue(Spread spread, bool withNearest)
{
    std::mt19937_64 random(20260507);
    auto uniform = [&](double low, double high) {
        return low + (high - low) * static_cast<double>(random() >> 11) * 0x1.0p-53;
    };
    std::vector<ImportStar> stars;
    stars.reserve(kStars + 1);
    auto add = [&](double ra, double dec, double parallax) {
        ImportStar star;
        star.ra = ra;
        star.dec = dec;
        star.parallax = parallax;
        star.absoluteMagnitude = uniform(-2, 15);
        star.spectralClass = "G2V";
        star.name = "S" + std::to_string(stars.size());
        stars.push_back(std::move(star));
    };
    if (withNearest)
        add(1.0, 0.3, 9999999);
    while (stars.size() < kStars) {
        const double parallax
            = spread == Spread::EvenInSpace ? 1000 / std::cbrt(uniform(8, 1e9)) : uniform(1, 500);
        const double ra = uniform(0, 2 * kPI), dec = std::asin(uniform(-1, 1));
        add(ra, dec, parallax);
        if (random() % 8 == 0) {
            // Straight north or south, within the limit at this distance.
            const double angle = uniform(-0.9, 0.9) * kAngleAtOneParsec * parallax / 1000;
            add(ra, std::asin(std::sin(dec + angle)), parallax * 1.01);
        }
    }
    return stars;
}

void Group(benchmark::State& state, const std::vector<ImportStar>& stars)
{
    GroupingStats stats;
    size_t systems = 0;
    for (auto _ : state) {
        const auto grouped = GroupSystems(stars, &stats);
        systems = grouped.size();
        benchmark::DoNotOptimize(grouped.data());
    }
    state.counters["stars"] = static_cast<double>(stars.size());
    state.counters["systems"] = static_cast<double>(systems);
    state.counters["candidates/star"]
        = static_cast<double>(stats.candidatePairs) / static_cast<double>(stars.size());
    state.SetItemsProcessed(state.iterations() * static_cast<int64_t>(stars.size()));
}

void BM_GroupSkyLike(benchmark::State& state)
{
    Group(state, Catalogue(Spread::EvenInSpace, false));
}

void BM_GroupSkyLikeWithOneNearest(benchmark::State& state)
{
    Group(state, Catalogue(Spread::EvenInSpace, true));
}

void BM_GroupCrowded(benchmark::State& state)
{
    Group(state, Catalogue(Spread::EvenInParallax, false));
}

} // namespace

BENCHMARK(BM_GroupSkyLike)->Unit(benchmark::kMillisecond)->Iterations(2);
BENCHMARK(BM_GroupSkyLikeWithOneNearest)->Unit(benchmark::kMillisecond)->Iterations(2);
BENCHMARK(BM_GroupCrowded)->Unit(benchmark::kMillisecond)->Iterations(2);

BENCHMARK_MAIN();
