// Affine transforms of 3-space (rotation, scale, translation) as 3 x 4 matrices.
//
// Composition reads in order of application: a *= b makes a transform that applies a first
// and then b, so m1 * m2 * m3 applies m1 first. The camera chain is written that way.
#pragma once

#include "core/SVector.h"

class SMatrix {
public:
    // Elements are left unset; call one of the Init operations first.
    SMatrix() = default;

    void InitIdentity();
    void InitScale(double sx, double sy, double sz);
    void InitTranslation(double tx, double ty, double tz);
    // Right-handed rotations by an angle in radians, counter-clockwise seen from the positive
    // end of the axis: about x turns y toward z, about y turns z toward x, about z turns x
    // toward y.
    void InitXRotation(double angle);
    void InitYRotation(double angle);
    void InitZRotation(double angle);

    // This becomes "this, then b" (b·this in matrix notation). b may be this matrix.
    SMatrix& operator*=(const SMatrix& b);

    // v becomes M·v + t. Runs once per star per frame, hence inline.
    void Transform(SVector* v) const
    {
        const double x = v->x, y = v->y, z = v->z;
        v->x = m[0][0] * x + m[0][1] * y + m[0][2] * z + m[0][3];
        v->y = m[1][0] * x + m[1][1] * y + m[1][2] * z + m[1][3];
        v->z = m[2][0] * x + m[2][1] * y + m[2][2] * z + m[2][3];
    }

    // m[row][column]; columns 0 to 2 are the linear part, column 3 the translation. The
    // fourth row is (0, 0, 0, 1) and not stored.
    double m[3][4];
};

// A copy of a, then *= b: the transform a-then-b.
SMatrix operator*(const SMatrix& a, const SMatrix& b);
