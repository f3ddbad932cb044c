// A star's construction from its catalogue values.
#include "catalog/Star.h"

Star::Star(GravName name, const char* spectralClassText, double magnitude, int32_t blockSize)
    : GravSystem(name, blockSize)
    , magnitude(magnitude)
{
    spectralClass.SetSpectralClass(spectralClassText);
}

Star::Star(GravName name, const SpectralClass& spectralClass, double magnitude, int32_t blockSize)
    : GravSystem(name, blockSize)
    , magnitude(magnitude)
    , spectralClass(spectralClass)
{
}
