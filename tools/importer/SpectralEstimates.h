// What a star's spectral type says about its brightness and the reverse, for catalogue rows
// that lack one of the two, and published types cut to what the program's catalogue holds.
#pragma once

#include <optional>
#include <string>

// The absolute visual magnitude of a main-sequence star of this type ("M4.5V", "K2", "sdM1V"),
// or of a white dwarf for the types of class D ("DA1.9", "DQ6"); nothing when the type names
// no class from O to L.
std::optional<double> MagnitudeOfType(const std::string& type);

// The main-sequence type ("M4V") whose absolute visual magnitude is nearest to this one.
std::string TypeOfMagnitude(double absoluteMagnitude);

// A published type as one word of at most 7 characters: kept whole when it fits, else the
// first star's type of a composite ("G8III+G1III" -> "G8III"), else the letter, subclass and
// luminosity class without what follows ("K0III-IV" -> "K0III", "B9.5IIIpHgMn" -> "B9.5III").
std::string ShortSpectralType(const std::string& type);
