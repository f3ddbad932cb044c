// The generator's step in wrapping 32-bit arithmetic.
#include "core/Random.h"

#include "platform/Kernel.h"

Random::Random()
    : Random(static_cast<int32_t>(real_time_clock()), 4096, 150889, 714025)
{
}

Random::Random(int32_t seed, int32_t multiplier, int32_t increment, int32_t modulus)
    : seed(seed)
    , multiplier(multiplier)
    , increment(increment)
    , modulus(modulus)
{
}

int32_t Random::Rand()
{
    // Wrap-around made defined: multiply and add as unsigned, then read back as signed.
    const uint32_t product = static_cast<uint32_t>(multiplier) * static_cast<uint32_t>(seed);
    const auto sum = static_cast<int32_t>(product + static_cast<uint32_t>(increment));
    seed = sum % modulus;
    return seed;
}

int32_t Random::Rand(int32_t n)
{
    return Rand() % n;
}

int32_t Random::Rand1(int32_t n)
{
    return Rand() % n + 1;
}
