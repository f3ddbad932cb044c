// SpectralTablesTest.cpp: the seven spectral colour ramps and their installation in
// gSpectralCTable.
#include "render/SpectralTables.h"

#include <gtest/gtest.h>

#include <memory>

namespace {

struct TablesDeleter {
    void operator()(ColorTable* tables) const { FreeSpectralTables(tables); }
};
using Tables = std::unique_ptr<ColorTable, TablesDeleter>;

void ExpectColor(const rgb_color& actual, int red, int green, int blue, const char* where)
{
    EXPECT_EQ(actual.red, red) << where;
    EXPECT_EQ(actual.green, green) << where;
    EXPECT_EQ(actual.blue, blue) << where;
    EXPECT_EQ(actual.alpha, 0) << where;
}

} // namespace

TEST(SpectralTables, EachTableTakesItsClassColourAtEntry128)
{
    Tables tables(BuildSpectralTables());
    ASSERT_NE(tables, nullptr);
    const ColorTable* t = tables.get();
    ExpectColor(t[0].colors[128], 125, 125, 225, "O");
    ExpectColor(t[1].colors[128], 125, 150, 225, "B");
    ExpectColor(t[2].colors[128], 150, 225, 225, "A");
    ExpectColor(t[3].colors[128], 225, 225, 225, "F");
    ExpectColor(t[4].colors[128], 225, 225, 150, "G");
    ExpectColor(t[5].colors[128], 225, 150, 125, "K");
    ExpectColor(t[6].colors[128], 225, 125, 125, "M");
    for (int n = 0; n < kSpectralTableCount; ++n)
        ExpectColor(t[n].colors[0], 0, 0, 0, "entry 0");
}

TEST(SpectralTables, Entry127OfTheMTableIsOneStepShortOfItsClassColour)
{
    Tables tables(BuildSpectralTables());
    ASSERT_NE(tables, nullptr);
    // Steps 115200 and 64000: 127 of them give 223.2 and 124.0.
    ExpectColor(tables.get()[6].colors[127], 223, 124, 124, "M 127");
}

TEST(SpectralTables, Entry255OfEveryTableIsGreyOrOneStepShort)
{
    Tables tables(BuildSpectralTables());
    ASSERT_NE(tables, nullptr);
    const ColorTable* t = tables.get();
    // A channel that has to climb 100 or 75 in 128 steps ends at 224; one already at 225 stays.
    ExpectColor(t[0].colors[255], 224, 224, 225, "O 255");
    ExpectColor(t[1].colors[255], 224, 224, 225, "B 255");
    ExpectColor(t[2].colors[255], 224, 225, 225, "A 255");
    ExpectColor(t[3].colors[255], 225, 225, 225, "F 255");
    ExpectColor(t[4].colors[255], 225, 225, 224, "G 255");
    ExpectColor(t[5].colors[255], 225, 224, 224, "K 255");
    ExpectColor(t[6].colors[255], 225, 224, 224, "M 255");
}

TEST(SpectralTables, TableFRampsFromBlackToGreyThenStaysGrey)
{
    Tables tables(BuildSpectralTables());
    ASSERT_NE(tables, nullptr);
    const ColorTable& f = tables.get()[3];
    for (int i = 0; i < 128; ++i) {
        // 225 * 65536 / 128 = 115200 per entry.
        const int expected = (i * 115200) >> 16;
        ExpectColor(f.colors[i], expected, expected, expected, "F lower half");
    }
    ExpectColor(f.colors[127], 223, 223, 223, "F 127");
    for (int i = 128; i < 256; ++i)
        ExpectColor(f.colors[i], 225, 225, 225, "F upper half");
}

TEST(SpectralTables, TablesSitBackToBackInOneBlock)
{
    Tables tables(BuildSpectralTables());
    ASSERT_NE(tables, nullptr);
    const auto* bytes = reinterpret_cast<const unsigned char*>(tables.get());
    // Table 5 (K), entry 128, read at its byte offset: 1028 * 5 + 4 + 4 * 128.
    const unsigned char* entry = bytes + 1028 * 5 + 4 + 4 * 128;
    EXPECT_EQ(entry[0], 225);
    EXPECT_EQ(entry[1], 150);
    EXPECT_EQ(entry[2], 125);
    EXPECT_EQ(entry[3], 0);
    EXPECT_EQ(kSpectralTableCount * sizeof(ColorTable), 7196u);
}

TEST(SpectralTables, ScopedTablesInstallAndRestoreTheGlobal)
{
    ASSERT_EQ(gSpectralCTable, nullptr);
    {
        ScopedSpectralTables outer;
        ASSERT_NE(outer.Tables(), nullptr);
        EXPECT_EQ(gSpectralCTable, outer.Tables());
        ExpectColor(gSpectralCTable[6].colors[128], 225, 125, 125, "installed M");
        {
            ScopedSpectralTables inner;
            EXPECT_EQ(gSpectralCTable, inner.Tables());
            EXPECT_NE(inner.Tables(), outer.Tables());
        }
        EXPECT_EQ(gSpectralCTable, outer.Tables());
    }
    EXPECT_EQ(gSpectralCTable, nullptr);
}
