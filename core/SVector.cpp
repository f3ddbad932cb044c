// Vector arithmetic and the two perspective projections.
#include "core/SVector.h"

#include <cmath>

double SVector::Magnitude() const
{
    return std::sqrt(x * x + y * y + z * z);
}

void SVector::Normalize()
{
    const double magnitude = Magnitude();
    x /= magnitude;
    y /= magnitude;
    z /= magnitude;
}

void SVector::Scale(double factor)
{
    x *= factor;
    y *= factor;
    z *= factor;
}

double SVector::DotProduct(const SVector* other) const
{
    return x * other->x + y * other->y + z * other->z;
}

void SVector::CrossProduct(const SVector* other, SVector* result) const
{
    const SVector a = *this;
    const SVector b = *other; // result may alias either operand
    result->x = a.y * b.z - a.z * b.y;
    result->y = a.z * b.x - a.x * b.z;
    result->z = a.x * b.y - a.y * b.x;
}
