// Sets as CSV over a universe of a million systems with named stars; one core. The universe
// is built here, not taken from MillionSystems: the generated universe's random positions fall
// on a coarse lattice where many systems share one place, which no catalogue does and which
// would leave matching by position nothing to tell apart. Here positions are drawn from a
// 64-bit generator over a sphere of 150 parsecs, names and pairs as in MillionSystems.
//
// BM_MatcherBuild: the name map and the position index of every system, built once per list
// window at its first CSV drop.
// BM_WriteCsv: 100,000 systems picked at random written as a table (a row per star, about
// 112,000 rows).
// BM_ReadCsv/columns:<n>: that table read back into a set, the matcher built beforehand: 0,
// every column (matched by name, x, y, z at hand); 1, the name column alone; 2, x, y, z alone
// (matched by position).
#include "MillionSystems.h"
#include "catalog/Star.h"
#include "catalog/Universe.h"
#include "query/SystemMatcher.h"
#include "query/SystemSetCsv.h"

#include <benchmark/benchmark.h>
#include <cmath>
#include <cstdio>
#include <memory>
#include <random>
#include <string>
#include <vector>

namespace {

constexpr int32_t kSystems = 1000000;

const Universe& PlacedMillion()
{
    static const std::unique_ptr<Universe> universe = [] {
        auto u = std::make_unique<Universe>(5000);
        std::mt19937_64 random(7);
        std::uniform_real_distribution<double> unit(-1, 1);
        for (int32_t i = 0; i < kSystems; i++) {
            SVector p;
            do
                p = SVector(unit(random), unit(random), unit(random));
            while (p.x * p.x + p.y * p.y + p.z * p.z > 1);
            p.Scale(150);
            auto* system = new StarSystem("", p, 1, nullptr, 2);
            AddCatalogueStars(system, i, random);
            u->AddItem(system);
        }
        return u;
    }();
    return *universe;
}

const StarSysMask& Picked()
{
    static const std::unique_ptr<StarSysMask> set = [] {
        const int32_t systems = PlacedMillion().CountItems();
        auto picked = std::make_unique<StarSysMask>(systems, false, 0);
        std::mt19937 random(11);
        for (int32_t n = 0; n < 100000;) {
            const auto index = int32_t(random() % uint32_t(systems));
            if (!picked->GetStateSafe(index)) {
                picked->SetStateSafe(index, true);
                n++;
            }
        }
        return picked;
    }();
    return *set;
}

const SystemMatcher& Matcher()
{
    static const SystemMatcher matcher(&PlacedMillion());
    return matcher;
}

// The written table with only some of its columns: 0 all, 1 the name alone, 2 x, y, z alone.
std::string Table(int columns)
{
    const std::string all = SystemSetCsv::Write(PlacedMillion(), Picked());
    if (columns == 0)
        return all;
    std::string out;
    size_t begin = 0;
    while (begin < all.size()) {
        const size_t end = all.find("\r\n", begin);
        const std::string line = all.substr(begin, end - begin);
        begin = end + 2;
        // The generated names hold no comma: a line splits at every comma.
        std::vector<std::string> fields;
        size_t from = 0;
        for (size_t comma; (comma = line.find(',', from)) != std::string::npos; from = comma + 1)
            fields.push_back(line.substr(from, comma - from));
        fields.push_back(line.substr(from));
        out += columns == 1 ? fields[0] : fields[6] + "," + fields[7] + "," + fields[8];
        out += "\r\n";
    }
    return out;
}

void BM_MatcherBuild(benchmark::State& state)
{
    const Universe& universe = PlacedMillion();
    for (auto _ : state) {
        SystemMatcher matcher(&universe);
        benchmark::DoNotOptimize(matcher.ByName("HIP 100000", std::nullopt));
    }
}

void BM_WriteCsv(benchmark::State& state)
{
    const Universe& universe = PlacedMillion();
    const StarSysMask& set = Picked();
    size_t bytes = 0;
    for (auto _ : state) {
        const std::string text = SystemSetCsv::Write(universe, set);
        bytes = text.size();
        benchmark::DoNotOptimize(text.data());
    }
    state.counters["bytes"] = double(bytes);
}

void BM_ReadCsv(benchmark::State& state)
{
    const std::string text = Table(int(state.range(0)));
    const SystemMatcher& matcher = Matcher();
    StarSysMask found(PlacedMillion().CountItems(), false, 0);
    SystemSetCsvResult result;
    for (auto _ : state) {
        result = SystemSetCsv::Read(text, matcher, &found);
        benchmark::DoNotOptimize(found.states);
    }
    state.counters["rows"] = double(result.rows);
    if (!result.ok || result.systems != 100000 || !result.unmatchedLines.empty())
        state.SkipWithError("the table did not read back as the set written");
}

} // namespace

BENCHMARK(BM_MatcherBuild)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_WriteCsv)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_ReadCsv)
    ->Arg(0)
    ->Arg(1)
    ->Arg(2)
    ->ArgNames({ "columns" })
    ->Unit(benchmark::kMillisecond);

BENCHMARK_MAIN();
