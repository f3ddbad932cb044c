// BGRAColor.h: a four-byte colour in blue, green, red, alpha memory order, with a 32-bit view of
// those bytes.
#pragma once

#include <cstdint>

class BGRAColor {
public:
    // All four bytes zero; value refers to this record's own four bytes.
    BGRAColor();
    // Stores the bytes through Set. value is bound to the constructor's own first argument, so it
    // is only valid while this constructor runs. Nothing reads value, and the binding is kept as
    // the record has always had it rather than pointed at the bytes.
    BGRAColor(uint8_t blue, uint8_t green, uint8_t red, uint8_t alpha);
    // A copy takes the four bytes and refers to its own storage, not to the original's.
    BGRAColor(const BGRAColor& other);
    BGRAColor& operator=(const BGRAColor& other);

    // Stores the four bytes in argument order.
    void Set(uint8_t blue, uint8_t green, uint8_t red, uint8_t alpha);

    // Aligned so that the 32-bit view of the four bytes starts on a word boundary.
    alignas(uint32_t) uint8_t blue;
    uint8_t green;
    uint8_t red;
    uint8_t alpha;
    uint32_t& value;
};
