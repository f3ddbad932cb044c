// A 3-vector of doubles: star positions, camera positions and every transformed point.
#pragma once

#include "core/Truncate.h"

#include <cmath>
#include <cstdint>

class SVector {
public:
    // Components are left unset, as for any plain double.
    SVector() = default;
    SVector(double x, double y, double z)
        : x(x)
        , y(y)
        , z(z)
    {
    }

    void Set(double newX, double newY, double newZ)
    {
        x = newX;
        y = newY;
        z = newZ;
    }

    double Magnitude() const;
    void Normalize(); // divides by the magnitude; a zero vector becomes NaN
    void Scale(double factor);
    double DotProduct(const SVector* other) const;
    void CrossProduct(const SVector* other, SVector* result) const; // result = this x other

    // Spherical perspective for a point in eye space, the eye at the origin: the screen
    // offset is the component divided by the distance to the eye (not by z), truncated
    // toward zero. Screen y grows downward, so PProjectY turns the sign of y.
    // They run once per star per frame, hence inline.
    int32_t PProjectX(double scale, double offset) const
    {
        return TruncateToInt32(x * scale / std::sqrt(x * x + y * y + z * z) + offset);
    }
    int32_t PProjectY(double scale, double offset) const
    {
        return TruncateToInt32(-y * scale / std::sqrt(x * x + y * y + z * z) + offset);
    }

    double x;
    double y;
    double z;
};
