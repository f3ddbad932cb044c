// ColorMapTest.cpp: borrowing and owning ColorMaps, their shifted ramp, nearest-colour search and
// the partial inverse map of InitIndexMap.
#include "render/ColorMap.h"
#include "render/SysColorMap.h"
#include "render/SystemPalette.h"

#include <gtest/gtest.h>

#include <cstring>
#include <memory>

namespace {

constexpr rgb_color kSentinel = { 9, 8, 7, 6 };

bool SameColor(const rgb_color& a, const rgb_color& b)
{
    return a.red == b.red && a.green == b.green && a.blue == b.blue && a.alpha == b.alpha;
}

// An owned map with every colour set to the sentinel, so that all of color_list is determinate.
void NewSentinelMap(ColorMap& colorMap, int32_t id)
{
    colorMap.NewMap(id);
    for (int i = 0; i < 256; ++i)
        colorMap.SetIndex(i, kSentinel);
}

// GetMap hands out the map read-only; after NewMap that map is the handle's own malloc'd block,
// so the tests may write to it to prepare its contents.
color_map* Writable(ColorMap& colorMap)
{
    return const_cast<color_map*>(colorMap.GetMap());
}

} // namespace

TEST(ColorMap, NullMapBorrowsTheSystemPalette)
{
    ColorMap colorMap(nullptr);
    EXPECT_EQ(colorMap.GetMap(), system_colors());
    ColorMap byDefault;
    EXPECT_EQ(byDefault.GetMap(), system_colors());
}

TEST(ColorMap, SysColorMapBorrowsTheSystemPalette)
{
    SysColorMap colorMap;
    EXPECT_EQ(colorMap.GetMap(), system_colors());
}

TEST(ColorMap, GivenMapIsBorrowedAndLeftAlone)
{
    auto borrowed = std::make_unique<color_map>();
    for (rgb_color& entry : borrowed->color_list)
        entry = kSentinel;
    std::memset(borrowed->index_map, 0x33, sizeof(borrowed->index_map));
    const auto before = std::make_unique<color_map>(*borrowed);

    {
        ColorMap colorMap(borrowed.get());
        EXPECT_EQ(colorMap.GetMap(), borrowed.get());
        // Owned-map operations do nothing to a borrowed map.
        colorMap.SetIndex(5, { 1, 1, 1, 1 });
        colorMap.BuildColorRamp(0, 16, { 0, 0, 0, 0 }, { 255, 255, 255, 0 });
        colorMap.InitIndexMap();
    }
    EXPECT_EQ(std::memcmp(borrowed.get(), before.get(), sizeof(color_map)), 0);
}

TEST(ColorMap, NewMapOwnsAFreshMapWithClearedColours)
{
    ColorMap colorMap;
    colorMap.NewMap(42);
    const color_map* owned = colorMap.GetMap();
    ASSERT_NE(owned, nullptr);
    EXPECT_NE(owned, system_colors());
    EXPECT_EQ(owned->id, 42);
    for (int i = 0; i < 256; ++i) {
        EXPECT_EQ(owned->color_list[i].red, 0) << i;
        EXPECT_EQ(owned->color_list[i].green, 0) << i;
        EXPECT_EQ(owned->color_list[i].blue, 0) << i;
    }

    // A second NewMap releases the first (the leak checker would notice otherwise) and starts
    // over with cleared colours.
    colorMap.SetIndex(3, { 50, 60, 70, 80 });
    colorMap.NewMap(43);
    ASSERT_NE(colorMap.GetMap(), nullptr);
    EXPECT_EQ(colorMap.GetMap()->id, 43);
    EXPECT_EQ(colorMap.GetMap()->color_list[3].red, 0);
    EXPECT_EQ(colorMap.GetMap()->color_list[3].blue, 0);
}

TEST(ColorMap, SetIndexWritesOneEntryAndIgnoresIndicesOutsideThePalette)
{
    ColorMap colorMap;
    NewSentinelMap(colorMap, 1);
    const rgb_color color = { 10, 20, 30, 40 };
    colorMap.SetIndex(5, color);
    colorMap.SetIndex(-1, color);
    colorMap.SetIndex(256, color);
    colorMap.SetIndex(255, { 1, 2, 3, 255 });

    const color_map* owned = colorMap.GetMap();
    EXPECT_TRUE(SameColor(owned->color_list[5], color));
    EXPECT_TRUE(SameColor(owned->color_list[255], { 1, 2, 3, 255 }));
    for (int i = 0; i < 255; ++i) {
        if (i != 5) {
            EXPECT_TRUE(SameColor(owned->color_list[i], kSentinel)) << i;
        }
    }
}

TEST(ColorMap, SetMapReleasesTheOwnedMapAndBorrows)
{
    auto borrowed = std::make_unique<color_map>();
    ColorMap colorMap;
    NewSentinelMap(colorMap, 7);
    colorMap.SetMap(borrowed.get());
    EXPECT_EQ(colorMap.GetMap(), borrowed.get());
    // No longer owning: SetIndex must not write into the borrowed map.
    colorMap.SetIndex(0, { 1, 2, 3, 4 });
    EXPECT_TRUE(SameColor(borrowed->color_list[0], { 0, 0, 0, 0 }));
}

TEST(ColorMap, BuildColorRampLandsOneSlotAboveSetIndex)
{
    ColorMap colorMap;
    NewSentinelMap(colorMap, 1);
    // Steps of exactly 10, 20 and 30 per position.
    colorMap.BuildColorRamp(0, 4, { 0, 0, 0, 0 }, { 40, 80, 120, 0 });

    const color_map* owned = colorMap.GetMap();
    EXPECT_TRUE(SameColor(owned->color_list[0], kSentinel));
    EXPECT_TRUE(SameColor(owned->color_list[1], { 0, 0, 0, 0 }));
    EXPECT_TRUE(SameColor(owned->color_list[2], { 10, 20, 30, 0 }));
    EXPECT_TRUE(SameColor(owned->color_list[3], { 20, 40, 60, 0 }));
    EXPECT_TRUE(SameColor(owned->color_list[4], { 30, 60, 90, 0 }));
    EXPECT_TRUE(SameColor(owned->color_list[5], kSentinel));
}

TEST(ColorMap, FullRangeRampDropsItsLastPosition)
{
    ColorMap colorMap;
    NewSentinelMap(colorMap, 1);
    // Position i lands in entry i + 1, so position 255 has nowhere to go and entry 0 keeps its
    // colour.
    colorMap.BuildColorRamp(0, 256, { 0, 0, 0, 0 }, { 255, 255, 255, 0 });

    const color_map* owned = colorMap.GetMap();
    EXPECT_TRUE(SameColor(owned->color_list[0], kSentinel));
    for (int i = 1; i < 256; ++i) {
        // Step 255 * 65536 / 256 = 65280 per position.
        const int expected = ((i - 1) * 65280) >> 16;
        EXPECT_TRUE(SameColor(
            owned->color_list[i], { uint8_t(expected), uint8_t(expected), uint8_t(expected), 0 }))
            << i;
    }
    EXPECT_EQ(owned->color_list[255].red, 253);
}

TEST(ColorMap, FindNearestMatchPrefersTheLowestIndexOnATie)
{
    ColorMap colorMap;
    colorMap.NewMap(1);
    for (int i = 0; i < 256; ++i)
        colorMap.SetIndex(i, { 200, 200, 200, 255 });
    colorMap.SetIndex(7, { 10, 20, 30, 255 });
    colorMap.SetIndex(3, { 10, 20, 30, 0 });

    EXPECT_EQ(colorMap.FindNearestMatch({ 10, 20, 30, 255 }), 3);
    EXPECT_EQ(colorMap.FindNearestMatch({ 12, 21, 30, 255 }), 3);
    // A strictly nearer entry wins whatever its index.
    colorMap.SetIndex(9, { 12, 20, 30, 255 });
    EXPECT_EQ(colorMap.FindNearestMatch({ 12, 21, 30, 255 }), 9);
}

TEST(ColorMap, FindNearestMatchUsesCityBlockDistance)
{
    ColorMap colorMap;
    colorMap.NewMap(1);
    for (int i = 0; i < 256; ++i)
        colorMap.SetIndex(i, { 255, 255, 255, 255 });
    // From (100, 100, 100): entry 1 is 30 away city-block (about 30 Euclidean), entry 2 is 33
    // away city-block but only about 19 Euclidean.
    colorMap.SetIndex(1, { 130, 100, 100, 255 });
    colorMap.SetIndex(2, { 111, 111, 111, 255 });
    EXPECT_EQ(colorMap.FindNearestMatch({ 100, 100, 100, 0 }), 1);
}

TEST(ColorMap, FindNearestMatchOnTheSystemPaletteTakesTheFirstOfEqualEntries)
{
    ColorMap colorMap;
    // (152, 152, 152) sits at 19 and 136, white at 63 and 255.
    EXPECT_EQ(colorMap.FindNearestMatch({ 152, 152, 152, 255 }), 19);
    EXPECT_EQ(colorMap.FindNearestMatch({ 255, 255, 255, 255 }), 63);
    EXPECT_EQ(colorMap.FindNearestMatch({ 255, 0, 0, 255 }), 42);
}

TEST(ColorMap, InitIndexMapWritesExactlyTheSixtyFourLowCells)
{
    ColorMap colorMap;
    colorMap.NewMap(1);
    // Entry k < 64 is the raw colour (8R + 7, 8G + 7, 8B + 7) with R, G, B the base-4 digits of
    // k, i.e. the last raw colour of the loops that falls into cell (R, G, B). Everything else
    // is far away.
    for (int i = 0; i < 256; ++i)
        colorMap.SetIndex(i, { 255, 255, 255, 255 });
    for (int k = 0; k < 64; ++k) {
        colorMap.SetIndex(k,
            { uint8_t(8 * (k >> 4) + 7), uint8_t(8 * ((k >> 2) & 3) + 7), uint8_t(8 * (k & 3) + 7),
                255 });
    }
    color_map* owned = Writable(colorMap);
    std::memset(owned->index_map, 0xab, sizeof(owned->index_map));

    colorMap.InitIndexMap();

    int written = 0;
    for (int key = 0; key < 32768; ++key) {
        const int r = key >> 10;
        const int g = (key >> 5) & 31;
        const int b = key & 31;
        if (r < 4 && g < 4 && b < 4) {
            EXPECT_EQ(owned->index_map[key], 16 * r + 4 * g + b) << "key " << key;
            ++written;
        } else if (owned->index_map[key] != 0xab) {
            ADD_FAILURE() << "key " << key << " was written";
        }
    }
    EXPECT_EQ(written, 64);
}
