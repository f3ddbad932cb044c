// BBitmap.cpp: allocation of the padded 8-bit pixel buffer.
#include "render/BBitmap.h"

namespace {

int32_t Extent(float low, float high)
{
    const float extent = high - low + 1.0f;
    // Truncates toward zero; frames larger than any screen are not supported.
    return extent > 0.0f && extent < 65536.0f ? int32_t(extent) : 0;
}

} // namespace

BBitmap::BBitmap(BRect bounds, int32_t bytesPerRow)
    : frame(bounds)
    , rowBytes(bytesPerRow >= Extent(bounds.left, bounds.right)
              ? bytesPerRow
              : (Extent(bounds.left, bounds.right) + 3) & ~3)
    , length(rowBytes * Extent(bounds.top, bounds.bottom))
    , pixels(new uint8_t[length > 0 ? length : 1]())
{
}

BBitmap::~BBitmap() = default;
