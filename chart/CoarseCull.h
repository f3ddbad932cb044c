// The star pass's coarse test written out for processors with AVX2 and FMA: four systems a
// step, and the answers as bits, one a system, straight from the comparisons (what the
// compiler makes of the plain loop spends a quarter of its work packing them into bytes).
// Which systems pass may round as it likes: a system on screen always passes, by a pixel of
// margin a thousand times what rounding can move it; those that pass are projected afterwards
// by the exact rule.
#pragma once

#include <atomic>
#include <cstdint>

#if defined(__x86_64__) && defined(__GNUC__)
#include <immintrin.h>
#define ND_COARSE_CULL_AVX2 1

#endif

// The rows of the transform that the test needs, and how far from the view axis, in units of
// depth, a point still lands within a pixel of the frame.
struct CoarseCamera {
    double m00, m01, m02, m03, m10, m11, m12, m13, m20, m21, m22, m23;
    double reachX, reachY;
};

// The screen point of a system at (tx, ty, z) in the camera's frame, by the rule:
// x f / z + right / 2 and -y f / z + bottom / 2, each operation rounded as the rule rounds it
// (built where nothing is fused). The two quotients are taken by one division of pairs, which
// rounds each as the division of one would, in half the divider's time.
inline void ExactScreenPoint(
    double tx, double ty, double z, double f, double cx, double cy, double* sx, double* sy)
{
    using Pair = double __attribute__((vector_size(16)));
    const Pair quotients = Pair { tx * f, -ty * f } / Pair { z, z };
    *sx = quotients[0] + cx;
    *sy = quotients[1] + cy;
}

// What the exact projection needs: the transform's rows, the focal length and the frame's
// middle.
struct ExactCamera {
    double m00, m01, m02, m03, m10, m11, m12, m13, m20, m21, m22, m23;
    double f, cx, cy;
};

// The screen point and depth of system (x, y, z) by the rule, the transform as
// SMatrix::Transform does it: every operation rounded as the rule rounds it.
inline void ExactPoint(
    double x, double y, double zw, const ExactCamera& c, double* sx, double* sy, double* z)
{
    const double tx = c.m00 * x + c.m01 * y + c.m02 * zw + c.m03;
    const double ty = c.m10 * x + c.m11 * y + c.m12 * zw + c.m13;
    *z = c.m20 * x + c.m21 * y + c.m22 * zw + c.m23;
    ExactScreenPoint(tx, ty, *z, c.f, c.cx, c.cy, sx, sy);
}

#ifdef ND_COARSE_CULL_AVX2

// Set, the version below is not used even where it could be (for tests of the other).
inline std::atomic<bool> gCoarseCullPlain { false };

// Whether the version below is to run: the processor has what it needs, and it is not turned off.
inline bool CoarseCullHasAvx2()
{
    static const bool has = __builtin_cpu_supports("avx2") && __builtin_cpu_supports("fma");
    return has && !gCoarseCullPlain.load(std::memory_order_relaxed);
}

// For j below n (a multiple of 4 up to 256 past the start), sets bit j of words when system j
// is in front and within the reach, and more() says it counts: more(j, tz) gives a mask of
// four lanes, all ones where systems j to j + 3 count; more.Ahead(j), called every eighth
// system, fetches ahead what more reads (with PrefetchStream). Bits past n are left clear; words
// holds (n + 63) / 64 words. Fetches the cache line kCullPrefetchBytes past at, for the coarse
// test, without giving it a place in the second-level cache (see CoarseCullAvx2). A hint only:
// never faults, however far past an array's end.
constexpr uintptr_t kCullPrefetchBytes = 2048;
__attribute__((target("avx2"))) inline void PrefetchStream(const void* at)
{
    _mm_prefetch(
        reinterpret_cast<const char*>(reinterpret_cast<uintptr_t>(at) + kCullPrefetchBytes),
        _MM_HINT_NTA);
}

template <class More>
__attribute__((target("avx2,fma"))) inline void CoarseCullAvx2(const double* px, const double* py,
    const double* pz, int32_t n, const CoarseCamera& c, const More& more, uint64_t* words)
{
    const __m256d m00 = _mm256_set1_pd(c.m00), m01 = _mm256_set1_pd(c.m01);
    const __m256d m02 = _mm256_set1_pd(c.m02), m03 = _mm256_set1_pd(c.m03);
    const __m256d m10 = _mm256_set1_pd(c.m10), m11 = _mm256_set1_pd(c.m11);
    const __m256d m12 = _mm256_set1_pd(c.m12), m13 = _mm256_set1_pd(c.m13);
    const __m256d m20 = _mm256_set1_pd(c.m20), m21 = _mm256_set1_pd(c.m21);
    const __m256d m22 = _mm256_set1_pd(c.m22), m23 = _mm256_set1_pd(c.m23);
    const __m256d reachX = _mm256_set1_pd(c.reachX), reachY = _mm256_set1_pd(c.reachY);
    const __m256d zero = _mm256_setzero_pd();
    const __m256d magnitude = _mm256_castsi256_pd(_mm256_set1_epi64x(0x7fffffffffffffff));
    for (int32_t w = 0; w < (n + 63) / 64; w++)
        words[w] = 0;
    for (int32_t j = 0; j < n; j += 4) {
        // The positions stream past once a frame: fetched ahead without a place in the
        // second-level cache, they leave it to the frame's pixels and tables, which the draws
        // that follow would otherwise fetch again from further off each time.
        if (j % 8 == 0) {
            for (const double* p : { px, py, pz })
                PrefetchStream(p + j);
            more.Ahead(j);
        }
        const __m256d x = _mm256_loadu_pd(px + j), y = _mm256_loadu_pd(py + j);
        const __m256d z = _mm256_loadu_pd(pz + j);
        const __m256d tx
            = _mm256_fmadd_pd(m00, x, _mm256_fmadd_pd(m01, y, _mm256_fmadd_pd(m02, z, m03)));
        const __m256d ty
            = _mm256_fmadd_pd(m10, x, _mm256_fmadd_pd(m11, y, _mm256_fmadd_pd(m12, z, m13)));
        const __m256d tz
            = _mm256_fmadd_pd(m20, x, _mm256_fmadd_pd(m21, y, _mm256_fmadd_pd(m22, z, m23)));
        // Ordered comparisons: not a number fails every one, as it fails the exact test.
        __m256d pass = _mm256_cmp_pd(tz, zero, _CMP_GT_OQ);
        pass = _mm256_and_pd(pass,
            _mm256_cmp_pd(_mm256_and_pd(tx, magnitude), _mm256_mul_pd(reachX, tz), _CMP_LE_OQ));
        pass = _mm256_and_pd(pass,
            _mm256_cmp_pd(_mm256_and_pd(ty, magnitude), _mm256_mul_pd(reachY, tz), _CMP_LE_OQ));
        pass = _mm256_and_pd(pass, more(j, tz));
        words[j / 64] |= uint64_t(unsigned(_mm256_movemask_pd(pass))) << (j % 64);
    }
}

// One row of the transform applied to four points, in SMatrix::Transform's order.
__attribute__((target("avx2"))) inline __m256d TransformRow(
    double a, double b, double d, double e, __m256d x, __m256d y, __m256d w)
{
    const __m256d xy
        = _mm256_add_pd(_mm256_mul_pd(_mm256_set1_pd(a), x), _mm256_mul_pd(_mm256_set1_pd(b), y));
    return _mm256_add_pd(_mm256_add_pd(xy, _mm256_mul_pd(_mm256_set1_pd(d), w)), _mm256_set1_pd(e));
}

// ExactPoint for count systems, four at a time: system k is at index[k] of the arrays. Vector
// operations round each lane as the operation of one does, and nothing is fused (the caller
// is built so), so every point is the rule's to the last bit.
__attribute__((target("avx2"))) inline void ExactPointsAvx2(const double* px, const double* py,
    const double* pz, const int32_t* index, int32_t count, const ExactCamera& c, double* sx,
    double* sy, double* z)
{
    int32_t k = 0;
    for (; k + 4 <= count; k += 4) {
        // Four loads and two inserts an array: gathers take longer on some processors.
        const int32_t a = index[k], b = index[k + 1], d = index[k + 2], e = index[k + 3];
        const __m256d x = _mm256_set_pd(px[e], px[d], px[b], px[a]);
        const __m256d y = _mm256_set_pd(py[e], py[d], py[b], py[a]);
        const __m256d w = _mm256_set_pd(pz[e], pz[d], pz[b], pz[a]);
        const __m256d tx = TransformRow(c.m00, c.m01, c.m02, c.m03, x, y, w);
        const __m256d ty = TransformRow(c.m10, c.m11, c.m12, c.m13, x, y, w);
        const __m256d tz = TransformRow(c.m20, c.m21, c.m22, c.m23, x, y, w);
        const __m256d f = _mm256_set1_pd(c.f);
        const __m256d qx = _mm256_div_pd(_mm256_mul_pd(tx, f), tz);
        const __m256d qy
            = _mm256_div_pd(_mm256_mul_pd(_mm256_xor_pd(ty, _mm256_set1_pd(-0.0)), f), tz);
        _mm256_storeu_pd(sx + k, _mm256_add_pd(qx, _mm256_set1_pd(c.cx)));
        _mm256_storeu_pd(sy + k, _mm256_add_pd(qy, _mm256_set1_pd(c.cy)));
        _mm256_storeu_pd(z + k, tz);
    }
    for (; k < count; k++)
        ExactPoint(px[index[k]], py[index[k]], pz[index[k]], c, sx + k, sy + k, z + k);
}

#endif

// ExactPoint for count systems, system k at index[k] of the arrays: four at a time where the
// processor can.
inline void ExactPoints(const double* px, const double* py, const double* pz, const int32_t* index,
    int32_t count, const ExactCamera& c, double* sx, double* sy, double* z)
{
#ifdef ND_COARSE_CULL_AVX2
    if (CoarseCullHasAvx2()) {
        ExactPointsAvx2(px, py, pz, index, count, c, sx, sy, z);
        return;
    }
#endif
    for (int32_t k = 0; k < count; k++)
        ExactPoint(px[index[k]], py[index[k]], pz[index[k]], c, sx + k, sy + k, z + k);
}
