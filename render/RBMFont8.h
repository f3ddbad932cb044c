// RBMFont8.h: a fixed-pitch bitmap font, one 8-bit strip holding every glyph side by side, read
// from the program's resources. RBitmap8::RenderChar does the drawing.
#pragma once

#include "render/BBitmap.h"

#include <cstdint>

// The five metrics of a font, as filled by RBMFont8::GetFontInfo.
struct RBMFontInfo {
    int32_t stripWidth;
    int32_t charHeight;
    int32_t charWidth;
    char firstChar;
    char lastChar;
};

class RBMFont8 : public BBitmap {
public:
    // Reads stripWidth x charHeight bytes of resource (type, id) into the strip. A missing
    // resource leaves the strip as allocated (all 0, no ink); the font still works.
    // stripWidth must be a multiple of 4 so the strip's rows lie back to back.
    RBMFont8(int32_t type, int32_t id, int32_t stripWidth, int32_t charHeight, int32_t charWidth,
        char firstChar, char lastChar);

    void GetFontInfo(RBMFontInfo* info) const;

    int32_t CharWidth() const { return charWidth; }
    int32_t CharHeight() const { return charHeight; }
    char FirstChar() const { return firstChar; }
    char LastChar() const { return lastChar; }
    // Top-left pixel of the glyph of c (first <= c <= last); rows are StripBytesPerRow() apart.
    const uint8_t* GlyphBits(char c) const { return bits + (c - firstChar) * charWidth; }
    int32_t StripBytesPerRow() const { return bytesPerRow; }

private:
    int32_t stripWidth;
    int32_t charHeight;
    int32_t charWidth;
    char firstChar;
    char lastChar;
    uint8_t* bits; // the strip, Bits(); owned by the BBitmap part
    int32_t bitsLength;
    int32_t bytesPerRow;
    BRect bounds;
};

// The font of the star map and the terminal: OCR-A, 7 x 14 cells for the characters 32..125
// ("OCR-A 10pt 672x14e7").
constexpr int32_t kSystemFontId = 0;
constexpr int32_t kSystemFontStripWidth = 672;
constexpr int32_t kSystemFontCharHeight = 14;
constexpr int32_t kSystemFontCharWidth = 7;
constexpr char kSystemFontFirstChar = 32;
constexpr char kSystemFontLastChar = 125;
