// Built like the star pass it is the limit of: -O3, fused multiply-adds only where it fuses them.
#include "LimitKernel.h"

#include "chart/CoarseCull.h"
#include "core/VectorClones.h"

#include <algorithm>
#include <bit>
#include <cmath>
#include <cstring>

namespace {

// Systems projected at a time, into arrays the compiler knows nothing else writes to.
constexpr int32_t kChunk = 256;

// One version for processors with AVX2 and FMA (four doubles a step), one for any x86-64 (two);
// the first call picks the one the processor runs best. The flags may round as they like (a
// pixel of margin), so products are fused there; the projection of the few flagged rounds as
// the rule does.
ND_VECTOR_CLONES __attribute__((optimize("fp-contract=fast"))) void Flag(const double* __restrict x,
    const double* __restrict y, const double* __restrict z, const uint8_t* __restrict shown,
    int32_t n, const SMatrix& transform, double reachX, double reachY, uint8_t* __restrict near)
{
    const auto& m = transform.m;
    const double m00 = m[0][0], m01 = m[0][1], m02 = m[0][2], m03 = m[0][3];
    const double m10 = m[1][0], m11 = m[1][1], m12 = m[1][2], m13 = m[1][3];
    const double m20 = m[2][0], m21 = m[2][1], m22 = m[2][2], m23 = m[2][3];
    for (int32_t j = 0; j < n; j++) {
        const double tx = m00 * x[j] + m01 * y[j] + m02 * z[j] + m03;
        const double ty = m10 * x[j] + m11 * y[j] + m12 * z[j] + m13;
        const double tz = m20 * x[j] + m21 * y[j] + m22 * z[j] + m23;
        near[j] = uint8_t((shown[j] != 0) & (tz > 0) & (std::fabs(tx) <= reachX * tz)
            & (std::fabs(ty) <= reachY * tz));
    }
}

#ifdef ND_COARSE_CULL_AVX2
// Shown: the draw mask's byte is not 0.
struct Shown {
    const uint8_t* shown;
    __attribute__((target("avx2"))) void Ahead(int32_t j) const
    {
        if (j % 64 == 0)
            PrefetchStream(shown + j);
    }
    __attribute__((target("avx2,fma"))) __m256d operator()(int32_t j, __m256d) const
    {
        uint32_t four;
        std::memcpy(&four, shown + j, sizeof four);
        const __m256i states = _mm256_cvtepu8_epi64(_mm_cvtsi32_si128(int(four)));
        const __m256i hidden = _mm256_cmpeq_epi64(states, _mm256_setzero_si256());
        return _mm256_castsi256_pd(_mm256_xor_si256(hidden, _mm256_set1_epi64x(-1)));
    }
};
#endif

// Sets bit j of words for each system j of the chunk from first on that may be on screen.
void FlagWords(const UniverseView::StarPassData& data, const SMatrix& transform, double reachX,
    double reachY, int32_t first, int32_t n, uint64_t* words)
{
    int32_t done = 0;
#ifdef ND_COARSE_CULL_AVX2
    if (CoarseCullHasAvx2()) {
        const auto& m = transform.m;
        const CoarseCamera camera { m[0][0], m[0][1], m[0][2], m[0][3], m[1][0], m[1][1], m[1][2],
            m[1][3], m[2][0], m[2][1], m[2][2], m[2][3], reachX, reachY };
        done = n & ~3;
        CoarseCullAvx2(data.x + first, data.y + first, data.z + first, done, camera,
            Shown { data.shown + first }, words);
    }
#endif
    if (done < n) {
        uint8_t near[kChunk];
        Flag(data.x + first + done, data.y + first + done, data.z + first + done,
            data.shown + first + done, n - done, transform, reachX, reachY, near);
        for (int32_t r = 0; r < n - done; r++)
            words[(done + r) / 64] |= uint64_t(near[r]) << ((done + r) % 64);
    }
}

} // namespace

int64_t LimitKernel(const UniverseView::StarPassData& data, const SMatrix& transform,
    double focalLength, const BRect& frame, uint8_t* pixels, int32_t pitch)
{
    const auto& m = transform.m;
    const double f = focalLength, right = frame.right, bottom = frame.bottom;
    const double cx = right * 0.5, cy = bottom * 0.5;
    const double reachX = (cx + 1) / f, reachY = (cy + 1) / f;
    const ExactCamera exact { m[0][0], m[0][1], m[0][2], m[0][3], m[1][0], m[1][1], m[1][2],
        m[1][3], m[2][0], m[2][1], m[2][2], m[2][3], f, cx, cy };
    int64_t visible = 0;
    for (int32_t first = 0; first < data.count; first += kChunk) {
        const int32_t n = std::min(kChunk, data.count - first);
        uint64_t words[kChunk / 64] = {};
        FlagWords(data, transform, reachX, reachY, first, n, words);
        // The flagged are projected and, when on screen, add one to their pixel: one by one
        // where few are (the usual view), four at a time where many are.
        const auto add = [&](double sx, double sy, double z) {
            if (z > 0 && sx >= 1 && sx < right && sy >= 1 && sy < bottom) {
                pixels[int32_t(sy) * pitch + int32_t(sx)]++;
                visible++;
            }
        };
        int32_t flagged = 0;
        for (int32_t w = 0; w < (n + 63) / 64; w++)
            flagged += std::popcount(words[w]);
        if (flagged < kChunk / 8) {
            for (int32_t w = 0; w < (n + 63) / 64; w++) {
                for (uint64_t bits = words[w]; bits != 0; bits &= bits - 1) {
                    const int32_t i = first + w * 64 + std::countr_zero(bits);
                    double sx, sy, z;
                    ExactPoint(data.x[i], data.y[i], data.z[i], exact, &sx, &sy, &z);
                    add(sx, sy, z);
                }
            }
            continue;
        }
        int32_t index[kChunk];
        int32_t k = 0;
        for (int32_t w = 0; w < (n + 63) / 64; w++) {
            for (uint64_t bits = words[w]; bits != 0; bits &= bits - 1)
                index[k++] = first + w * 64 + std::countr_zero(bits);
        }
        double sxs[kChunk], sys[kChunk], zs[kChunk];
        ExactPoints(data.x, data.y, data.z, index, flagged, exact, sxs, sys, zs);
        for (k = 0; k < flagged; k++)
            add(sxs[k], sys[k], zs[k]);
    }
    return visible;
}
