// RBMFont8Test.cpp: the bitmap font's metrics, glyph layout and its behaviour without its
// resource, on a strip registered by the test itself.
#include "render/RBMFont8.h"
#include "platform/Resources.h"
#include "render/RBitmap8.h"

#include <gtest/gtest.h>

#include <vector>

namespace {

constexpr uint32_t kType = FourCC("tSTR");

// A strip with the system font's metrics whose every glyph cell holds its character code in
// every pixel, except the bottom-left pixel of 'A' (column 231), which is ink.
const std::vector<uint8_t>& Strip()
{
    static const std::vector<uint8_t> strip = [] {
        std::vector<uint8_t> s(672 * 14, 0);
        for (int y = 0; y < 14; ++y)
            for (int x = 0; x < 672; ++x)
                s[y * 672 + x] = uint8_t(32 + x / 7);
        s[13 * 672 + 231] = 255;
        return s;
    }();
    return strip;
}

TEST(RBMFont8, GetFontInfoGivesTheMetrics)
{
    RegisterResource(kType, 0, Strip().data(), Strip().size());
    RBMFont8 font(int32_t(kType), 0, 672, 14, 7, 32, 125);
    RBMFontInfo info {};
    font.GetFontInfo(&info);
    EXPECT_EQ(info.stripWidth, 672);
    EXPECT_EQ(info.charHeight, 14);
    EXPECT_EQ(info.charWidth, 7);
    EXPECT_EQ(info.firstChar, 32);
    EXPECT_EQ(info.lastChar, 125);
    EXPECT_EQ(font.BytesPerRow(), 672);
}

TEST(RBMFont8, GlyphOfAStartsAtColumn231)
{
    RegisterResource(kType, 0, Strip().data(), Strip().size());
    RBMFont8 font(int32_t(kType), 0, 672, 14, 7, 32, 125);
    EXPECT_EQ(font.GlyphBits('A') - font.Bits(), 231);
    EXPECT_EQ(font.GlyphBits('A')[0], 'A');
    EXPECT_EQ(font.GlyphBits('A')[6], 'A');
    EXPECT_EQ(font.GlyphBits('A')[7], 'B');
    // Drawn, only the one ink pixel of the cell shows: the bottom-left, on the cursor's row.
    RBitmap8 b(BRect(0.0f, 0.0f, 15.0f, 15.0f));
    b.SetBMFont(&font);
    int32_t x = 2, y = 14;
    b.RenderChar(0, x, y, 'A', 9);
    int inked = 0;
    for (int i = 0; i < b.BitsLength(); ++i)
        inked += b.Bits()[i] == 9;
    EXPECT_EQ(inked, 1);
    EXPECT_EQ(b.Bits()[14 * b.BytesPerRow() + 2], 9);
}

TEST(RBMFont8, TildeAndHighCharactersDrawNothing)
{
    // An all-ink strip: anything in range would show.
    static const std::vector<uint8_t> ink(672 * 14, 255);
    RegisterResource(kType, 1, ink.data(), ink.size());
    RBMFont8 font(int32_t(kType), 1, 672, 14, 7, 32, 125);
    RBitmap8 b(BRect(0.0f, 0.0f, 31.0f, 15.0f));
    b.SetBMFont(&font);
    int32_t x = 0, y = 14;
    b.RenderChar(0, x, y, '~', 9);
    b.RenderChar(0, x, y, char(200), 9);
    b.RenderChar(0, x, y, char(-1), 9);
    EXPECT_EQ(x, 21);
    for (int i = 0; i < b.BitsLength(); ++i)
        ASSERT_EQ(b.Bits()[i], 0) << i;
    b.RenderChar(0, x, y, '}', 9);
    EXPECT_EQ(b.Bits()[14 * b.BytesPerRow() + 21], 9);
}

TEST(RBMFont8, MissingResourceLeavesAnEmptyStrip)
{
    RBMFont8 font(int32_t(kType), 99, 672, 14, 7, 32, 125);
    for (int i = 0; i < font.BitsLength(); ++i)
        ASSERT_EQ(font.Bits()[i], 0);
    RBMFontInfo info {};
    font.GetFontInfo(&info);
    EXPECT_EQ(info.charWidth, 7);
}

TEST(RBMFont8, TheSystemFontConstantsAreOcrA672By14In7PixelCells)
{
    // What the chart and the terminal construct their font with: "OCR-A 10pt 672x14e7", the
    // characters 32 (space) to 125 ('}').
    EXPECT_EQ(kSystemFontId, 0);
    EXPECT_EQ(kSystemFontStripWidth, 672);
    EXPECT_EQ(kSystemFontCharHeight, 14);
    EXPECT_EQ(kSystemFontCharWidth, 7);
    EXPECT_EQ(kSystemFontFirstChar, 32);
    EXPECT_EQ(kSystemFontLastChar, 125);
    // The strip's rows lie back to back only for a width that is a multiple of 4, and the 94
    // glyphs fit in its 96 cells.
    EXPECT_EQ(kSystemFontStripWidth % 4, 0);
    EXPECT_EQ(kSystemFontStripWidth / kSystemFontCharWidth, 96);
    EXPECT_LE((kSystemFontLastChar - kSystemFontFirstChar + 1) * kSystemFontCharWidth,
        kSystemFontStripWidth);

    RegisterResource(kType, 2, Strip().data(), Strip().size());
    RBMFont8 font(int32_t(kType), 2, kSystemFontStripWidth, kSystemFontCharHeight,
        kSystemFontCharWidth, kSystemFontFirstChar, kSystemFontLastChar);
    RBMFontInfo info {};
    font.GetFontInfo(&info);
    EXPECT_EQ(info.stripWidth, 672);
    EXPECT_EQ(info.charHeight, 14);
    EXPECT_EQ(info.charWidth, 7);
    EXPECT_EQ(info.firstChar, 32);
    EXPECT_EQ(info.lastChar, 125);
    EXPECT_EQ(font.GlyphBits('A') - font.Bits(), 231);
}

} // namespace
