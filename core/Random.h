// A linear congruential generator with its constants held per object.
//
// The arithmetic is signed 32-bit on purpose: the product wraps modulo 2^32 and the remainder
// takes the sign of the dividend, so seeds can turn negative and Rand(n) can return values
// down to -(n - 1). Generated universes depend on that exact sequence.
#pragma once

#include <cstdint>

class Random {
public:
    Random(); // seeded from the real-time clock; multiplier 4096, increment 150889, modulus 714025
    Random(int32_t seed, int32_t multiplier, int32_t increment, int32_t modulus);

    int32_t Rand(); // advances and returns the new seed
    int32_t Rand(int32_t n); // Rand() remainder n
    int32_t Rand1(int32_t n); // (Rand() remainder n) + 1

    int32_t seed;
    int32_t multiplier;
    int32_t increment;
    int32_t modulus;
};
