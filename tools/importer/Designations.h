// Star names the program can show: readable Bayer and Flamsteed designations, designations
// built from a position, and the clean-up every written name and spectral class goes through.
#pragma once

#include "tools/importer/ImportStar.h"

#include <initializer_list>
#include <string>
#include <vector>

// "alp CMa" -> "Alpha Canis Majoris", "alp1Cen" and "Alp2Cen" -> "Alpha1 Centauri" and
// "Alpha2 Centauri", "pi 2Col" -> "Pi2 Columbae", "61 Cyg" -> "61 Cygni", "9Alp CMa" -> "Alpha
// Canis Majoris" (the Greek letter is preferred to the Flamsteed number). Empty when the text
// is no designation of this kind.
std::string ReadableDesignation(const std::string& designation);

// The parts of a text separated by blanks.
std::vector<std::string> Words(const std::string& text);

// A Bayer or Flamsteed designation as other catalogues spell it, written out: "alpha1 Cen" ->
// "Alpha1 Centauri", "61 Cyg" -> "61 Cygni", "p Eri" -> "p Eridani", "xi UMa Bb" -> "Xi Ursae
// Majoris Bb". Empty for anything else, such as variable-star names ("V645 Cen", "BL Cet").
std::string WrittenOutDesignation(const std::string& id);

// Every way a Bayer or Flamsteed designation is commonly written, written out first: "alpha1
// Cen" -> "Alpha1 Centauri", "alf1 Cen", "alp1 Cen"; "61 Cyg B" -> "61 Cygni B", "61 Cyg B".
// The short forms use the three-letter Greek abbreviations of the astronomical databases (and
// the older "alp", "the", "xi" where they differ). Empty for anything else.
std::vector<std::string> DesignationForms(const std::string& id);

// The genitive of a constellation's three-letter abbreviation ("Cyg" -> "Cygni"); empty when
// unknown. Case matters only where it tells two constellations apart.
std::string ConstellationGenitive(const std::string& abbreviation);

// "J064508.9-164258": right ascension in hours, minutes and tenths of seconds, declination in
// degrees, arc-minutes and arc-seconds, for an equinox J2000 position in radians.
std::string PositionDesignation(double ra, double dec);

// A name as the catalogue file can hold it: control characters become blanks, runs of blanks
// one blank, no blanks at either end, at most 79 bytes (never cutting a UTF-8 character).
std::string CleanName(const std::string& name);

// The first of the candidates that is not empty once cleaned, else the position designation;
// ra and dec in radians.
std::string ChooseName(std::initializer_list<std::string> candidates, double ra, double dec);

// A spectral type as the catalogue file can hold it: one word of at most 7 characters, the
// program's limit. Blanks and everything but printable ASCII are left out ("K2 III" ->
// "K2III"), the rest is cut to its first 7 characters; empty when nothing is left.
std::string CleanSpectralClass(const std::string& type);

// A name a catalogue offers for a star, and what kind of name it is.
struct NameCandidate {
    std::string text;
    NameKind kind;
};

// Gives the star the first candidate that is not empty once cleaned, with its kind, else the
// position designation (star.ra and star.dec must be set).
void NameStar(ImportStar& star, std::initializer_list<NameCandidate> candidates);
