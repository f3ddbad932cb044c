// What a star's spectral type says about its brightness and the reverse, for catalogue rows
// that lack one of the two; published types cut to what the program's catalogue holds; white
// dwarfs' types given the Harvard class of their temperature.
#pragma once

#include "tools/importer/ImportStar.h"

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

// The effective temperature in kelvins of a main-sequence star of this B-V colour; the table's
// hottest or coolest star for a colour beyond its ends.
double TemperatureOfColour(double bv);

// The main-sequence class of this temperature in kelvins, letter and whole subclass ("G6"):
// O3 for anything hotter than an O3 star, M9 for anything cooler than an M9 star.
std::string HarvardClassOfTemperature(double kelvins);

// How a white dwarf's type was placed on the Harvard scale.
enum class WhiteDwarfSource {
    NotNeeded, // not a white dwarf's type, or one the program reads a Harvard letter in
    TemperatureIndex, // from the number after the letters: 50,400 K / index
    Colour, // from B-V, as a main-sequence star of that colour
    Unplaced, // neither: the type stays as it is and the program gives it no class
};

struct WhiteDwarfClass {
    std::string word; // the class word to write, at most 7 characters
    double temperature = 0; // kelvins; 0 when not estimated
    WhiteDwarfSource source = WhiteDwarfSource::NotNeeded;
};

// The program reads a star's class as the first of the letters W O B A F G K M R N in its
// word, of either case. A white dwarf's type (D and a letter of A B C O Q Z X P H E V) holding
// none of them ("DZ", "DQZ", "DQ9P") would leave the star without a class and off the H-R
// diagram, so it gets a colon and the main-sequence class of its temperature ("DQ9P:G6"),
// whose letter the program finds. The temperature comes from the type's index, else from bv
// (B-V) when there is one. When the whole is longer than 7 characters, the white dwarf's part
// is cut to make room (to no less than D and its letter). Any other word is kept as it is.
WhiteDwarfClass PlaceWhiteDwarf(const std::string& word, std::optional<double> bv);

// A published type's word as a reader writes it: PlaceWhiteDwarf's word, counted in report.
std::string PublishedClass(const std::string& word, std::optional<double> bv, ImportReport& report);
