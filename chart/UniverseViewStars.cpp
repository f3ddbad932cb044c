// The star pass: every system of a share transformed, culled and, when on screen, drawn as one
// additive pixel or a scaled additive glow. The hot loop of the whole program; this file is built
// with -O3 so the transform-and-cull loop is vectorised.
#include "chart/UniverseView.h"

#include "chart/CoarseCull.h"
#include "chart/StarBrightness.h"

#include "core/Truncate.h"
#include "core/VectorClones.h"

#include <algorithm>
#include <bit>
#include <cmath>
#include <cstring>

namespace {

// Systems transformed and culled at a time: small enough for the stack and the first-level
// cache, large enough to keep the vector loop busy; a multiple of 8.
constexpr int32_t kChunk = 256;

// The matrix, the focal length and the frame a pass projects with; reach is how far from the
// view axis, in units of depth, a point still lands within a pixel of the frame: (half the
// frame's side plus a pixel) / focal length.
struct Camera {
    double m00, m01, m02, m03, m10, m11, m12, m13, m20, m21, m22, m23;
    double f, cx, cy, right, bottom, reachX, reachY;
    // Systems too faint to draw (brightness lum / z^2 under 1) are flagged only when every
    // system on screen counts: while the mouse is in the view, any of them may be the target.
    bool everyOne;
};

// Flags the systems of the arrays that may be on screen, for j below n: shown, in front, and
// within a pixel of the frame by a test without division. A system on screen always passes:
// the margin of a pixel is a thousand times what rounding can move a point, so the test may
// round as it likes, and products may be fused into multiply-adds here. Not a number fails it,
// as it fails the exact test. About as few systems pass that are not on screen as lie within a
// pixel of the frame; those on screen are projected afterwards by the very arithmetic of the
// rule. No branches, so the compiler vectorises it: all tests every time, joined, since which
// systems are on screen is not predictable and mispredicted jumps cost more than comparisons.
// lum is what UniverseView::fPassLum holds: the draw mask and the brightness in one float.
__attribute__((optimize("fp-contract=fast"))) inline void Flag(const double* __restrict px,
    const double* __restrict py, const double* __restrict pz, const float* __restrict lum,
    int32_t n, const Camera c, uint8_t* __restrict near)
{
    const uint8_t everyOne = c.everyOne;
    for (int32_t j = 0; j < n; j++) {
        const double x = px[j], y = py[j], z = pz[j];
        const double tx = c.m00 * x + c.m01 * y + c.m02 * z + c.m03;
        const double ty = c.m10 * x + c.m11 * y + c.m12 * z + c.m13;
        const double tz = c.m20 * x + c.m21 * y + c.m22 * z + c.m23;
        const double l = lum[j];
        // Shown: above both marks (-1 hidden, -0.5 too dark to draw).
        const uint8_t shown = uint8_t(l > -0.75);
        // Bright enough with a margin of a millionth, far beyond the rounding; the float is
        // never below the brightness it stands for.
        const uint8_t bright = uint8_t(l * (1 + 1e-6) >= tz * tz) | everyOne;
        near[j] = uint8_t(shown & (tz > 0) & (std::fabs(tx) <= c.reachX * tz)
            & (std::fabs(ty) <= c.reachY * tz) & bright);
    }
}

// Flags n consecutive systems from index first on: one version for processors with AVX2 and
// FMA (four doubles a step), one for any x86-64 (two).
ND_VECTOR_CLONES __attribute__((optimize("fp-contract=fast"))) void FlagChunk(const double* px,
    const double* py, const double* pz, const float* lum, int32_t first, int32_t n, const Camera& c,
    uint8_t* near)
{
    Flag(px + first, py + first, pz + first, lum + first, n, c, near);
}

// Flags n systems from index first on, every step-th: gathered into a chunk first.
void FlagStrided(const double* px, const double* py, const double* pz, const float* lum,
    int32_t first, int32_t n, int32_t step, const Camera& c, uint8_t* near)
{
    double x[kChunk], y[kChunk], z[kChunk];
    float l[kChunk];
    for (int32_t j = 0; j < n; j++) {
        const int32_t i = first + j * step;
        x[j] = px[i];
        y[j] = py[i];
        z[j] = pz[i];
        l[j] = lum[i];
    }
    Flag(x, y, z, l, n, c, near);
}

// Sets bit j of words for every flag near[j] of the n given (the flags run to a multiple of
// eight; a flag is 0 or 1, one bit a set byte).
void FlagsToWords(const uint8_t* near, int32_t n, uint64_t* words)
{
    for (int32_t j = 0; j < n; j += 8) {
        uint64_t eight;
        std::memcpy(&eight, near + j, sizeof eight);
        // Byte k's low bit to bit k of the top byte.
        words[j / 64] |= ((eight * 0x0102040810204080u) >> 56) << (j % 64);
    }
}

// The places in the chunk of the flagged systems, in order; how many there are. Few are in the
// usual view, so only the set bits are visited, lowest first.
int32_t Flagged(const uint64_t* words, int32_t n, int32_t* places)
{
    int32_t count = 0;
    for (int32_t w = 0; w < (n + 63) / 64; w++) {
        for (uint64_t bits = words[w]; bits != 0; bits &= bits - 1)
            places[count++] = w * 64 + std::countr_zero(bits);
    }
    return count;
}

#ifdef ND_COARSE_CULL_AVX2
// What the frame's coarse test asks beyond the frame: shown and bright enough, from the float
// of UniverseView::fPassLum, as Flag asks it.
struct ShownAndBright {
    const float* lum;
    bool everyOne;
    __attribute__((target("avx2"))) void Ahead(int32_t j) const
    {
        if (j % 16 == 0)
            PrefetchStream(lum + j);
    }
    __attribute__((target("avx2,fma"))) __m256d operator()(int32_t j, __m256d tz) const
    {
        const __m256d l = _mm256_cvtps_pd(_mm_loadu_ps(lum + j));
        const __m256d shown = _mm256_cmp_pd(l, _mm256_set1_pd(-0.75), _CMP_GT_OQ);
        __m256d bright = _mm256_cmp_pd(
            _mm256_mul_pd(l, _mm256_set1_pd(1 + 1e-6)), _mm256_mul_pd(tz, tz), _CMP_GE_OQ);
        if (everyOne)
            bright = _mm256_castsi256_pd(_mm256_set1_epi64x(-1));
        return _mm256_and_pd(shown, bright);
    }
};
#endif

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
    end = std::min({ end, int32_t(fPositionX.size()), int32_t(fPassLum.size()) });
    const auto& m = transform.m;
    const Camera camera { m[0][0], m[0][1], m[0][2], m[0][3], m[1][0], m[1][1], m[1][2], m[1][3],
        m[2][0], m[2][1], m[2][2], m[2][3], focalLength, frame.right * 0.5, frame.bottom * 0.5,
        frame.right, frame.bottom, (frame.right * 0.5 + 1) / focalLength,
        (frame.bottom * 0.5 + 1) / focalLength, mouseInside.load(std::memory_order_relaxed) };
    const bool hover = camera.everyOne;
    const float mx = mousePointX.load(std::memory_order_relaxed);
    const float my = mousePointY.load(std::memory_order_relaxed);
    const int32_t selected = selectedSystem.load(std::memory_order_relaxed);

    const double* px = fPositionX.data();
    const double* py = fPositionY.data();
    const double* pz = fPositionZ.data();
    const float* passLum = fPassLum.data();
    // Flags the chunk from first on and writes the places of its flagged systems; returns how
    // many there are. Their tables, which the coarse test did not read, are fetched into the
    // cache meanwhile: the chunk is drawn after the next one is flagged.
    const CoarseCamera coarse { camera.m00, camera.m01, camera.m02, camera.m03, camera.m10,
        camera.m11, camera.m12, camera.m13, camera.m20, camera.m21, camera.m22, camera.m23,
        camera.reachX, camera.reachY };
    const auto flagChunk = [&](int32_t first, int32_t* places) {
        const int32_t n = std::min(kChunk, (end - first + step - 1) / step);
        uint64_t words[kChunk / 64] = {};
        int32_t done = 0;
#ifdef ND_COARSE_CULL_AVX2
        if (step == 1 && CoarseCullHasAvx2()) {
            done = n & ~3;
            CoarseCullAvx2(px + first, py + first, pz + first, done, coarse,
                ShownAndBright { fPassLum.data() + first, camera.everyOne }, words);
        }
#endif
        if (done < n) {
            // The rest (a chunk's last few systems, or all of them) a byte a system.
            alignas(8) uint8_t near[kChunk];
            const int32_t rest = n - done;
            if (step == 1)
                FlagChunk(px, py, pz, fPassLum.data(), first + done, rest, camera, near);
            else
                FlagStrided(px, py, pz, fPassLum.data(), first, rest, step, camera, near);
            // The flags past the last up to the next eight say off screen.
            std::memset(near + rest, 0, size_t((8 - rest % 8) % 8));
            if (done == 0)
                FlagsToWords(near, rest, words);
            else
                for (int32_t r = 0; r < rest; r++)
                    words[(done + r) / 64] |= uint64_t(near[r]) << ((done + r) % 64);
        }
        // The selection's place on the screen is noted however faint it is.
        if (selected >= first && selected < first + n * step && (selected - first) % step == 0) {
            const int32_t j = (selected - first) / step;
            words[j / 64] |= uint64_t(1) << (j % 64);
        }
        const int32_t flagged = Flagged(words, n, places);
        if (!fTableOf.empty())
            for (int32_t v = 0; v < flagged; v++)
                __builtin_prefetch(&fTableOf[size_t(first + places[v] * step)]);
        return flagged;
    };
    // What is to be drawn, in order, since the order of additive pixels matters: a point of
    // brightness 1 to 15, or a glow of side -brightness. Drawn a few dozen at a time, their
    // pixels fetched first: pixels far apart on screen each miss the cache, and the misses of
    // one batch overlap where those of single draws between flag passes would not.
    struct Queued {
        int32_t x, y;
        const ColorTable* table;
        int32_t brightness;
        const uint32_t* spread; // the table in the additive form, when there is one
    };
    constexpr int32_t kQueue = 32;
    Queued queue[kQueue];
    int32_t queued = 0;
    uint8_t* const bits = target->Bits();
    const int32_t rowBytes = target->BytesPerRow();
    const int32_t rows = rowBytes > 0 ? target->BitsLength() / rowBytes : 0;
    const auto drawQueued = [&] {
        for (int32_t k = 0; k < queued; k++) {
            const Queued& q = queue[k];
            if (q.y >= 0 && q.y < rows && q.x >= 0 && q.x < rowBytes)
                __builtin_prefetch(bits + q.y * rowBytes + q.x, 1);
        }
        for (int32_t k = 0; k < queued; k++) {
            const Queued& q = queue[k];
            if (q.brightness > 0)
                target->RenderPointAdd(q.x, q.y, q.table, uint8_t(8 * q.brightness));
            else if (q.spread && !fGlowSamples[size_t(-q.brightness)].empty())
                target->RenderSamplesAdd(q.x + q.brightness / 2, q.y + q.brightness / 2,
                    fGlowSamples[size_t(-q.brightness)].data(), -q.brightness, q.spread);
            else
                target->RenderBitmapAdd(q.x + q.brightness / 2, q.y + q.brightness / 2, starSprite,
                    -q.brightness, q.table);
        }
        queued = 0;
    };
    const ExactCamera exact { camera.m00, camera.m01, camera.m02, camera.m03, camera.m10,
        camera.m11, camera.m12, camera.m13, camera.m20, camera.m21, camera.m22, camera.m23,
        camera.f, camera.cx, camera.cy };
    const auto drawChunk = [&](int32_t first, const int32_t* places, int32_t flagged) {
        // The rule's own arithmetic, rounded as it rounds (this file fuses nothing): the
        // transform as SMatrix::Transform does it, then sx = trunc(x f / z + right / 2).
        int32_t index[kChunk];
        double sxs[kChunk], sys[kChunk], zs[kChunk];
        for (int32_t v = 0; v < flagged; v++)
            index[v] = first + places[v] * step;
        ExactPoints(px, py, pz, index, flagged, exact, sxs, sys, zs);
        for (int32_t v = 0; v < flagged; v++) {
            const int32_t i = index[v];
            const double sxf = sxs[v], syf = sys[v], z = zs[v];
            if (!(z > 0 && sxf >= 1 && sxf < camera.right && syf >= 1 && syf < camera.bottom))
                continue;
            const ColorTable* table = TableOf(i);
            const int32_t sx = TruncateToInt32(sxf), sy = TruncateToInt32(syf);

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
            const double b = DrawBrightness(passLum[i], z * z, [&] { return lumCache[size_t(i)]; });
            if (table && b < 16.0) {
                const auto brightness = static_cast<int32_t>(b);
                if (brightness >= 1)
                    queue[queued++] = { sx, sy, table, brightness, nullptr };
            } else if (table) {
                queue[queued++] = { sx, sy, table, -GlowSize(b),
                    fWideTables.empty() ? fSpreads[fTableOf[size_t(i)]].data() : nullptr };
            }
            if (queued == kQueue)
                drawQueued();
            if (i == selected) {
                selectedPointX.store(float(sx), std::memory_order_relaxed);
                selectedPointY.store(float(sy), std::memory_order_relaxed);
            }
        }
    };

    int32_t places[2][kChunk];
    int32_t drawFirst = 0, drawFlagged = 0, slot = 0;
    for (int32_t first = begin;; first += kChunk * step) {
        const bool more = first < end;
        const int32_t flagged = more ? flagChunk(first, places[slot ^ 1]) : 0;
        drawChunk(drawFirst, places[slot], drawFlagged);
        if (!more)
            break;
        drawFirst = first;
        drawFlagged = flagged;
        slot ^= 1;
    }
    drawQueued();
}
