// BGRAColorTest.cpp: byte order and the 32-bit view of BGRAColor.
#include "render/BGRAColor.h"

#include <gtest/gtest.h>

#include <cstring>

namespace {

// The four colour bytes as one little-endian word, read without going through the reference.
uint32_t Word(const BGRAColor& color)
{
    uint32_t word;
    std::memcpy(&word, &color.blue, sizeof(word));
    return word;
}

} // namespace

TEST(BGRAColor, DefaultIsZeroAndViewsItsOwnBytes)
{
    BGRAColor color;
    EXPECT_EQ(Word(color), 0u);
    EXPECT_EQ(static_cast<void*>(&color.value), static_cast<void*>(&color.blue));
}

TEST(BGRAColor, BytesLieInBlueGreenRedAlphaOrder)
{
    BGRAColor color(0x11, 0x22, 0x33, 0x44);
    EXPECT_EQ(color.blue, 0x11);
    EXPECT_EQ(color.green, 0x22);
    EXPECT_EQ(color.red, 0x33);
    EXPECT_EQ(color.alpha, 0x44);
    EXPECT_EQ(Word(color), 0x44332211u);

    color.Set(1, 2, 3, 4);
    EXPECT_EQ(Word(color), 0x04030201u);
}

TEST(BGRAColor, CopiesViewTheirOwnBytes)
{
    BGRAColor original(5, 6, 7, 8);
    BGRAColor copy(original);
    EXPECT_EQ(Word(copy), 0x08070605u);
    EXPECT_EQ(static_cast<void*>(&copy.value), static_cast<void*>(&copy.blue));

    BGRAColor assigned;
    assigned = original;
    EXPECT_EQ(Word(assigned), 0x08070605u);
    EXPECT_EQ(static_cast<void*>(&assigned.value), static_cast<void*>(&assigned.blue));
}
