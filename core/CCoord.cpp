// Direction to right ascension and declination, and their display split.
#include "core/CCoord.h"

#include "core/Constants.h"

#include <cmath>

CCoord::CCoord(SVector v)
{
    Set(v);
}

CCoord::CCoord(double ra, double dec)
{
    Set(ra, dec);
}

CCoord::CCoord(double decDegrees, double decMinutes, double raHours, double raMinutes)
{
    Set(decDegrees, decMinutes, raHours, raMinutes);
}

void CCoord::Set(SVector v)
{
    v.Normalize();
    Set(std::atan2(-v.z, -v.x), std::atan2(-v.y, std::sqrt(1.0 - v.y * v.y)));
}

void CCoord::Set(double newRa, double newDec)
{
    ra = newRa;
    dec = newDec;

    // Degrees split keeping the sign on the whole part: a declination between -1° and 0°
    // gives -0 degrees, the only place its sign survives, so the minutes are made positive
    // only after the split.
    double whole;
    double minutes = std::modf(dec * 360.0 / (kPI + kPI), &whole) * 60.0;
    decDegrees = whole;
    decMinutes = minutes < 0 ? -minutes : minutes;

    const double displayRa = ra < 0 ? ra + (kPI + kPI) : ra;
    minutes = std::modf(displayRa * 24.0 / (kPI + kPI), &whole) * 60.0;
    raHours = whole;
    raMinutes = minutes;
}

void CCoord::Set(double newDecDegrees, double newDecMinutes, double newRaHours, double newRaMinutes)
{
    decDegrees = newDecDegrees;
    decMinutes = newDecMinutes;
    raHours = newRaHours;
    raMinutes = newRaMinutes;
}

SVector CCoord::GetVector(double distance) const
{
    const double c = std::cos(dec);
    return SVector(
        -distance * c * std::cos(ra), -distance * std::sin(dec), -distance * c * std::sin(ra));
}
