// BRect.h: an axis-aligned rectangle of four floats in pixel coordinates, y growing downward.
// Both edges are inclusive: (0, 0, 31, 31) covers 32 x 32 pixels.
#pragma once

class BRect {
public:
    constexpr BRect() = default;
    constexpr BRect(float l, float t, float r, float b)
        : left(l)
        , top(t)
        , right(r)
        , bottom(b)
    {
    }

    // Distances between the edges; a 32-pixel-wide bitmap's bounds have a Width() of 31.
    constexpr float Width() const { return right - left; }
    constexpr float Height() const { return bottom - top; }

    float left = 0.0f;
    float top = 0.0f;
    float right = -1.0f;
    float bottom = -1.0f;
};
