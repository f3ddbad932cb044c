// BPoint.h: a point of two floats in pixel coordinates, y growing downward.
#pragma once

class BPoint {
public:
    constexpr BPoint() = default;
    constexpr BPoint(float px, float py)
        : x(px)
        , y(py)
    {
    }

    float x = 0.0f;
    float y = 0.0f;
};
