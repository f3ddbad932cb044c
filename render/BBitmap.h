// BBitmap.h: an 8-bit pixel buffer (one palette index per pixel) with rows padded to a multiple
// of 4 bytes, the base of the render bitmap and of the bitmap font.
#pragma once

#include "platform/BRect.h"

#include <cstdint>
#include <memory>

class BBitmap {
public:
    // Allocates truncate(bounds.Width() + 1) x truncate(bounds.Height() + 1) pixels (owned), all
    // 0. A frame with no width or height gives an empty buffer. Rows are padded to a multiple of
    // 4 bytes unless bytesPerRow (at least the width) asks for another pitch, as raw data of a
    // foreign layout may.
    explicit BBitmap(BRect bounds, int32_t bytesPerRow = 0);
    ~BBitmap();

    BBitmap(const BBitmap&) = delete;
    BBitmap& operator=(const BBitmap&) = delete;

    uint8_t* Bits() { return pixels.get(); }
    const uint8_t* Bits() const { return pixels.get(); }
    // Bytes of pixel memory: BytesPerRow() x the number of rows.
    int32_t BitsLength() const { return length; }
    // Distance in bytes between the starts of two rows: the width rounded up to a multiple of 4.
    int32_t BytesPerRow() const { return rowBytes; }
    BRect Bounds() const { return frame; }

private:
    BRect frame;
    int32_t rowBytes;
    int32_t length;
    std::unique_ptr<uint8_t[]> pixels; // owned
};
