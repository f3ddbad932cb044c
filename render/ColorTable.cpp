// ColorTable.cpp: the 16.16 fixed-point colour ramp used by ColorTable and ColorMap.
#include "render/ColorTable.h"

void ColorTable::BuildColorRamp(uint8_t start, int32_t count, rgb_color from, rgb_color to)
{
    FillRamp(colors, 256, start, count, from, to);
}

void ColorTable::FillRamp(
    rgb_color* entries, int32_t size, uint8_t start, int32_t count, rgb_color from, rgb_color to)
{
    // The clamp goes to 256, not to 256 - start, so an overlong ramp keeps the slope of a full
    // table; the bound on size below is what keeps it inside the entries.
    if (start + count > 256)
        count = 256;
    if (count < 1)
        return;

    // Channel differences are within +-255, so the scaled difference fits 32 bits. C++ integer
    // division truncates toward zero, which is the rounding the ramp is defined with.
    const int32_t stepRed = ((to.red - from.red) * 65536) / count;
    const int32_t stepGreen = ((to.green - from.green) * 65536) / count;
    const int32_t stepBlue = ((to.blue - from.blue) * 65536) / count;
    int32_t accRed = from.red * 65536;
    int32_t accGreen = from.green * 65536;
    int32_t accBlue = from.blue * 65536;

    const int32_t end = start + count < size ? start + count : size;
    for (int32_t i = start; i < end; ++i) {
        // The accumulators stay between the two end colours, so the shifted values fit a byte.
        entries[i].red = static_cast<uint8_t>(accRed >> 16);
        entries[i].green = static_cast<uint8_t>(accGreen >> 16);
        entries[i].blue = static_cast<uint8_t>(accBlue >> 16);
        entries[i].alpha = 0;
        accRed += stepRed;
        accGreen += stepGreen;
        accBlue += stepBlue;
    }
}
