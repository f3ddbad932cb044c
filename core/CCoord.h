// Celestial coordinates of a direction: right ascension and declination in radians, and
// the hours, minutes, degrees and arc-minutes the program shows.
#pragma once

#include "core/SVector.h"

class CCoord {
public:
    // Takes the vector from the seen object back to the observer (observer minus object):
    // (1, 0, 0) then reads right ascension 0 h, declination 0; (0, 0, 1) 6 h; (0, 1, 0) +90°.
    explicit CCoord(SVector v);
    CCoord(double ra, double dec);
    // Stores the four display values as given; dec and ra stay unset.
    CCoord(double decDegrees, double decMinutes, double raHours, double raMinutes);
    ~CCoord() = default;

    void Set(SVector v);
    void Set(double ra, double dec);
    void Set(double decDegrees, double decMinutes, double raHours, double raMinutes);

    // The vector from an object at this direction and distance back to the observer, the
    // inverse of Set(SVector) scaled by distance.
    SVector GetVector(double distance) const;

    double dec; // radians, -pi/2 to pi/2
    double ra; // radians as computed, -pi to pi (not brought into 0 to 2 pi)
    double decDegrees; // whole degrees, signed, truncated toward zero (-0 just south of 0)
    double decMinutes; // arc-minutes, never negative
    double raHours; // whole hours, 0 to 23
    double raMinutes; // minutes of time, 0 up to 60
};
