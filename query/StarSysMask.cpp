// Masks: one pass over the state bytes per operation, written in fixed-size chunks so that the
// compiler turns each pass into vector code even where it only vectorises loops of known
// length (a million systems must combine in well under a millisecond).
#include "query/StarSysMask.h"

#include <cassert>
#include <cstdlib>
#include <cstring>

namespace {

// Bytes handled per vector pass: a multiple of every vector width the compiler may pick.
constexpr int32_t kChunk = 64;

// a[i] = op(a[i], b[i]) for i in [0, count). a and b may be the same array (m ^= m), so each
// chunk is read whole into locals before anything is written back.
template <typename Op> void Combine(uint8_t* a, const uint8_t* b, int32_t count, Op op)
{
    int32_t i = 0;
    for (; i + kChunk <= count; i += kChunk) {
        uint8_t x[kChunk];
        uint8_t y[kChunk];
        std::memcpy(x, a + i, kChunk);
        std::memcpy(y, b + i, kChunk);
        for (int32_t k = 0; k < kChunk; k++)
            x[k] = op(x[k], y[k]);
        std::memcpy(a + i, x, kChunk);
    }
    for (; i < count; i++)
        a[i] = op(a[i], b[i]);
}

} // namespace

StarSysMask::StarSysMask(int32_t count, bool initial, int32_t universe)
    : universeID(universe)
    , systemCount(count > 0 ? count : 0)
    , states(static_cast<uint8_t*>(std::malloc(static_cast<size_t>(systemCount))))
{
    SetAll(initial);
}

StarSysMask::~StarSysMask()
{
    std::free(states);
}

void StarSysMask::SetAll(bool state)
{
    if (systemCount > 0)
        std::memset(states, state ? 1 : 0, static_cast<size_t>(systemCount));
}

void StarSysMask::SetStateSafe(int32_t index, bool state)
{
    if (index < 0 || index >= systemCount)
        return;
    states[index] = state;
}

bool StarSysMask::GetStateSafe(int32_t index) const
{
    if (index < 0 || index >= systemCount)
        return false;
    return states[index] != 0;
}

int32_t StarSysMask::CountItems(bool state) const
{
    const uint8_t wanted = state ? 1 : 0;
    int32_t total = 0;
    int32_t i = 0;
    for (; i + kChunk <= systemCount; i += kChunk) {
        // At most kChunk (< 256) matches per chunk, so a byte counter cannot overflow.
        uint8_t chunk[kChunk];
        std::memcpy(chunk, states + i, kChunk);
        uint8_t matches = 0;
        for (int32_t k = 0; k < kChunk; k++)
            matches += chunk[k] == wanted;
        total += matches;
    }
    for (; i < systemCount; i++)
        total += states[i] == wanted;
    return total;
}

int32_t StarSysMask::FindFirst() const
{
    int32_t i = 0;
    // Skip whole chunks of zeros with one OR per chunk, then look inside the first chunk that
    // has anything set.
    for (; i + kChunk <= systemCount; i += kChunk) {
        uint8_t chunk[kChunk];
        std::memcpy(chunk, states + i, kChunk);
        uint8_t any = 0;
        for (int32_t k = 0; k < kChunk; k++)
            any |= chunk[k];
        if (any)
            break;
    }
    for (; i < systemCount; i++) {
        if (states[i] != 0)
            return i;
    }
    return -1;
}

bool StarSysMask::SameUniverse(int32_t universe)
{
    universeID = universe;
    return universe != 0;
}

void StarSysMask::operator=(const StarSysMask& other)
{
    assert(other.systemCount >= systemCount);
    if (&other != this && systemCount > 0)
        std::memcpy(states, other.states, static_cast<size_t>(systemCount));
}

void StarSysMask::operator+=(const StarSysMask& other)
{
    assert(other.systemCount >= systemCount);
    Combine(states, other.states, systemCount,
        [](uint8_t a, uint8_t b) -> uint8_t { return (a != 0) | (b != 0); });
}

void StarSysMask::operator-=(const StarSysMask& other)
{
    assert(other.systemCount >= systemCount);
    // a shifted right by b places. Elements are 0 or 1, so only b of 0 or 1 can occur; the
    // shift is spelt as one step per bit of b (b of 8 or more leaves nothing), which gives
    // the same value as a plain a >> b and, unlike a variable byte shift, vectorises.
    Combine(states, other.states, systemCount, [](uint8_t a, uint8_t b) -> uint8_t {
        uint8_t shifted = a;
        shifted = (b & 1) ? static_cast<uint8_t>(shifted >> 1) : shifted;
        shifted = (b & 2) ? static_cast<uint8_t>(shifted >> 2) : shifted;
        shifted = (b & 4) ? static_cast<uint8_t>(shifted >> 4) : shifted;
        shifted = (b & 0xf8) ? 0 : shifted;
        return shifted != 0;
    });
}

void StarSysMask::operator&=(const StarSysMask& other)
{
    assert(other.systemCount >= systemCount);
    Combine(states, other.states, systemCount,
        [](uint8_t a, uint8_t b) -> uint8_t { return (a != 0) & (b != 0); });
}

void StarSysMask::operator|=(const StarSysMask& other)
{
    assert(other.systemCount >= systemCount);
    Combine(states, other.states, systemCount,
        [](uint8_t a, uint8_t b) -> uint8_t { return (a != 0) | (b != 0); });
}

void StarSysMask::operator^=(const StarSysMask& other)
{
    assert(other.systemCount >= systemCount);
    Combine(states, other.states, systemCount,
        [](uint8_t a, uint8_t b) -> uint8_t { return (a != 0) ^ (b != 0); });
}

void StarSysMask::operator~()
{
    // The operand is this mask itself: reading and writing the same chunk is safe in Combine.
    Combine(states, states, systemCount,
        [](uint8_t a, uint8_t) -> uint8_t { return static_cast<uint8_t>(~a) & 1; });
}
