// Built with -O3, like the star pass it is the limit of.
#include "LimitKernel.h"

#include <algorithm>

namespace {

// Systems projected at a time, into arrays the compiler knows nothing else writes to.
constexpr int32_t kChunk = 256;

} // namespace

// One version for processors with AVX2 and FMA (four doubles a step), one for any x86-64 (two);
// the first call picks the one the processor runs best.
__attribute__((target_clones("arch=x86-64-v3", "default"))) int64_t LimitKernel(
    const UniverseView::StarPassData& data, const SMatrix& transform, double focalLength,
    const BRect& frame, uint8_t* pixels, int32_t pitch)
{
    const auto& m = transform.m;
    const double m00 = m[0][0], m01 = m[0][1], m02 = m[0][2], m03 = m[0][3];
    const double m10 = m[1][0], m11 = m[1][1], m12 = m[1][2], m13 = m[1][3];
    const double m20 = m[2][0], m21 = m[2][1], m22 = m[2][2], m23 = m[2][3];
    const double f = focalLength, right = frame.right, bottom = frame.bottom;
    const double cx = right * 0.5, cy = bottom * 0.5;
    int32_t at[kChunk];
    uint8_t in[kChunk];
    int64_t visible = 0;
    for (int32_t first = 0; first < data.count; first += kChunk) {
        const int32_t n = std::min(kChunk, data.count - first);
        const double *x = data.x + first, *y = data.y + first, *z = data.z + first;
        const uint8_t* shown = data.shown + first;
        for (int32_t j = 0; j < n; j++) {
            const double tx = m00 * x[j] + m01 * y[j] + m02 * z[j] + m03;
            const double ty = m10 * x[j] + m11 * y[j] + m12 * z[j] + m13;
            const double tz = m20 * x[j] + m21 * y[j] + m22 * z[j] + m23;
            const double scale = f / tz;
            const double sx = tx * scale + cx, sy = -ty * scale + cy;
            const bool on
                = (shown[j] != 0) & (tz > 0) & (sx >= 1) & (sx < right) & (sy >= 1) & (sy < bottom);
            // Off screen the pixel is the corner's, and nothing is added to it.
            at[j] = on ? int32_t(sy) * pitch + int32_t(sx) : 0;
            in[j] = on;
        }
        for (int32_t j = 0; j < n; j++) {
            pixels[at[j]] += in[j];
            visible += in[j];
        }
    }
    return visible;
}
