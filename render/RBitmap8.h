// RBitmap8.h: the offscreen canvas of every view: an 8-bit indexed bitmap (palette indices of the
// system palette) with fast software primitives that write straight into its pixel memory.
//
// Two kinds of write: plain writes store a palette index; additive writes ("Add") add a
// ColorTable entry to the colour the pixel already shows, saturate each channel at 255 and store
// the palette index of the sum, found through the palette's 15-bit inverse map.
//
// Clipping is decided once at the entry of each primitive. Points, squares and scaled bitmaps are
// drawn whole or not at all; lines are clipped with the rules documented per primitive, quirks
// included. Coordinates are pixels, (0, 0) the top-left pixel, y growing downward.
//
// Additive writes may come from several render threads at once on the same bitmap; their pixel
// reads and stores are relaxed atomics (plain moves on x86), so overlapping writes may lose one
// of two additions but never tear or race in the language's sense.
#pragma once

#include "platform/BRect.h"
#include "render/BBitmap.h"
#include "render/ColorTable.h"
#include "render/SysColorMap.h"

#include <array>
#include <cstdint>
#include <vector>

class RBMFont8;

class RBitmap8 : public BBitmap {
public:
    // The two flags are accepted for the callers' sake and have no effect here.
    explicit RBitmap8(BRect frame, bool acceptsViews = false, bool needsContiguous = false);
    // Rows of exactly bytesPerRow bytes (at least the width) instead of the padded pitch.
    RBitmap8(BRect frame, int32_t bytesPerRow);
    ~RBitmap8();

    // font is not owned; it must outlive its use by RenderChar/RenderString.
    void SetBMFont(RBMFont8* font) { this->font = font; }

    // Fills the bitmap with index, whole 32-bit words at a time; when bitsLength is not a
    // multiple of 4 the last 1..3 bytes are left as they were.
    void EraseMap(uint8_t index);

    // Drawn only when 0 <= x < width and 0 <= y < height.
    void RenderPoint(int32_t x, int32_t y, uint8_t index);
    void RenderPointAdd(int32_t x, int32_t y, const ColorTable* table, uint8_t intensity);
    // RenderPointAdd through the plain reference kernel, for comparison in tests and benchmarks.
    void RenderPointAddReference(int32_t x, int32_t y, const ColorTable* table, uint8_t intensity);

    // size x size pixels with the top-left at (x, y), drawn only when wholly inside.
    void RenderSquare(int32_t x, int32_t y, int32_t size, uint8_t index);
    void RenderSquareAdd(
        int32_t x, int32_t y, int32_t size, const ColorTable* table, uint8_t intensity);

    // A run of |length| pixels rightward (downward) from (x, y); a negative length runs to the
    // left (upward) of x (y). A run starting before the edge is moved to the edge with its length
    // kept, then cut at the far edge.
    void RenderHLine(int32_t x, int32_t y, int32_t length, uint8_t index);
    void RenderVLine(int32_t x, int32_t y, int32_t length, uint8_t index);
    // Horizontal and vertical lines become runs; any other line is drawn column by column, from
    // the left end point up to but excluding the right one, as vertical runs of
    // truncate(slope +- 0.999) pixels. A slope within 0.001 of zero (but not zero) draws nothing.
    void RenderLine(double x1, double y1, double x2, double y2, uint8_t index);
    // The outline of rect, right and bottom inclusive.
    void RenderRect(BRect rect, uint8_t index);

    // Draws c with the font (ink pixels, value 255, in index; the rest left alone) in the cell
    // whose bottom-left pixel is (x, y), then advances x by the font's character width. Control
    // characters move the cursor only: 8 back one cell, 9 to the next tab stop (every four cells
    // from left), 10 and 13 to the start of the next line, 11 down four lines, 32 one cell on.
    // Nothing at all happens without a font.
    void RenderChar(int32_t left, int32_t& x, int32_t& y, char c, uint8_t index);
    void RenderString(int32_t left, int32_t& x, int32_t& y, const char* text, uint8_t index);

    // Copies source scaled to size x size with the top-left at (x, y), drawn only when wholly
    // inside. source is taken as square with side source->BytesPerRow(); sampling is 16.16 fixed
    // point, nearest-lower. Source value 255 is transparent.
    void RenderBitmap(int32_t x, int32_t y, const BBitmap* source, int32_t size);
    // The same placement and sampling; each sample v adds table->colors[v] to its pixel.
    void RenderBitmapAdd(
        int32_t x, int32_t y, const BBitmap* source, int32_t size, const ColorTable* table);
    // What RenderBitmapAdd draws, for a caller that scales a source once and draws it many
    // times: samples are ScaledSamples(source, size), spread is SpreadTable(table).
    void RenderSamplesAdd(
        int32_t x, int32_t y, const uint8_t* samples, int32_t size, const uint32_t* spread);
    // The samples RenderBitmapAdd takes from source at size, row after row; empty when it
    // would draw nothing.
    static std::vector<uint8_t> ScaledSamples(const BBitmap* source, int32_t size);
    // The colours of table in the form the additive primitives add, one for each intensity.
    static std::array<uint32_t, 256> SpreadTable(const ColorTable* table);

    // Reads length bytes of resource (type, id), from offset into it, straight into the pixel
    // memory (raw rows of bytesPerRow bytes; at most bitsLength bytes). Returns whether the
    // program's resources are available at all, whether or not this resource was found.
    bool LoadFromResource(int32_t type, int32_t id, int32_t offset, int32_t length);

    int32_t Width() const { return width; }
    int32_t Height() const { return height; }

    // The palette index that results from adding add to a pixel holding index pixel: one palette
    // read, three saturating adds, one inverse-map look-up. The plain statement of the rule.
    static uint8_t AddedIndexReference(const color_map* map, uint8_t pixel, rgb_color add);

private:
    // The same rule, in the form the primitives use (see AddKernel in the .cpp).
    uint8_t AddedIndex(uint8_t pixel, uint32_t spreadAdd) const;
    // Whether a size x size square at (x, y) lies wholly inside: squares and scaled bitmaps are
    // drawn whole or not at all.
    bool FitsWhole(int32_t x, int32_t y, int32_t size) const
    {
        return size >= 1 && x >= 0 && y >= 0 && x <= width - size && y <= height - size;
    }
    void AddPixel(uint8_t* pixel, uint32_t spreadAdd) const;

    uint8_t* bits; // Bits(), cached; owned by the BBitmap part
    int32_t bitsLength;
    int32_t bytesPerRow;
    BRect bounds;
    int32_t height;
    int32_t width;
    RBMFont8* font; // not owned
    SysColorMap colorMap;
    // The system palette in the additive kernel's form: colours spread to 10-bit lanes. Not owned.
    const uint32_t* spreadPalette;
    const uint8_t* indexMap; // colorMap's inverse map; not owned
    // Whether adding black leaves a pixel of each index as it is: true of all but the few
    // palette entries whose colour the inverse map sends to another entry. Scaled glows, whose
    // rims are black, skip such pixels.
    bool blackKeeps[256];
};
