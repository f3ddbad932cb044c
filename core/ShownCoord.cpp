// Taking the minus sign off values that print as zero.
#include "core/ShownCoord.h"

#include <cmath>
#include <cstdio>

namespace {

// True when value printed with "%.<decimals>f" shows a number whose digits are all 0 (so
// "-0.0" but not "-0.1", and not "nan" or "inf", which are left as they are).
bool PrintsAsZero(double value, int decimals)
{
    char text[512];
    std::snprintf(text, sizeof text, "%.*f", decimals, value);
    bool zero = false;
    for (const char* p = text; *p; p++) {
        if (*p >= '1' && *p <= '9')
            return false;
        zero = zero || *p == '0';
    }
    return zero;
}

double Shown(double value, int decimals)
{
    return PrintsAsZero(value, decimals) ? 0.0 : value;
}

} // namespace

ShownCoord::ShownCoord(const CCoord& c)
    : raHours(Shown(c.raHours, 0))
    , raMinutes(Shown(c.raMinutes, 1))
    , decDegrees(c.decDegrees)
    , decMinutes(Shown(c.decMinutes, 1))
{
    if (PrintsAsZero(c.decDegrees, 0)) {
        // South of the equator by less than a degree: the sign stays on the zero degrees, but
        // only while the minutes show something.
        const bool south = std::signbit(c.decDegrees) && decMinutes != 0;
        decDegrees = south ? -0.0 : 0.0;
    }
}
