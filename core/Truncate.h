// Conversion of floating-point screen coordinates to integers, truncating toward zero.
#pragma once

#include <cstdint>
#if defined(__SSE2__)
#include <emmintrin.h>
#endif

// Truncates toward zero (10.9 -> 10, -10.9 -> -10). A value that does not fit, or NaN, gives
// INT32_MIN, which is what the processor's own conversion yields, so even a point at the eye
// projects to a defined, far-off-screen integer.
inline int32_t TruncateToInt32(double value)
{
#if defined(__SSE2__)
    return _mm_cvttsd_si32(_mm_set_sd(value));
#else
    if (!(value > -2147483649.0 && value < 2147483648.0))
        return INT32_MIN;
    return static_cast<int32_t>(value);
#endif
}
