// The star pass: every system of a share transformed, culled and, when on screen, drawn as one
// additive pixel or a scaled additive glow. The hot loop of the whole program; this file is built
// with -O3 so the transform-and-cull loop is vectorised.
#include "chart/UniverseView.h"

#include "core/Truncate.h"

#include <algorithm>
#include <bit>
#include <cmath>

namespace {

// The glow's side in pixels for brightness b (at least 16): from the highest set bit k of
// trunc(b), k^2 / 8, at most 64.
int32_t GlowSize(double b)
{
    const auto n = static_cast<uint64_t>(std::min(b, 9.2e18));
    const int32_t k = std::max(2, 63 - std::countl_zero(n));
    return std::min(64, k * k / 8);
}

// Systems transformed and culled at a time: small enough for the stack and the first-level
// cache, large enough to keep the vector loop busy.
constexpr int32_t kChunk = 256;

} // namespace

void UniverseView::RenderStars(int32_t stride, int32_t start)
{
    RenderSpan(offscreen, start, drawMask->GetSystemCount(), std::max(stride, 1));
}

void UniverseView::RenderShare(int32_t shares, int32_t share)
{
    RenderShareInto(offscreen, shares, share);
}

void UniverseView::RenderShareInto(RBitmap8* target, int32_t shares, int32_t share)
{
    const int32_t count = drawMask->GetSystemCount();
    if (!interleaveBlocks) {
        RenderSpan(target, share, count, std::max(shares, 1));
        return;
    }
    for (int32_t block = share * kShareBlock; block < count; block += shares * kShareBlock)
        RenderSpan(target, block, std::min(block + kShareBlock, count), 1);
}

void UniverseView::RenderSpan(RBitmap8* target, int32_t begin, int32_t end, int32_t step)
{
    end = std::min({ end, int32_t(fPositionX.size()), drawMask->GetSystemCount() });
    const auto& m = transform.m;
    const double m00 = m[0][0], m01 = m[0][1], m02 = m[0][2], m03 = m[0][3];
    const double m10 = m[1][0], m11 = m[1][1], m12 = m[1][2], m13 = m[1][3];
    const double m20 = m[2][0], m21 = m[2][1], m22 = m[2][2], m23 = m[2][3];
    const double f = focalLength, right = frame.right, bottom = frame.bottom;
    const double cx = right * 0.5, cy = bottom * 0.5;
    const bool hover = mouseInside.load(std::memory_order_relaxed);
    const float mx = mousePointX.load(std::memory_order_relaxed);
    const float my = mousePointY.load(std::memory_order_relaxed);
    const int32_t selected = selectedSystem.load(std::memory_order_relaxed);
    const uint8_t* shown = drawMask->states;
    const double* px = fPositionX.data();
    const double* py = fPositionY.data();
    const double* pz = fPositionZ.data();

    double sxf[kChunk], syf[kChunk], depth[kChunk];
    int32_t onScreen[kChunk];
    for (int32_t first = begin; first < end; first += kChunk * step) {
        const int32_t n = std::min(kChunk, (end - first + step - 1) / step);

        // Transform and project; no branches, so the compiler vectorises it.
        for (int32_t j = 0; j < n; j++) {
            const int32_t i = first + j * step;
            const double x = px[i], y = py[i], z = pz[i];
            const double tx = m00 * x + m01 * y + m02 * z + m03;
            const double ty = m10 * x + m11 * y + m12 * z + m13;
            const double tz = m20 * x + m21 * y + m22 * z + m23;
            sxf[j] = tx * f / tz + cx;
            syf[j] = -ty * f / tz + cy;
            depth[j] = tz;
        }

        // On screen: shown, in front (z > 0) and strictly inside the frame after truncation,
        // that is 0 < trunc(s) < edge, which for an integral edge is 1 <= s < edge.
        int32_t visible = 0;
        for (int32_t j = 0; j < n; j++) {
            // All six tests every time, joined without branches: which systems are on screen is
            // not predictable, and mispredicted jumps cost more than the comparisons.
            const int in = (shown[first + j * step] != 0) & (depth[j] > 0) & (sxf[j] >= 1)
                & (sxf[j] < right) & (syf[j] >= 1) & (syf[j] < bottom);
            onScreen[visible] = j;
            visible += in;
        }

        for (int32_t v = 0; v < visible; v++) {
            const int32_t j = onScreen[v];
            const int32_t i = first + j * step;
            const ColorTable* table = fTables[size_t(i)];
            const int32_t sx = TruncateToInt32(sxf[j]), sy = TruncateToInt32(syf[j]);
            const double z = depth[j];

            // The nearest system whose 8 x 8 pick box holds the mouse becomes the target.
            if (hover && sx - 3 <= mx && mx <= sx + 4 && sy - 3 <= my && my <= sy + 4
                && z < targetDepth.load(std::memory_order_relaxed)) {
                targetFound.store(true, std::memory_order_relaxed);
                targetDepth.store(z, std::memory_order_relaxed);
                targetPointX.store(float(sx), std::memory_order_relaxed);
                targetPointY.store(float(sy), std::memory_order_relaxed);
                targetSystem.store(i, std::memory_order_relaxed);
            }

            // Inverse square of the depth along the view axis, not of the true distance. Without
            // spectral tables there is nothing to draw with.
            const double b = lumCache[size_t(i)] / (z * z);
            if (table && b < 16.0) {
                const auto brightness = static_cast<int32_t>(b);
                if (brightness >= 1)
                    target->RenderPointAdd(sx, sy, table, uint8_t(8 * brightness));
            } else if (table) {
                const int32_t size = GlowSize(b);
                target->RenderBitmapAdd(sx - size / 2, sy - size / 2, starSprite, size, table);
            }
            if (i == selected) {
                selectedPointX.store(float(sx), std::memory_order_relaxed);
                selectedPointY.store(float(sy), std::memory_order_relaxed);
            }
        }
    }
}
