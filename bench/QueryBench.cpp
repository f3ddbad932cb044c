// The six queries and the mask operators over a universe of a million systems, each system
// with one or two named stars, and the name query again with the stars' other names; one core.
#include "bench/MillionSystems.h"
#include "query/DECQuery.h"
#include "query/DistanceQuery.h"
#include "query/MGQuery.h"
#include "query/RAQuery.h"
#include "query/SCQuery.h"
#include "query/StarNameQuery.h"
#include "query/StarSysMask.h"

#include <benchmark/benchmark.h>

namespace {

void RunQuery(benchmark::State& state, StarSysQuery& query, void* param)
{
    Universe& universe = *query.universe;
    StarSysMask mask(universe.CountItems(), false, 0);
    int32_t found = 0;
    for (auto _ : state) {
        found = query.GetSysMask(&mask, param);
        benchmark::DoNotOptimize(mask.states);
        benchmark::ClobberMemory();
    }
    state.counters["systems"] = universe.CountItems();
    state.counters["found"] = found;
    state.SetItemsProcessed(state.iterations() * universe.CountItems());
}

void BM_DistanceQuery(benchmark::State& state)
{
    DistanceQuery query(&MillionSystems());
    DistanceQueryParam param { kQueryIs, -1, 100 };
    RunQuery(state, query, &param);
}

void BM_RAQuery(benchmark::State& state)
{
    RAQuery query(&MillionSystems());
    RAQueryParam param { kQueryLessThan, 1.0 };
    RunQuery(state, query, &param);
}

void BM_DECQuery(benchmark::State& state)
{
    DECQuery query(&MillionSystems());
    DECQueryParam param { kQueryIs, 0.3 };
    RunQuery(state, query, &param);
}

void BM_MGQuery(benchmark::State& state)
{
    MGQuery query(&MillionSystems());
    MGQueryParam param { kQueryIs, kAnyStarInSystem, 4.83 };
    RunQuery(state, query, &param);
}

void BM_SCQuery(benchmark::State& state)
{
    SCQuery query(&MillionSystems());
    const SpectralClass wanted("G2V");
    SCQueryParam param { kQueryGreaterThan, kAnyStarInSystem, &wanted };
    RunQuery(state, query, &param);
}

// range(0): the name mode; range(1): 1 when case matters.
void BM_StarNameQuery(benchmark::State& state)
{
    StarNameQuery query(&MillionSystems());
    static const char* kTexts[] = { "HIP 123456", "3456 B", "HIP 1234" };
    const auto mode = static_cast<int32_t>(state.range(0));
    NameQueryParam param { mode, kTexts[mode], state.range(1) != 0 };
    RunQuery(state, query, &param);
}

// The same searches where every star also goes by about 3.5 other names (Gaia DR3, Tycho, HD,
// Gliese), as in a sky made from Gaia and Hipparcos: each name is tested as well as the stars'
// own. range(0): the name mode; range(1): 1 when case matters.
void BM_StarNameQueryOtherNames(benchmark::State& state)
{
    Universe& universe = MillionSystemsWithOtherNames();
    StarNameQuery query(&universe);
    static const char* kTexts[] = { "HIP 123456", "3456 B", "HIP 1234" };
    const auto mode = static_cast<int32_t>(state.range(0));
    NameQueryParam param { mode, kTexts[mode], state.range(1) != 0 };
    RunQuery(state, query, &param);
    state.counters["names"] = double(universe.otherNames.Count());
    state.counters["name_bytes"] = double(universe.otherNames.Bytes());
}

// A mask of the universe's size combined, again and again, with another of unrelated contents;
// range(0) picks the operation. work starts empty, so FindFirst scans the whole mask.
void BM_MaskOperator(benchmark::State& state)
{
    static const char* kNames[] = { "operator=", "operator+=", "operator-=", "operator&=",
        "operator|=", "operator^=", "operator~", "CountItems", "FindFirst", "SetAll" };
    state.SetLabel(kNames[state.range(0)]);
    const int32_t count = MillionSystems().CountItems();
    StarSysMask a(count, false, 0);
    StarSysMask b(count, false, 0);
    for (int32_t i = 0; i < count; i++) {
        a.SetStateSafe(i, (i * 7919) % 13 < 6);
        b.SetStateSafe(i, (i * 104729) % 11 < 5);
    }
    StarSysMask work(count, false, 0);
    int64_t ones = 0;
    for (auto _ : state) {
        switch (state.range(0)) {
        case 0:
            work = a;
            break;
        case 1:
            work += b;
            break;
        case 2:
            work -= b;
            break;
        case 3:
            work &= b;
            break;
        case 4:
            work |= b;
            break;
        case 5:
            work ^= b;
            break;
        case 6:
            ~work;
            break;
        case 7:
            ones = work.CountItems(true);
            break;
        case 8:
            ones = work.FindFirst();
            break;
        case 9:
            work.SetAll(false);
            break;
        }
        benchmark::DoNotOptimize(work.states);
        benchmark::DoNotOptimize(ones);
        benchmark::ClobberMemory();
    }
    state.SetBytesProcessed(state.iterations() * count);
}

} // namespace

BENCHMARK(BM_DistanceQuery)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_RAQuery)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_DECQuery)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_MGQuery)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_SCQuery)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_StarNameQuery)
    ->ArgNames({ "mode", "case" })
    ->ArgsProduct({ { 0, 1, 2 }, { 0, 1 } })
    ->Unit(benchmark::kMillisecond);
BENCHMARK(BM_StarNameQueryOtherNames)
    ->ArgNames({ "mode", "case" })
    ->ArgsProduct({ { 0, 1, 2 }, { 0, 1 } })
    ->Unit(benchmark::kMillisecond);
BENCHMARK(BM_MaskOperator)->DenseRange(0, 9)->Unit(benchmark::kMicrosecond);

BENCHMARK_MAIN();
