// SpectralTables.cpp: building, installing and releasing the spectral colour ramps.
#include "render/SpectralTables.h"

#include <cstdlib>

ColorTable* gSpectralCTable = nullptr;

namespace {

// The colour a star of each group takes at middling brightness, O to M: blue-white through white
// to orange-red.
constexpr rgb_color kClassColour[kSpectralTableCount] = {
    { 125, 125, 225, 0 }, // O
    { 125, 150, 225, 0 }, // B
    { 150, 225, 225, 0 }, // A
    { 225, 225, 225, 0 }, // F
    { 225, 225, 150, 0 }, // G
    { 225, 150, 125, 0 }, // K
    { 225, 125, 125, 0 }, // M
};

constexpr rgb_color kBlack = { 0, 0, 0, 0 };
// The brightest stars wash out toward this light grey.
constexpr rgb_color kGrey225 = { 225, 225, 225, 0 };

} // namespace

ColorTable* BuildSpectralTables()
{
    auto* tables = static_cast<ColorTable*>(std::malloc(kSpectralTableCount * sizeof(ColorTable)));
    if (tables == nullptr)
        return nullptr;
    for (int n = 0; n < kSpectralTableCount; ++n) {
        ColorTable& table = tables[n];
        // Nothing reads the id; it is cleared only so the block holds no indeterminate bytes.
        table.id = 0;
        // Each ramp stops one step short of its end colour, hence two ramps: faint stars go dark,
        // middling ones take the class colour exactly at entry 128, the brightest go grey.
        table.BuildColorRamp(0, 128, kBlack, kClassColour[n]);
        table.BuildColorRamp(128, 128, kClassColour[n], kGrey225);
    }
    return tables;
}

void FreeSpectralTables(ColorTable* tables)
{
    std::free(tables);
}

ScopedSpectralTables::ScopedSpectralTables()
    : tables(BuildSpectralTables())
    , previous(gSpectralCTable)
{
    gSpectralCTable = tables;
}

ScopedSpectralTables::~ScopedSpectralTables()
{
    gSpectralCTable = previous;
    FreeSpectralTables(tables);
}
