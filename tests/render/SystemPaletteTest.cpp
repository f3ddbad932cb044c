// SystemPaletteTest.cpp: the system palette's colours, its inverse map and inversion map, and
// the add-then-look-up rule that turns a ramp entry into a palette index.
#include "render/SystemPalette.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <thread>
#include <vector>

namespace {

void ExpectEntry(int index, int red, int green, int blue, int alpha)
{
    const rgb_color& entry = system_colors()->color_list[index];
    EXPECT_EQ(entry.red, red) << "entry " << index;
    EXPECT_EQ(entry.green, green) << "entry " << index;
    EXPECT_EQ(entry.blue, blue) << "entry " << index;
    EXPECT_EQ(entry.alpha, alpha) << "entry " << index;
}

uint8_t LookUp(int red, int green, int blue)
{
    return system_colors()->index_map[IndexOf15(uint8_t(red), uint8_t(green), uint8_t(blue))];
}

// Adds a ramp entry to the colour of a pixel holding palette index pixel, each channel saturating
// at 255, and returns the palette index of the sum: what drawing a star does to a pixel.
uint8_t AddToPixel(uint8_t pixel, const rgb_color& add)
{
    const color_map* palette = system_colors();
    const rgb_color& under = palette->color_list[pixel];
    const int red = std::min(255, under.red + add.red);
    const int green = std::min(255, under.green + add.green);
    const int blue = std::min(255, under.blue + add.blue);
    return palette->index_map[IndexOf15(uint8_t(red), uint8_t(green), uint8_t(blue))];
}

} // namespace

TEST(SystemPalette, IsOneMapForTheWholeProcess)
{
    const color_map* first = system_colors();
    ASSERT_NE(first, nullptr);
    std::vector<const color_map*> seen(4, nullptr);
    std::vector<std::thread> threads;
    for (int t = 0; t < 4; ++t)
        threads.emplace_back([&seen, t] { seen[t] = system_colors(); });
    for (std::thread& thread : threads)
        thread.join();
    for (const color_map* map : seen)
        EXPECT_EQ(map, first);
}

TEST(SystemPalette, EntriesMatchThePlatformPalette)
{
    ExpectEntry(0, 0, 0, 0, 255);
    ExpectEntry(1, 8, 8, 8, 255);
    ExpectEntry(19, 152, 152, 152, 255);
    ExpectEntry(31, 248, 248, 248, 255);
    ExpectEntry(32, 0, 0, 255, 255);
    ExpectEntry(41, 0, 0, 30, 255);
    ExpectEntry(42, 255, 0, 0, 255);
    ExpectEntry(62, 0, 152, 51, 255);
    ExpectEntry(63, 255, 255, 255, 255);
    ExpectEntry(97, 203, 203, 203, 255);
    ExpectEntry(136, 152, 152, 152, 255);
    ExpectEntry(152, 230, 134, 0, 255);
    ExpectEntry(189, 255, 175, 19, 255);
    ExpectEntry(229, 255, 227, 70, 255);
    ExpectEntry(247, 51, 0, 0, 255);
    ExpectEntry(254, 255, 255, 203, 255);
    ExpectEntry(255, 255, 255, 255, 0);
}

TEST(SystemPalette, OnlyTheTransparentEntryHasZeroAlpha)
{
    for (int i = 0; i < 255; ++i)
        EXPECT_EQ(system_colors()->color_list[i].alpha, 255) << i;
    EXPECT_EQ(system_colors()->color_list[255].alpha, 0);
}

TEST(SystemPalette, IndexMapFindsColoursThatOccurOnce)
{
    for (int index : { 0, 8, 32, 42, 52, 62, 126, 152, 189, 216, 229, 250 }) {
        const rgb_color& entry = system_colors()->color_list[index];
        EXPECT_EQ(LookUp(entry.red, entry.green, entry.blue), index) << "entry " << index;
    }
}

TEST(SystemPalette, IndexMapAnswersForTheCentreOfTheCell)
{
    // Grey 200 and (203, 203, 203) share the cell 200..207, whose centre 203.5 is nearer 203.
    EXPECT_EQ(LookUp(203, 203, 203), 97);
    EXPECT_EQ(LookUp(200, 200, 200), 97);
    // 248 and 255 share the top cell, whose centre 251.5 is as near to both: the lower index,
    // grey 248, wins, and the transparent entry 255 is never an answer.
    EXPECT_EQ(LookUp(248, 248, 248), 31);
    EXPECT_EQ(LookUp(255, 255, 255), 31);
    // The doubled grey resolves to its first index.
    EXPECT_EQ(LookUp(152, 152, 152), 19);
}

TEST(SystemPalette, LookingUpAnEntryAgainChangesNothing)
{
    // Adding black to a pixel must not drift it: the colour of an entry looks up either that
    // entry or one whose own colour then looks up itself.
    const color_map* palette = system_colors();
    int exact = 0;
    for (int i = 0; i < 255; ++i) {
        const rgb_color& entry = palette->color_list[i];
        const int j = LookUp(entry.red, entry.green, entry.blue);
        const rgb_color& found = palette->color_list[j];
        EXPECT_EQ(LookUp(found.red, found.green, found.blue), j) << "entry " << i;
        exact += found.red == entry.red && found.green == entry.green && found.blue == entry.blue;
    }
    EXPECT_EQ(exact, 248);
}

TEST(SystemPalette, IndexMapNeverAnswersTheTransparentEntry)
{
    const color_map* palette = system_colors();
    for (int key = 0; key < 32768; ++key)
        ASSERT_NE(palette->index_map[key], 255) << "key " << key;
}

TEST(SystemPalette, IndexMapIsTheNearestOpaqueEntryToEachCell)
{
    const color_map* palette = system_colors();
    for (int key = 0; key < 32768; ++key) {
        // The cell's centre, doubled so that it is a whole number: 8c + 3.5 becomes 16c + 7.
        auto centre = [](int c) { return 16 * c + 7; };
        const int red = centre(key >> 10);
        const int green = centre((key >> 5) & 31);
        const int blue = centre(key & 31);
        const rgb_color& chosen = palette->color_list[palette->index_map[key]];
        const int chosenDistance = std::abs(red - 2 * chosen.red)
            + std::abs(green - 2 * chosen.green) + std::abs(blue - 2 * chosen.blue);
        for (int i = 0; i < 255; ++i) {
            const rgb_color& entry = palette->color_list[i];
            const int distance = std::abs(red - 2 * entry.red) + std::abs(green - 2 * entry.green)
                + std::abs(blue - 2 * entry.blue);
            // No entry is nearer, and no earlier entry is as near.
            if (distance < chosenDistance
                || (distance == chosenDistance && i < palette->index_map[key]))
                FAIL() << "key " << key << ": entry " << i << " beats "
                       << int(palette->index_map[key]);
        }
    }
}

TEST(SystemPalette, InversionMapPairsOppositeColours)
{
    const color_map* palette = system_colors();
    EXPECT_EQ(palette->inversion_map[0], 63); // black to white
    EXPECT_EQ(palette->inversion_map[63], 0); // white to black
    EXPECT_EQ(palette->inversion_map[255], 0); // the transparent white too
    EXPECT_EQ(palette->inversion_map[16], 16); // 128 grey inverts to 127, itself the nearest
    EXPECT_EQ(palette->inversion_map[42], 82); // red to (51, 255, 255): there is no pure cyan
    EXPECT_EQ(palette->inversion_map[152], 94); // (230, 134, 0) to (0, 102, 255)
    for (int i = 0; i < 256; ++i)
        EXPECT_NE(palette->inversion_map[i], 255) << i;
}

TEST(SystemPalette, AddingARampEntryToAPixelLooksUpTheSaturatedSum)
{
    // The class colour of an M star, (225, 125, 125), on black: the sum is the colour itself, in
    // the cell centred on (227.5, 123.5, 123.5), nearest to entry 163, (203, 102, 102).
    EXPECT_EQ(AddToPixel(0, { 225, 125, 125, 0 }), 163);
    // On mid grey (128) the sum (353, 253, 253) saturates to (255, 253, 253): the top grey.
    EXPECT_EQ(AddToPixel(16, { 225, 125, 125, 0 }), 31);
    // On red: (255 + 10, 60, 0) saturates to (255, 60, 0), nearest (255, 51, 0).
    EXPECT_EQ(AddToPixel(42, { 10, 60, 0, 0 }), 157);
}
