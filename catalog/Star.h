// One star: its absolute magnitude and spectral class.
#pragma once

#include "catalog/GravSystem.h"
#include "catalog/SpectralClass.h"

#include <cmath>

// A star's luminosity in Suns from its absolute magnitude: 2.512 to the power of the
// magnitudes it is brighter than the Sun, whose absolute magnitude is taken as 4.7.
inline double SolarLuminosity(double absoluteMagnitude)
{
    return std::pow(2.512, 4.7 - absoluteMagnitude);
}

class Star : public GravSystem {
public:
    Star(GravName name, const char* spectralClassText, double magnitude, int32_t blockSize);
    // With a class already parsed: a catalogue holds few different class texts.
    Star(GravName name, const SpectralClass& spectralClass, double magnitude, int32_t blockSize);

    int32_t WhatAmI() const override { return kStarKind; }

    double GetMagnitude() const { return magnitude; }
    SpectralClass* GetSpectralClass() { return &spectralClass; }
    const SpectralClass* GetSpectralClass() const { return &spectralClass; }
    const char* GetSpectralClassString() const { return spectralClass.GetSCString(); }

    double magnitude; // absolute magnitude, as read from the catalogue
    SpectralClass spectralClass;
};
