// Four-character codes: message commands, resource types and the like, written as four
// characters and used as one 32-bit number, the first character in the most significant byte.
#pragma once

#include <cstdint>

// FourCC("NwSc") is 0x4e775363.
constexpr uint32_t FourCC(const char (&code)[5])
{
    return (uint32_t(uint8_t(code[0])) << 24) | (uint32_t(uint8_t(code[1])) << 16)
        | (uint32_t(uint8_t(code[2])) << 8) | uint32_t(uint8_t(code[3]));
}
