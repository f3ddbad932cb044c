// BGRAColor.cpp: construction and assignment of the four colour bytes.
#include "render/BGRAColor.h"

BGRAColor::BGRAColor()
    : blue(0)
    , green(0)
    , red(0)
    , alpha(0)
    , value(*reinterpret_cast<uint32_t*>(&blue))
{
}

BGRAColor::BGRAColor(uint8_t b, uint8_t g, uint8_t r, uint8_t a)
    : value(*reinterpret_cast<uint32_t*>(&b))
{
    Set(b, g, r, a);
}

BGRAColor::BGRAColor(const BGRAColor& other)
    : blue(other.blue)
    , green(other.green)
    , red(other.red)
    , alpha(other.alpha)
    , value(*reinterpret_cast<uint32_t*>(&blue))
{
}

BGRAColor& BGRAColor::operator=(const BGRAColor& other)
{
    Set(other.blue, other.green, other.red, other.alpha);
    return *this;
}

void BGRAColor::Set(uint8_t b, uint8_t g, uint8_t r, uint8_t a)
{
    blue = b;
    green = g;
    red = r;
    alpha = a;
}
