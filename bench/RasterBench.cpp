// RasterBench.cpp: additive point writes and 64 x 64 additive glow blits, the fast kernel
// against the plain reference.
#include "core/MessageCodes.h"
#include "platform/Resources.h"
#include "render/RBitmap8.h"
#include "resources/ResourceData.h"

#include <benchmark/benchmark.h>

#include <cstdlib>
#include <random>
#include <vector>

namespace {

struct Fixture {
    Fixture()
        : bitmap(BRect(0.0f, 0.0f, 639.0f, 479.0f))
        , glow(BRect(0.0f, 0.0f, 63.0f, 63.0f))
        , table(static_cast<ColorTable*>(std::malloc(sizeof(ColorTable))))
    {
        InitResources();
        glow.LoadFromResource(int32_t(kRaw8Type), 5, 0, 4096);
        std::mt19937 random(7);
        for (int i = 0; i < 256; ++i)
            table->colors[i] = { uint8_t(i * 3 / 4), uint8_t(i * 3 / 4), uint8_t(i), 0 };
        for (int i = 0; i < kPoints; ++i) {
            xs.push_back(int32_t(random() % 640));
            ys.push_back(int32_t(random() % 480));
            levels.push_back(uint8_t(random()));
        }
        bitmap.EraseMap(0);
    }
    ~Fixture() { std::free(table); }

    static constexpr int kPoints = 4096;
    RBitmap8 bitmap;
    RBitmap8 glow;
    ColorTable* table;
    std::vector<int32_t> xs, ys;
    std::vector<uint8_t> levels;
};

Fixture& Shared()
{
    static Fixture fixture;
    return fixture;
}

void BM_PointAdd(benchmark::State& state)
{
    Fixture& f = Shared();
    for (auto _ : state) {
        for (int i = 0; i < Fixture::kPoints; ++i)
            f.bitmap.RenderPointAdd(f.xs[i], f.ys[i], f.table, f.levels[i]);
        benchmark::ClobberMemory();
    }
    state.SetItemsProcessed(state.iterations() * Fixture::kPoints);
}
BENCHMARK(BM_PointAdd);

void BM_PointAddReference(benchmark::State& state)
{
    Fixture& f = Shared();
    for (auto _ : state) {
        for (int i = 0; i < Fixture::kPoints; ++i)
            f.bitmap.RenderPointAddReference(f.xs[i], f.ys[i], f.table, f.levels[i]);
        benchmark::ClobberMemory();
    }
    state.SetItemsProcessed(state.iterations() * Fixture::kPoints);
}
BENCHMARK(BM_PointAddReference);

void BM_GlowBlitAdd(benchmark::State& state)
{
    Fixture& f = Shared();
    int i = 0;
    for (auto _ : state) {
        f.bitmap.RenderBitmapAdd(f.xs[i] % 576, f.ys[i] % 416, &f.glow, 64, f.table);
        i = (i + 1) % Fixture::kPoints;
        benchmark::ClobberMemory();
    }
    state.SetItemsProcessed(state.iterations());
}
BENCHMARK(BM_GlowBlitAdd);

// The same blit written with the reference point write per pixel (size 64 samples 1:1).
void BM_GlowBlitAddReference(benchmark::State& state)
{
    Fixture& f = Shared();
    int i = 0;
    const uint8_t* glow = f.glow.Bits();
    for (auto _ : state) {
        const int32_t x = f.xs[i] % 576, y = f.ys[i] % 416;
        for (int j = 0; j < 64; ++j)
            for (int k = 0; k < 64; ++k)
                f.bitmap.RenderPointAddReference(x + k, y + j, f.table, glow[j * 64 + k]);
        i = (i + 1) % Fixture::kPoints;
        benchmark::ClobberMemory();
    }
    state.SetItemsProcessed(state.iterations());
}
BENCHMARK(BM_GlowBlitAddReference);

} // namespace

BENCHMARK_MAIN();
