// SpectralTables.h: the process-wide star colour ramps, one ColorTable per spectral colour group
// (O, B, A, F, G, K, M), kept back to back in one malloc'd block.
#pragma once

#include "render/ColorTable.h"

// Number of tables in the block: O, B, A, F, G, K, M in that order.
constexpr int kSpectralTableCount = 7;

// The application's spectral ramps: table n is gSpectralCTable + n. Null until the application
// installs a block from BuildSpectralTables; owned by whoever installed it. Written once before
// any render thread starts and only read afterwards.
extern ColorTable* gSpectralCTable;

// Allocates kSpectralTableCount tables in one block (7196 bytes) and fills each: entries 0..127
// ramp from black to the class colour, entries 128..255 from the class colour to grey 225, all
// with alpha 0. The caller owns the block and releases it with FreeSpectralTables (or free).
// Returns null if memory runs out.
ColorTable* BuildSpectralTables();
void FreeSpectralTables(ColorTable* tables);

// Builds a block and installs it in gSpectralCTable for the lifetime of this object; on
// destruction the previous pointer is put back and the block freed.
class ScopedSpectralTables {
public:
    ScopedSpectralTables();
    ~ScopedSpectralTables();

    ScopedSpectralTables(const ScopedSpectralTables&) = delete;
    ScopedSpectralTables& operator=(const ScopedSpectralTables&) = delete;

    ColorTable* Tables() const { return tables; }

private:
    ColorTable* tables; // owned
    ColorTable* previous; // not owned; restored to gSpectralCTable on destruction
};
