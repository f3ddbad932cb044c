// Hot loops built twice, for processors with AVX2 and FMA and for any x86-64, the version to run
// picked once when the program starts (an ifunc): ND_VECTOR_CLONES before such a function.
// Elsewhere, and under ThreadSanitizer, whose runtime is not yet up when the choice is made,
// the function is built once for the baseline.
#pragma once

#if defined(__x86_64__) && defined(__GNUC__) && !defined(__clang__) && !defined(__SANITIZE_THREAD__)
#define ND_VECTOR_CLONES __attribute__((target_clones("arch=x86-64-v3", "default")))
#else
#define ND_VECTOR_CLONES
#endif
