// A star's construction from its catalogue values.
#include "catalog/Star.h"

Star::Star(const char* name, const char* spectralClassText, double magnitude, int32_t blockSize)
    : GravSystem(name, blockSize)
    , magnitude(magnitude)
{
    spectralClass.SetSpectralClass(spectralClassText);
}
