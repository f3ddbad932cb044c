// A star system's construction.
#include "catalog/StarSystem.h"

StarSystem::StarSystem(GravName name, SVector position, double luminosity,
    const ColorTable* colorTable, int32_t blockSize)
    : GravSystem(name, blockSize)
    , position(position)
    , luminosity(luminosity)
    , colorTable(colorTable)
{
}
