// How bright a system is on screen, b = lum / z^2, and what that draws: a point of brightness
// trunc(b) from 1 to 15, or a glow whose side grows with b. The star pass takes b from the float
// its coarse test already read, and reads the double brightness only where the float could
// draw otherwise: a frame then no longer touches the whole brightness cache (8 MB for a million
// systems) through the few systems it draws, spread evenly over it.
#pragma once

#include <algorithm>
#include <bit>
#include <cfloat>
#include <cmath>
#include <cstdint>
#include <limits>

// The glow's side in pixels for brightness b (at least 16): from the highest set bit k of
// trunc(b), k^2 / 8, at most 64.
inline int32_t GlowSize(double b)
{
    const auto n = static_cast<uint64_t>(std::min(b, 9.2e18));
    const int32_t k = std::max(2, 63 - std::countl_zero(n));
    return std::min(64, k * k / 8);
}

// What brightness b (0 or more) draws, as a number that never falls as b grows: trunc(b) under
// 16 (0 draws nothing), else 16 plus the glow's side. Equal at two brightnesses, it is equal at
// every one between them.
inline int32_t DrawnAs(double b)
{
    return b < 16.0 ? static_cast<int32_t>(b) : 16 + GlowSize(b);
}

// A brightness lum of 0 or more as the float of UniverseView::fPassLum: the float nearest lum
// that is not below it (infinity past the largest float).
inline float RoundedUpToFloat(double lum)
{
    if (lum > double(std::numeric_limits<float>::max()))
        return std::numeric_limits<float>::infinity();
    float up = float(lum);
    if (double(up) < lum)
        up = std::nextafter(up, std::numeric_limits<float>::infinity());
    return up;
}

// The brightness to draw a system with at depth squared zz: pass / zz wherever it draws exactly
// what lum / zz draws, else lum / zz with lum from exactLum(). pass is the system's float of
// UniverseView::fPassLum: RoundedUpToFloat(lum) (or a negative mark). For a normal float,
// lum lies within 2^-23 of it below, so lum / zz, rounded, lies in [pass / zz (1 - 2^-22),
// pass / zz]; where both ends of that range draw the same, so does every brightness in it.
template <class ExactLum> inline double DrawBrightness(float pass, double zz, ExactLum exactLum)
{
    if (pass == 0)
        return 0.0 / zz; // lum is 0 too: only 0 rounds up to 0
    const double b = double(pass) / zz;
    if (pass >= FLT_MIN && std::isfinite(b) && DrawnAs(b * (1 - 0x1p-21)) == DrawnAs(b))
        return b;
    return exactLum() / zz;
}
