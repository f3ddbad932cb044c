// ColorTable.h: a 256-entry colour ramp indexed by intensity, laid out like the front of a
// color_map so that several can sit back to back in one malloc'd block.
#pragma once

#include "render/ColorTypes.h"

#include <cstdint>

// A plain record with no constructor: owners allocate tables raw with malloc (often several in
// one block, table k at 1028 * k bytes) and release them with free.
struct ColorTable {
    // Occupies the place of color_map::id; nothing in the ramp code reads or writes it.
    int32_t id;
    // Indexed by intensity 0..255.
    rgb_color colors[256];

    // Fills count entries from start with a linear ramp that starts exactly on from and stops one
    // step short of to (16.16 fixed point, truncated). Entries outside the ramp keep their values.
    // When start + count exceeds 256 the count becomes 256 (the step is computed with it) and the
    // ramp stops at entry 255. A count below 1 changes nothing.
    void BuildColorRamp(uint8_t start, int32_t count, rgb_color from, rgb_color to);

    // The ramp itself, shared with ColorMap: ramp position i (start <= i < start + count) goes
    // to entries[i], and positions at or beyond size are dropped.
    static void FillRamp(rgb_color* entries, int32_t size, uint8_t start, int32_t count,
        rgb_color from, rgb_color to);
};

static_assert(sizeof(ColorTable) == 1028);
