// ResourcesTest.cpp: every resource the program carries is there with its size, is read back
// through the resource reader, and the font strip and the glow look as they must.
#include "platform/Resources.h"
#include "render/RBMFont8.h"
#include "render/RBitmap8.h"
#include "resources/ResourceData.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <vector>

namespace {

struct Expected {
    const char* type;
    int id;
    int bytes;
};

// Sizes: width x height x frames.
constexpr Expected kAll[] = {
    { "Raw8", 0, 300 * 295 },
    { "Raw8", 2, 32 * 32 },
    { "Raw8", 3, 32 * 32 },
    { "Raw8", 4, 8 * 8 },
    { "Raw8", 5, 64 * 64 },
    { "FONT", 0, 672 * 14 },
    { "McPc", 1, 32 * 32 * 3 },
    { "McPc", 2, 32 * 32 * 3 },
    { "McPc", 3, 32 * 32 * 3 },
    { "McPc", 4, 32 * 32 * 3 },
    { "McPc", 5, 32 * 32 * 3 },
    { "IPCL", 0, 32 * 32 * 3 },
    { "IPCL", 1, 32 * 32 * 3 },
    { "IPCL", 2, 32 * 32 * 3 },
    { "IPCL", 3, 32 * 32 * 3 },
    { "IPCL", 4, 12 * 12 * 3 },
    { "IPCL", 5, 32 * 32 * 3 },
    { "TGcL", 0, 12 * 12 * 2 },
    { "Dzon", 0, 32 * 32 * 2 },
    { "Dzon", 1, 32 * 32 * 2 },
    { "Dzon", 2, 32 * 32 * 2 },
    { "Dzon", 3, 32 * 16 * 2 },
    { "Dzon", 4, 32 * 16 * 2 },
    { "Dzon", 5, 32 * 16 * 2 },
    { "Dzon", 6, 32 * 16 * 2 },
};

uint32_t Code(const char* type)
{
    return (uint32_t(uint8_t(type[0])) << 24) | (uint32_t(uint8_t(type[1])) << 16)
        | (uint32_t(uint8_t(type[2])) << 8) | uint32_t(uint8_t(type[3]));
}

class Resources : public testing::Test {
protected:
    static void SetUpTestSuite() { InitResources(); }
};

TEST_F(Resources, TypeCodesAreMostSignificantCharacterFirst)
{
    EXPECT_EQ(FourCC("Raw8"), 0x52617738u);
    EXPECT_EQ(FourCC("FONT"), 0x464F4E54u);
    EXPECT_EQ(FourCC("McPc"), 0x4d635063u);
    EXPECT_EQ(FourCC("IPCL"), 0x4950434cu);
    EXPECT_EQ(FourCC("TGcL"), 0x5447634cu);
    EXPECT_EQ(FourCC("Dzon"), 0x447a6f6eu);
}

TEST_F(Resources, EveryResourceHasItsSizeAndReadsBack)
{
    EXPECT_TRUE(ResourcesAvailable());
    for (const Expected& e : kAll) {
        EXPECT_EQ(ResourceSize(Code(e.type), e.id), e.bytes) << e.type << " " << e.id;
        std::vector<uint8_t> buffer(size_t(e.bytes) + 8, 0xAB);
        EXPECT_EQ(ReadResource(Code(e.type), e.id, buffer.data(), 0, buffer.size()), e.bytes);
        // Not blank: at least two different values in every resource.
        bool varied = false;
        for (int i = 1; i < e.bytes && !varied; ++i)
            varied = buffer[size_t(i)] != buffer[0];
        EXPECT_TRUE(varied) << e.type << " " << e.id;
        EXPECT_EQ(buffer[size_t(e.bytes)], 0xAB) << "read past the end";
    }
    EXPECT_EQ(ResourceSize(Code("Raw8"), 1), -1);
}

TEST_F(Resources, FramesLoadAtTheirOffsets)
{
    // The hover frame of mouse control 1 starts 1024 bytes in.
    std::vector<uint8_t> all(3 * 1024);
    ASSERT_EQ(ReadResource(Code("McPc"), 1, all.data(), 0, all.size()), 3 * 1024);
    RBitmap8 hover(BRect(0.0f, 0.0f, 31.0f, 31.0f));
    EXPECT_TRUE(hover.LoadFromResource(int32_t(Code("McPc")), 1, 1024, 1024));
    EXPECT_TRUE(std::equal(all.begin() + 1024, all.begin() + 2048, hover.Bits()));
    EXPECT_FALSE(std::equal(all.begin(), all.begin() + 1024, hover.Bits()));
}

TEST_F(Resources, SystemFontInfo)
{
    RBMFont8 font(int32_t(Code("FONT")), 0, 672, 14, 7, 32, 125);
    RBMFontInfo info {};
    font.GetFontInfo(&info);
    EXPECT_EQ(info.stripWidth, 672);
    EXPECT_EQ(info.charHeight, 14);
    EXPECT_EQ(info.charWidth, 7);
    EXPECT_EQ(info.firstChar, 32);
    EXPECT_EQ(info.lastChar, 125);
}

TEST_F(Resources, TheFontStripAgreesWithTheSystemFontConstants)
{
    // The real strip is exactly as large as the constants the chart builds its font with, and
    // its glyphs stand in the cells those constants give: every character from '!' to '}' has
    // ink in its own cell, the space and the cells after the last character have none.
    const uint32_t type = Code("FONT");
    ASSERT_EQ(
        ResourceSize(type, kSystemFontId), int64_t(kSystemFontStripWidth) * kSystemFontCharHeight);
    RBMFont8 font(int32_t(type), kSystemFontId, kSystemFontStripWidth, kSystemFontCharHeight,
        kSystemFontCharWidth, kSystemFontFirstChar, kSystemFontLastChar);
    RBMFontInfo info {};
    font.GetFontInfo(&info);
    EXPECT_EQ(info.stripWidth, 672);
    EXPECT_EQ(info.charHeight, 14);
    EXPECT_EQ(info.charWidth, 7);
    EXPECT_EQ(info.firstChar, 32);
    EXPECT_EQ(info.lastChar, 125);
    EXPECT_EQ(font.StripBytesPerRow(), kSystemFontStripWidth);

    const auto inkInCell = [&](int cell) {
        int ink = 0;
        for (int y = 0; y < kSystemFontCharHeight; ++y) {
            for (int x = 0; x < kSystemFontCharWidth; ++x)
                ink += font.Bits()[y * kSystemFontStripWidth + cell * kSystemFontCharWidth + x]
                    == 255;
        }
        return ink;
    };
    const int cells = kSystemFontStripWidth / kSystemFontCharWidth;
    for (int c = kSystemFontFirstChar; c < kSystemFontFirstChar + cells; ++c) {
        const int cell = c - kSystemFontFirstChar;
        if (c == ' ' || c > kSystemFontLastChar)
            EXPECT_EQ(inkInCell(cell), 0) << c;
        else
            EXPECT_GT(inkInCell(cell), 0) << c;
    }
}

// Ink pixels (255) in the cell of character c; only 0 and 255 occur in the strip.
int InkIn(const RBMFont8& font, int c)
{
    if (c < 32 || c > 125 + 2)
        return 0;
    int ink = 0;
    for (int y = 0; y < 14; ++y) {
        for (int x = 0; x < 7; ++x) {
            const uint8_t v = font.Bits()[y * 672 + (c - 32) * 7 + x];
            EXPECT_TRUE(v == 0 || v == 255);
            ink += v == 255;
        }
    }
    return ink;
}

TEST_F(Resources, FontGlyphsSitInTheirOwnCells)
{
    RBMFont8 font(int32_t(Code("FONT")), 0, 672, 14, 7, 32, 125);
    for (const char c : { 'A', '0', '}', '.' }) {
        EXPECT_GT(InkIn(font, c), 0) << c;
        // The neighbouring cells belong to other glyphs; their ink must not touch this cell's
        // columns, which holds when the cell's outer columns on both sides are clean or the
        // neighbour is a separate glyph: check the column pairs at each boundary.
        const int left = (c - 32) * 7;
        int touching = 0;
        for (int y = 0; y < 14; ++y) {
            if (left > 0)
                touching
                    += font.Bits()[y * 672 + left - 1] == 255 && font.Bits()[y * 672 + left] == 255;
            touching
                += font.Bits()[y * 672 + left + 6] == 255 && font.Bits()[y * 672 + left + 7] == 255;
        }
        EXPECT_EQ(touching, 0) << c;
    }
    // The space and the two unused cells after '}' hold no ink; the glyphs differ.
    EXPECT_EQ(InkIn(font, ' '), 0);
    EXPECT_EQ(InkIn(font, 126), 0);
    EXPECT_EQ(InkIn(font, 127), 0);
    EXPECT_NE(InkIn(font, 'A'), InkIn(font, '.'));
    // '.' is small and low: all its ink lies in the lower half of the cell.
    for (int y = 0; y < 7; ++y) {
        for (int x = 0; x < 7; ++x) {
            EXPECT_EQ(font.Bits()[y * 672 + ('.' - 32) * 7 + x], 0);
        }
    }
}

TEST_F(Resources, StarGlowIsSaturatedInsideAndDarkOutside)
{
    std::vector<uint8_t> glow(64 * 64);
    ASSERT_EQ(ReadResource(Code("Raw8"), 5, glow.data(), 0, glow.size()), 64 * 64);
    int saturatedAt7 = 0, insideCount = 0;
    for (int y = 0; y < 64; ++y) {
        for (int x = 0; x < 64; ++x) {
            const double r = std::hypot(x - 31.5, y - 31.5);
            const uint8_t v = glow[size_t(y * 64 + x)];
            if (r <= 7.0) {
                ++insideCount;
                saturatedAt7 += v == 255;
            }
            if (r >= 31.0) {
                EXPECT_EQ(v, 0) << x << "," << y;
            }
            if (r > 12.0 && r < 20.0) {
                EXPECT_GT(v, 0) << x << "," << y;
                EXPECT_LT(v, 255) << x << "," << y;
            }
        }
    }
    EXPECT_EQ(saturatedAt7, insideCount);
    EXPECT_EQ(glow[0], 0);
    EXPECT_EQ(glow[63], 0);
    EXPECT_EQ(glow[63 * 64], 0);
    EXPECT_EQ(glow[63 * 64 + 63], 0);
    // Zero by about 29 pixels, but not far before: some light remains at 25 px.
    int litAt25 = 0;
    for (int a = 0; a < 360; a += 5) {
        const double t = a * 3.141592653589793 / 180.0;
        const int x = int(std::lround(31.5 + 25.0 * std::cos(t)));
        const int y = int(std::lround(31.5 + 25.0 * std::sin(t)));
        litAt25 += glow[size_t(y * 64 + x)] > 0;
        const int x30 = int(std::lround(31.5 + 29.5 * std::cos(t)));
        const int y30 = int(std::lround(31.5 + 29.5 * std::sin(t)));
        EXPECT_LE(glow[size_t(y30 * 64 + x30)], 2) << a;
    }
    EXPECT_GT(litAt25, 0);
    // Smooth: along a ray, no step between neighbouring pixels exceeds 40 levels.
    for (int x = 32; x < 63; ++x)
        EXPECT_LE(
            std::abs(int(glow[size_t(32 * 64 + x)]) - int(glow[size_t(32 * 64 + x + 1)])), 40);
    // The rim is not a perfect circle: the level at 20 px varies with the angle.
    int lowest = 255, highest = 0;
    for (int a = 0; a < 360; a += 3) {
        const double t = a * 3.141592653589793 / 180.0;
        const uint8_t v = glow[size_t(int(std::lround(31.5 + 20 * std::sin(t)))) * 64
            + size_t(std::lround(31.5 + 20 * std::cos(t)))];
        lowest = std::min<int>(lowest, v);
        highest = std::max<int>(highest, v);
    }
    EXPECT_GT(highest - lowest, 5);
}

TEST_F(Resources, TransparentImagesAreTransparentAtTheCorners)
{
    for (const int id : { 2, 3, 4 }) {
        const int side = id == 4 ? 8 : 32;
        std::vector<uint8_t> image(size_t(side * side));
        ASSERT_EQ(ReadResource(Code("Raw8"), id, image.data(), 0, image.size()), side * side);
        EXPECT_EQ(image[0], 255) << id;
        EXPECT_EQ(image[size_t(side * side - 1)], 255) << id;
        EXPECT_GT(std::count_if(image.begin(), image.end(), [](uint8_t v) { return v != 255; }),
            side * side / 8)
            << id;
    }
    // The diagram is opaque everywhere.
    std::vector<uint8_t> diagram(300 * 295);
    ASSERT_EQ(ReadResource(Code("Raw8"), 0, diagram.data(), 0, diagram.size()), 300 * 295);
    EXPECT_EQ(std::count(diagram.begin(), diagram.end(), 255), 0);
}

} // namespace
