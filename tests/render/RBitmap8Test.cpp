// RBitmap8Test.cpp: the render bitmap's primitives on small bitmaps, checked pixel by pixel:
// whole rejection, the line clipping rules, text cursor movement, the scaled blits, EraseMap by
// whole words, and the additive kernel against its plain reference.
#include "render/RBitmap8.h"
#include "platform/Resources.h"
#include "render/RBMFont8.h"
#include "render/SystemPalette.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>
#include <random>
#include <string>
#include <utility>
#include <vector>

namespace {

constexpr uint8_t kBack = 0;
constexpr uint8_t kInk = 9;

// A w x h bitmap cleared to kBack.
struct Canvas : RBitmap8 {
    Canvas(int w, int h)
        : RBitmap8(BRect(0.0f, 0.0f, float(w - 1), float(h - 1)))
    {
        EraseMap(kBack);
    }
};

uint8_t At(const RBitmap8& b, int x, int y)
{
    return b.Bits()[y * b.BytesPerRow() + x];
}

// The bitmap as rows of '#' (kInk), '.' (kBack) and '?' (anything else).
std::string Picture(const RBitmap8& b)
{
    std::string out;
    for (int y = 0; y < b.Height(); ++y) {
        for (int x = 0; x < b.Width(); ++x)
            out += At(b, x, y) == kInk ? '#' : (At(b, x, y) == kBack ? '.' : '?');
        out += '\n';
    }
    return out;
}

int CountInk(const RBitmap8& b)
{
    int n = 0;
    for (int y = 0; y < b.Height(); ++y)
        for (int x = 0; x < b.Width(); ++x)
            n += At(b, x, y) == kInk;
    return n;
}

ColorTable* NewTable(rgb_color entry)
{
    auto* table = static_cast<ColorTable*>(std::malloc(sizeof(ColorTable)));
    for (rgb_color& c : table->colors)
        c = entry;
    return table;
}

// A test font registered under its own type code: 4 x 6 cells for '0'..'3', each glyph a
// different ink pattern; its right column and top row are ink (255), the rest 254 or 0.
constexpr uint32_t kTestFontType = FourCC("tFNT");

RBMFont8& TestFont()
{
    static const std::vector<uint8_t> strip = [] {
        std::vector<uint8_t> s(16 * 6, 0);
        for (int c = 0; c < 4; ++c) {
            for (int y = 0; y < 6; ++y) {
                for (int x = 0; x < 4; ++x) {
                    const bool ink = x == 3 || y == 0 || (x == c && y == 3);
                    s[y * 16 + c * 4 + x] = ink ? 255 : (x == 1 ? 254 : 0);
                }
            }
        }
        return s;
    }();
    RegisterResource(kTestFontType, 7, strip.data(), strip.size());
    static RBMFont8 font(int32_t(kTestFontType), 7, 16, 6, 4, '0', '3');
    return font;
}

TEST(RBitmap8, RowsArePaddedToFourBytes)
{
    RBitmap8 b(BRect(0.0f, 0.0f, 9.0f, 2.0f));
    EXPECT_EQ(b.Width(), 10);
    EXPECT_EQ(b.Height(), 3);
    EXPECT_EQ(b.BytesPerRow(), 12);
    EXPECT_EQ(b.BitsLength(), 36);
}

TEST(RBitmap8, PointsOutsideAreRejected)
{
    Canvas b(4, 3);
    b.RenderPoint(-1, 0, kInk);
    b.RenderPoint(4, 0, kInk);
    b.RenderPoint(0, 3, kInk);
    b.RenderPoint(0, -1, kInk);
    EXPECT_EQ(CountInk(b), 0);
    b.RenderPoint(3, 2, kInk);
    EXPECT_EQ(At(b, 3, 2), kInk);
    EXPECT_EQ(CountInk(b), 1);
}

TEST(RBitmap8, SquareIsDrawnWholeOrNotAtAll)
{
    Canvas b(8, 4);
    b.RenderSquare(8 - 2, 0, 3, kInk);
    EXPECT_EQ(CountInk(b), 0);
    b.RenderSquare(0, -1, 2, kInk);
    EXPECT_EQ(CountInk(b), 0);
    b.RenderSquare(8 - 3, 0, 3, kInk);
    EXPECT_EQ(Picture(b), ".....###\n.....###\n.....###\n........\n");
}

TEST(RBitmap8, HorizontalRunsMoveToTheEdgeKeepingTheirLength)
{
    Canvas b(16, 2);
    b.RenderHLine(-5, 0, 10, kInk);
    b.RenderHLine(10, 1, -4, kInk);
    EXPECT_EQ(Picture(b), "##########......\n......####......\n");
}

TEST(RBitmap8, HorizontalRunsAreCutAtTheRightAndRejectedOutside)
{
    Canvas b(8, 3);
    b.RenderHLine(6, 0, 5, kInk);
    b.RenderHLine(-6, 1, 5, kInk); // ends before column 0
    b.RenderHLine(8, 1, 2, kInk);
    b.RenderHLine(0, 3, 4, kInk);
    b.RenderHLine(-3, 2, 3, kInk); // x + length == 0: moved to column 0, 3 long
    EXPECT_EQ(Picture(b), "......##\n........\n###.....\n");
}

TEST(RBitmap8, VerticalRunsFollowTheSameRules)
{
    Canvas b(3, 12);
    b.RenderVLine(0, -5, 10, kInk);
    b.RenderVLine(1, 10, -4, kInk);
    b.RenderVLine(2, 9, 10, kInk);
    b.RenderVLine(3, 0, 5, kInk);
    EXPECT_EQ(Picture(b), "#..\n#..\n#..\n#..\n#..\n#..\n##.\n##.\n##.\n###\n..#\n..#\n");
}

TEST(RBitmap8, LineLeavesOutItsRightEndColumn)
{
    Canvas b(12, 6);
    b.RenderLine(0, 0, 10, 5, kInk);
    EXPECT_EQ(Picture(b),
        "##..........\n"
        "..##........\n"
        "....##......\n"
        "......##....\n"
        "........##..\n"
        "............\n");
}

TEST(RBitmap8, NearlyFlatLineDrawsNothing)
{
    Canvas b(16, 4);
    b.RenderLine(0, 0, 1000, 0.5, kInk);
    EXPECT_EQ(CountInk(b), 0);
}

TEST(RBitmap8, SteepLineIsDrawnAsEqualRuns)
{
    // Slope 2.5: runs of truncate(3.499) = 3 pixels from y = truncate(2.5 x).
    Canvas b(4, 10);
    b.RenderLine(0, 0, 2, 5, kInk);
    EXPECT_EQ(Picture(b), "#...\n#...\n##..\n.#..\n.#..\n....\n....\n....\n....\n....\n");
    // The same line given right to left, and a falling one whose runs go upward.
    Canvas c(4, 10);
    c.RenderLine(2, 5, 0, 0, kInk);
    EXPECT_EQ(Picture(c), Picture(b));
    Canvas d(4, 8);
    d.RenderLine(0, 6, 2, 1, kInk); // m = -2.5, b = 6, k = -3
    EXPECT_EQ(Picture(d), ".#..\n.#..\n.#..\n#...\n#...\n#...\n....\n....\n");
}

TEST(RBitmap8, LineColumnsAreClippedToTheBitmap)
{
    // From x = -4 to x = 20 on an 8-wide bitmap: columns 0..6 (7 is width - 1, excluded), with
    // y = truncate(0.25 x + 1) from the intercept taken before clipping.
    Canvas b(8, 3);
    b.RenderLine(-4, 0, 20, 6, kInk);
    EXPECT_EQ(Picture(b), "........\n####....\n....###.\n");
}

TEST(RBitmap8, RectangleOutlineIsInclusive)
{
    Canvas b(6, 5);
    b.RenderRect(BRect(1.0f, 1.0f, 4.0f, 3.0f), kInk);
    EXPECT_EQ(Picture(b), "......\n.####.\n.#..#.\n.####.\n......\n");
}

TEST(RBitmap8, EraseMapWritesWholeWordsOnly)
{
    // 5 x 3 with an unpadded pitch of 5: 15 bytes, so 3 whole words and 3 bytes left alone.
    RBitmap8 b(BRect(0.0f, 0.0f, 4.0f, 2.0f), 5);
    ASSERT_EQ(b.BitsLength(), 15);
    std::memset(b.Bits(), 7, 15);
    b.EraseMap(200);
    for (int i = 0; i < 12; ++i)
        EXPECT_EQ(b.Bits()[i], 200) << i;
    for (int i = 12; i < 15; ++i)
        EXPECT_EQ(b.Bits()[i], 7) << i;
}

TEST(RBitmap8, WhiteAddedToAnyPixelGivesThePalettesWhite)
{
    const color_map* map = system_colors();
    const uint8_t white = map->index_map[IndexOf15(255, 255, 255)];
    ColorTable* table = NewTable({ 255, 255, 255, 0 });
    Canvas b(16, 16);
    for (int p = 0; p < 256; ++p)
        b.Bits()[(p / 16) * b.BytesPerRow() + p % 16] = uint8_t(p);
    for (int p = 0; p < 256; ++p)
        b.RenderPointAdd(p % 16, p / 16, table, 17);
    for (int p = 0; p < 256; ++p)
        EXPECT_EQ(At(b, p % 16, p / 16), white) << "pixel " << p;
    std::free(table);
}

TEST(RBitmap8, AddSaturatesEachChannelAndLooksUpTheSum)
{
    // Palette entry 16 is grey 128; adding (200, 10, 0) gives (255, 138, 128).
    const color_map* map = system_colors();
    ColorTable* table = NewTable({ 0, 0, 0, 0 });
    table->colors[3] = { 200, 10, 0, 0 };
    Canvas b(4, 4);
    b.RenderPoint(1, 1, 16);
    b.RenderPointAdd(1, 1, table, 3);
    EXPECT_EQ(At(b, 1, 1), map->index_map[IndexOf15(255, 138, 128)]);
    // Out-of-range additive points are rejected like plain ones.
    b.RenderPointAdd(4, 0, table, 3);
    b.RenderPointAdd(-1, 0, table, 3);
    EXPECT_EQ(At(b, 0, 0), kBack);
    EXPECT_EQ(At(b, 3, 0), kBack);
    std::free(table);
}

TEST(RBitmap8, AdditiveKernelMatchesTheReferenceOnRandomInputs)
{
    std::mt19937 random(20240611);
    const color_map* map = system_colors();
    ColorTable* table = NewTable({ 0, 0, 0, 0 });
    Canvas fast(64, 64), plain(64, 64);
    for (int round = 0; round < 200; ++round) {
        for (rgb_color& c : table->colors)
            c = { uint8_t(random()), uint8_t(random()), uint8_t(random()), uint8_t(random()) };
        for (int i = 0; i < 64 * 64; ++i)
            fast.Bits()[i] = plain.Bits()[i] = uint8_t(random());
        for (int i = 0; i < 512; ++i) {
            const int x = int(random() % 70) - 3, y = int(random() % 70) - 3;
            const uint8_t intensity = uint8_t(random());
            fast.RenderPointAdd(x, y, table, intensity);
            plain.RenderPointAddReference(x, y, table, intensity);
        }
        ASSERT_EQ(std::memcmp(fast.Bits(), plain.Bits(), size_t(fast.BitsLength())), 0)
            << "round " << round;
    }
    // Every palette entry with every extreme of the added colour, one pixel at a time.
    for (int p = 0; p < 256; ++p) {
        for (const rgb_color add : { rgb_color { 0, 0, 0, 0 }, rgb_color { 255, 255, 255, 255 },
                 rgb_color { 7, 8, 9, 0 }, rgb_color { 128, 127, 1, 0 } }) {
            table->colors[0] = add;
            Canvas one(4, 1);
            one.RenderPoint(0, 0, uint8_t(p));
            one.RenderPointAdd(0, 0, table, 0);
            EXPECT_EQ(At(one, 0, 0), RBitmap8::AddedIndexReference(map, uint8_t(p), add));
        }
    }
    std::free(table);
}

TEST(RBitmap8, AdditiveSquareIsWholeAndAddsEveryPixel)
{
    const color_map* map = system_colors();
    ColorTable* table = NewTable({ 40, 40, 40, 0 });
    Canvas b(8, 8);
    b.RenderSquareAdd(6, 0, 3, table, 0);
    b.RenderSquareAdd(0, 0, 0, table, 0);
    for (int i = 0; i < b.BitsLength(); ++i)
        ASSERT_EQ(b.Bits()[i], kBack);
    b.RenderSquareAdd(5, 5, 3, table, 0);
    const uint8_t lit = RBitmap8::AddedIndexReference(map, kBack, { 40, 40, 40, 0 });
    for (int y = 0; y < 8; ++y)
        for (int x = 0; x < 8; ++x)
            EXPECT_EQ(At(b, x, y), (x >= 5 && y >= 5) ? lit : kBack) << x << "," << y;
    std::free(table);
}

// A 4 x 4 source whose pixel (i, j) holds 10 * j + i; (3, 3) is transparent.
struct Source : RBitmap8 {
    Source()
        : RBitmap8(BRect(0.0f, 0.0f, 3.0f, 3.0f))
    {
        for (int j = 0; j < 4; ++j)
            for (int i = 0; i < 4; ++i)
                Bits()[j * BytesPerRow() + i] = uint8_t(10 * j + i);
        Bits()[3 * BytesPerRow() + 3] = 255;
    }
};

TEST(RBitmap8, ScaledBlitSamplesNearestLower)
{
    const Source source;
    Canvas b(12, 12);
    b.EraseMap(99);
    // Up to 6: step = 4 * 65536 / 6 = 43690, so columns 0 0 1 1 2 3.
    b.RenderBitmap(1, 2, &source, 6);
    const int picks[6] = { 0, 0, 1, 1, 2, 3 };
    for (int j = 0; j < 6; ++j) {
        for (int i = 0; i < 6; ++i) {
            const int want = picks[j] == 3 && picks[i] == 3 ? 99 : 10 * picks[j] + picks[i];
            EXPECT_EQ(At(b, 1 + i, 2 + j), want) << i << "," << j;
        }
    }
    EXPECT_EQ(At(b, 0, 2), 99);
    EXPECT_EQ(At(b, 7, 2), 99);
    EXPECT_EQ(At(b, 1, 8), 99);
    // Down to 3: step 87381, samples 0, 1, 2.
    Canvas c(3, 3);
    c.RenderBitmap(0, 0, &source, 3);
    EXPECT_EQ(At(c, 0, 0), 0);
    EXPECT_EQ(At(c, 2, 1), 12);
    EXPECT_EQ(At(c, 1, 2), 21);
}

TEST(RBitmap8, ScaledBlitIsDrawnWholeOrNotAtAll)
{
    const Source source;
    Canvas b(8, 8);
    b.RenderBitmap(5, 0, &source, 4);
    b.RenderBitmap(0, -1, &source, 4);
    b.RenderBitmap(0, 0, &source, 0);
    EXPECT_EQ(CountInk(b), 0);
    for (int i = 0; i < b.BitsLength(); ++i)
        ASSERT_EQ(b.Bits()[i], kBack);
}

TEST(RBitmap8, AdditiveBlitUsesSamplesAsIntensities)
{
    const Source source;
    ColorTable* table = NewTable({ 0, 0, 0, 0 });
    for (int v = 0; v < 256; ++v)
        table->colors[v] = { uint8_t(v), uint8_t(255 - v), uint8_t(v / 2), 0 };
    Canvas b(8, 8);
    for (int i = 0; i < b.BitsLength(); ++i)
        b.Bits()[i] = uint8_t(i * 7);
    Canvas expected(8, 8);
    std::memcpy(expected.Bits(), b.Bits(), size_t(b.BitsLength()));
    b.RenderBitmapAdd(2, 1, &source, 5, table);
    const int64_t step = 4 * 65536 / 5;
    for (int j = 0; j < 5; ++j)
        for (int i = 0; i < 5; ++i)
            expected.RenderPointAddReference(2 + i, 1 + j, table,
                source.Bits()[((j * step) >> 16) * source.BytesPerRow() + ((i * step) >> 16)]);
    // Source (3, 3) holds 255: an intensity like any other here, not transparent.
    EXPECT_EQ(At(source, 3, 3), 255);
    EXPECT_EQ(std::memcmp(b.Bits(), expected.Bits(), size_t(b.BitsLength())), 0);
    std::free(table);
}

// A glow's black rim adds nothing, and the blit passes such pixels by; but adding black still
// moves the few palette entries the inverse map sends elsewhere, on every pixel they fill.
TEST(RBitmap8, AdditiveBlitOfBlackChangesWhatAddingBlackChanges)
{
    const color_map* map = system_colors();
    int moved = 0;
    for (int p = 0; p < 256; ++p)
        moved += RBitmap8::AddedIndexReference(map, uint8_t(p), { 0, 0, 0, 0 }) != p;
    ASSERT_GT(moved, 0) << "the palette has no entry that adding black moves";

    const Source source;
    ColorTable* table = NewTable({ 0, 0, 0, 0 });
    table->colors[12] = { 30, 60, 90, 0 };
    for (int round = 0; round < 4; ++round) {
        Canvas b(16, 16), expected(16, 16);
        for (int p = 0; p < 256; ++p)
            b.Bits()[(p / 16) * b.BytesPerRow() + p % 16] = uint8_t(p + 37 * round);
        std::memcpy(expected.Bits(), b.Bits(), size_t(b.BitsLength()));
        // The 4 x 4 source scaled to 16 x 16: its one lit sample (12) covers a 4 x 4 square,
        // every other sample is black in this table.
        b.RenderBitmapAdd(0, 0, &source, 16, table);
        for (int j = 0; j < 16; ++j)
            for (int i = 0; i < 16; ++i)
                expected.RenderPointAddReference(
                    i, j, table, source.Bits()[(j / 4) * source.BytesPerRow() + i / 4]);
        ASSERT_EQ(std::memcmp(b.Bits(), expected.Bits(), size_t(b.BitsLength())), 0)
            << "round " << round;
    }
    std::free(table);
}

// Scaled once and drawn with a spread table, a blit adds what RenderBitmapAdd adds, at every
// size up to four times the source and over every palette entry.
TEST(RBitmap8, SamplesScaledOnceDrawWhatTheScaledBlitDraws)
{
    std::mt19937 random(5);
    RBitmap8 source(BRect(0.0f, 0.0f, 15.0f, 15.0f));
    for (int i = 0; i < source.BitsLength(); ++i)
        source.Bits()[i] = uint8_t(i % 3 == 0 ? 0 : random());
    ColorTable* table = NewTable({ 0, 0, 0, 0 });
    for (int v = 1; v < 256; ++v)
        table->colors[v] = { uint8_t(random()), uint8_t(random()), uint8_t(random()), 0 };
    const std::array<uint32_t, 256> spread = RBitmap8::SpreadTable(table);
    EXPECT_TRUE(RBitmap8::ScaledSamples(&source, 0).empty());
    for (int size = 1; size <= 64; ++size) {
        Canvas blit(70, 70), samples(70, 70);
        for (int i = 0; i < blit.BitsLength(); ++i)
            blit.Bits()[i] = samples.Bits()[i] = uint8_t(i);
        const std::vector<uint8_t> scaled = RBitmap8::ScaledSamples(&source, size);
        ASSERT_EQ(scaled.size(), size_t(size * size));
        blit.RenderBitmapAdd(3, 2, &source, size, table);
        samples.RenderSamplesAdd(3, 2, scaled.data(), size, spread.data());
        // Not wholly inside: neither draws.
        blit.RenderBitmapAdd(70 - size + 1, 0, &source, size, table);
        samples.RenderSamplesAdd(70 - size + 1, 0, scaled.data(), size, spread.data());
        ASSERT_EQ(std::memcmp(blit.Bits(), samples.Bits(), size_t(blit.BitsLength())), 0)
            << "size " << size;
    }
    std::free(table);
}

TEST(RBitmap8, TextDrawsOnlyInkAndAdvancesTheCursor)
{
    Canvas b(12, 8);
    b.SetBMFont(&TestFont());
    int32_t x = 1, y = 6;
    b.RenderChar(1, x, y, '2', kInk);
    EXPECT_EQ(x, 5);
    EXPECT_EQ(y, 6);
    // The cell spans rows 1..6 and columns 1..4; 254 is not ink.
    EXPECT_EQ(Picture(b),
        "............\n"
        ".####.......\n"
        "....#.......\n"
        "....#.......\n"
        "...##.......\n"
        "....#.......\n"
        "....#.......\n"
        "............\n");
}

TEST(RBitmap8, TabStopsEveryFourCells)
{
    Canvas b(64, 8);
    b.SetBMFont(&TestFont());
    const int32_t left = 3, cw = 4;
    int32_t x = left + 5 * cw, y = 6;
    b.RenderChar(left, x, y, '\t', kInk);
    EXPECT_EQ(x, left + 8 * cw);
    b.RenderChar(left, x, y, '\t', kInk);
    EXPECT_EQ(x, left + 12 * cw);
    x = left;
    b.RenderChar(left, x, y, '\t', kInk);
    EXPECT_EQ(x, left + 4 * cw);
    EXPECT_EQ(CountInk(b), 0);
}

TEST(RBitmap8, ControlCharactersMoveTheCursorOnly)
{
    Canvas b(64, 64);
    b.SetBMFont(&TestFont());
    int32_t x = 20, y = 10;
    b.RenderChar(2, x, y, '\b', kInk);
    EXPECT_EQ(x, 16);
    b.RenderChar(2, x, y, ' ', kInk);
    EXPECT_EQ(x, 20);
    b.RenderChar(2, x, y, '\n', kInk);
    EXPECT_EQ(x, 2);
    EXPECT_EQ(y, 16);
    x = 9;
    b.RenderChar(2, x, y, '\r', kInk);
    EXPECT_EQ(x, 2);
    EXPECT_EQ(y, 22);
    x = 9;
    b.RenderChar(2, x, y, '\v', kInk);
    EXPECT_EQ(x, 9);
    EXPECT_EQ(y, 46);
    EXPECT_EQ(CountInk(b), 0);
}

TEST(RBitmap8, CharactersOutsideTheFontOrTheBitmapStillAdvance)
{
    Canvas b(12, 8);
    b.SetBMFont(&TestFont());
    for (const char c : { '~', '4', '/', char(-56) }) {
        int32_t x = 0, y = 6;
        b.RenderChar(0, x, y, c, kInk);
        EXPECT_EQ(x, 4) << int(c);
    }
    // Cells that do not fit: too far right, above the top, below the bottom.
    for (const auto& [cx, cy] :
        { std::pair { 9, 6 }, std::pair { -1, 6 }, std::pair { 0, 4 }, std::pair { 0, 8 } }) {
        int32_t x = cx, y = cy;
        b.RenderChar(0, x, y, '0', kInk);
        EXPECT_EQ(x, cx + 4);
    }
    EXPECT_EQ(CountInk(b), 0);
    // The last cell that fits: x = width - cw, y = height - 1.
    int32_t x = 8, y = 7;
    b.RenderChar(0, x, y, '0', kInk);
    EXPECT_EQ(At(b, 11, 7), kInk);
    EXPECT_EQ(At(b, 8, 2), kInk);
}

TEST(RBitmap8, NothingHappensWithoutAFont)
{
    Canvas b(12, 8);
    int32_t x = 0, y = 6;
    b.RenderChar(0, x, y, '0', kInk);
    b.RenderString(0, x, y, "01\n", kInk);
    EXPECT_EQ(x, 0);
    EXPECT_EQ(y, 6);
}

TEST(RBitmap8, StringsShareOneCursor)
{
    Canvas b(16, 14);
    b.SetBMFont(&TestFont());
    int32_t x = 0, y = 5;
    b.RenderString(0, x, y, "01\n3", kInk);
    EXPECT_EQ(x, 4);
    EXPECT_EQ(y, 11);
    EXPECT_EQ(At(b, 0, 3), kInk); // '0': its mark at column 0 of the cell
    EXPECT_EQ(At(b, 5, 3), kInk); // '1': column 1
    EXPECT_EQ(At(b, 3, 9), kInk); // '3' on the second line: column 3 of the cell, row 3
    EXPECT_EQ(At(b, 0, 9), kBack);
}

TEST(RBitmap8, LoadFromResourceReadsRawRows)
{
    static const uint8_t data[] = { 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14, 15, 16 };
    RegisterResource(FourCC("tRAW"), 3, data, sizeof data);
    Canvas b(4, 2);
    EXPECT_TRUE(b.LoadFromResource(int32_t(FourCC("tRAW")), 3, 8, 8));
    EXPECT_EQ(At(b, 0, 0), 9);
    EXPECT_EQ(At(b, 3, 1), 16);
    // A missing resource still reports that the resources could be opened, and reads nothing.
    EXPECT_TRUE(b.LoadFromResource(int32_t(FourCC("tRAW")), 4, 0, 8));
    EXPECT_EQ(At(b, 0, 0), 9);
}

} // namespace
