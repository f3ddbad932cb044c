// ColorTableTest.cpp: the 16.16 fixed-point ramp of ColorTable, including its clamp and bounds.
#include "render/ColorTable.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <memory>

namespace {

constexpr rgb_color kSentinel = { 1, 2, 3, 4 };

struct FreeDeleter {
    void operator()(void* p) const { std::free(p); }
};

// Tables are allocated raw, as their owners do; every entry starts as the sentinel so that
// untouched entries can be told apart from written ones.
std::unique_ptr<ColorTable[], FreeDeleter> MakeTables(int count)
{
    auto* tables = static_cast<ColorTable*>(std::malloc(count * sizeof(ColorTable)));
    for (int k = 0; k < count; ++k) {
        tables[k].id = 0x5a5a5a5a;
        for (rgb_color& entry : tables[k].colors)
            entry = kSentinel;
    }
    return std::unique_ptr<ColorTable[], FreeDeleter>(tables);
}

void ExpectColor(const rgb_color& actual, int red, int green, int blue, int alpha, int index)
{
    EXPECT_EQ(actual.red, red) << "entry " << index;
    EXPECT_EQ(actual.green, green) << "entry " << index;
    EXPECT_EQ(actual.blue, blue) << "entry " << index;
    EXPECT_EQ(actual.alpha, alpha) << "entry " << index;
}

void ExpectSentinel(const rgb_color& actual, int index)
{
    ExpectColor(actual, kSentinel.red, kSentinel.green, kSentinel.blue, kSentinel.alpha, index);
}

} // namespace

TEST(ColorTable, RampFromBlackTo225StopsOneStepShortAndLeavesUpperHalfUntouched)
{
    auto tables = MakeTables(1);
    ColorTable& table = tables[0];
    table.BuildColorRamp(0, 128, { 0, 0, 0, 0 }, { 225, 225, 225, 0 });

    ExpectColor(table.colors[0], 0, 0, 0, 0, 0);
    // Step 225 * 65536 / 128 = 115200, i.e. 1.7578 per entry.
    ExpectColor(table.colors[1], 1, 1, 1, 0, 1);
    ExpectColor(table.colors[2], 3, 3, 3, 0, 2);
    ExpectColor(table.colors[64], 112, 112, 112, 0, 64);
    ExpectColor(table.colors[127], 223, 223, 223, 0, 127);
    for (int i = 0; i < 128; ++i) {
        const int expected = (i * 115200) >> 16;
        ExpectColor(table.colors[i], expected, expected, expected, 0, i);
    }
    for (int i = 128; i < 256; ++i)
        ExpectSentinel(table.colors[i], i);
    EXPECT_EQ(table.id, 0x5a5a5a5a);
}

TEST(ColorTable, DownwardRampUsesStepsTruncatedTowardZero)
{
    auto tables = MakeTables(1);
    ColorTable& table = tables[0];
    table.BuildColorRamp(20, 6, { 200, 4, 90, 77 }, { 10, 0, 90, 77 });

    // red:   step (10 - 200) * 65536 / 6 = -2075306 (toward zero; flooring would give -2075307)
    //        13107200, 11031894, 8956588, 6881282, 4805976, 2730670 -> 200 168 136 105 73 41
    // green: step -4 * 65536 / 6 = -43690 (flooring: -43691)
    //        262144, 218454, 174764, 131074, 87384, 43694 -> 4 3 2 2 1 0
    //        (with the floored step the fourth value would be 131071 -> 1)
    // blue:  step 0 -> 90 throughout
    const int red[6] = { 200, 168, 136, 105, 73, 41 };
    const int green[6] = { 4, 3, 2, 2, 1, 0 };
    for (int k = 0; k < 6; ++k)
        ExpectColor(table.colors[20 + k], red[k], green[k], 90, 0, 20 + k);
    ExpectSentinel(table.colors[19], 19);
    ExpectSentinel(table.colors[26], 26);
}

TEST(ColorTable, OverlongRampTakesCount256AndStopsAtLastEntry)
{
    // Two tables back to back: a ramp running off the end of the first must not reach the second.
    auto tables = MakeTables(2);
    tables[0].BuildColorRamp(200, 100, { 0, 0, 0, 0 }, { 255, 128, 64, 0 });

    for (int i = 0; i < 200; ++i)
        ExpectSentinel(tables[0].colors[i], i);
    // With the clamped count of 256 the steps are 65280, 32768 and 16384; entry 200 + k holds
    // k steps. A count of 100 would have given entry 255 = (140, 70, 35).
    ExpectColor(tables[0].colors[200], 0, 0, 0, 0, 200);
    ExpectColor(tables[0].colors[201], 0, 0, 0, 0, 201);
    ExpectColor(tables[0].colors[202], 1, 1, 0, 0, 202);
    ExpectColor(tables[0].colors[255], 54, 27, 13, 0, 255);
    for (int i = 0; i < 256; ++i)
        ExpectSentinel(tables[1].colors[i], i);
    EXPECT_EQ(tables[1].id, 0x5a5a5a5a);
}

TEST(ColorTable, RampStartsExactlyOnFromAtAnyStart)
{
    auto tables = MakeTables(1);
    ColorTable& table = tables[0];
    table.BuildColorRamp(250, 6, { 17, 250, 3, 200 }, { 0, 0, 255, 9 });

    ExpectColor(table.colors[250], 17, 250, 3, 0, 250);
    // Steps -185685, -2730666, 2752512: entry 255 is five steps on.
    ExpectColor(table.colors[255], 2, 41, 213, 0, 255);
    ExpectSentinel(table.colors[249], 249);
}

TEST(ColorTable, EmptyRampChangesNothing)
{
    auto tables = MakeTables(1);
    tables[0].BuildColorRamp(10, 0, { 0, 0, 0, 0 }, { 255, 255, 255, 0 });
    for (int i = 0; i < 256; ++i)
        ExpectSentinel(tables[0].colors[i], i);
}
