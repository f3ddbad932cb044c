// ColorTypes.h: the palette records shared by the whole raster layer (rgb_color, color_map) and
// the 15-bit colour key that addresses a palette's inverse map.
#pragma once

#include <cstdint>

// One true colour, four bytes in the order red, green, blue, alpha. Passed by value it is one
// little-endian 32-bit word with red in the low byte.
struct rgb_color {
    uint8_t red, green, blue, alpha;
};

// A 256-entry palette together with its look-up tables. The layout is fixed (34052 bytes) because
// owners allocate it raw with malloc and ColorTable mirrors its front.
struct color_map {
    int32_t id;
    rgb_color color_list[256];
    // Palette index nearest to the inverse (255 - channel) of each entry.
    uint8_t inversion_map[256];
    // Palette index nearest to each 15-bit colour; addressed with IndexOf15().
    uint8_t index_map[32768];
};

static_assert(sizeof(rgb_color) == 4);
static_assert(sizeof(color_map) == 34052);

// The 15-bit key of a colour: the top five bits of red, green and blue, red highest.
inline constexpr int IndexOf15(uint8_t r, uint8_t g, uint8_t b)
{
    return ((r >> 3) << 10) | ((g >> 3) << 5) | (b >> 3);
}
