// Building and composing affine transforms.
#include "core/SMatrix.h"

#include <cmath>

void SMatrix::InitIdentity()
{
    for (int row = 0; row < 3; row++) {
        for (int column = 0; column < 4; column++)
            m[row][column] = row == column ? 1.0 : 0.0;
    }
}

void SMatrix::InitScale(double sx, double sy, double sz)
{
    InitIdentity();
    m[0][0] = sx;
    m[1][1] = sy;
    m[2][2] = sz;
}

void SMatrix::InitTranslation(double tx, double ty, double tz)
{
    InitIdentity();
    m[0][3] = tx;
    m[1][3] = ty;
    m[2][3] = tz;
}

void SMatrix::InitXRotation(double angle)
{
    const double c = std::cos(angle), s = std::sin(angle);
    InitIdentity();
    m[1][1] = c;
    m[1][2] = -s;
    m[2][1] = s;
    m[2][2] = c;
}

void SMatrix::InitYRotation(double angle)
{
    const double c = std::cos(angle), s = std::sin(angle);
    InitIdentity();
    m[0][0] = c;
    m[0][2] = s;
    m[2][0] = -s;
    m[2][2] = c;
}

void SMatrix::InitZRotation(double angle)
{
    const double c = std::cos(angle), s = std::sin(angle);
    InitIdentity();
    m[0][0] = c;
    m[0][1] = -s;
    m[1][0] = s;
    m[1][1] = c;
}

SMatrix& SMatrix::operator*=(const SMatrix& b)
{
    // Both operands are copied: b may be this very matrix.
    const SMatrix a = *this;
    const SMatrix bCopy = b;
    const auto& bm = bCopy.m;
    for (int i = 0; i < 3; i++) {
        for (int j = 0; j < 3; j++)
            m[i][j] = bm[i][0] * a.m[0][j] + bm[i][1] * a.m[1][j] + bm[i][2] * a.m[2][j];
        m[i][3] = bm[i][0] * a.m[0][3] + bm[i][1] * a.m[1][3] + bm[i][2] * a.m[2][3] + bm[i][3];
    }
    return *this;
}

SMatrix operator*(const SMatrix& a, const SMatrix& b)
{
    SMatrix product = a;
    product *= b;
    return product;
}
