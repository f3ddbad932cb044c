// Bringing a second catalogue into the stars of the first: the same star found in both by its
// place on the sky and its brightness, never by the text of its name.
#pragma once

#include "tools/importer/ImportStar.h"

#include <cstdint>
#include <string>
#include <vector>

// The rule: a star of the second catalogue and one of the first are the same star when both
// name the same Gaia source (ImportStar::gaiaId), whatever their place and brightness; else when
// they lie within kMatchArcsec of each other and their visual magnitudes differ by at most
// kMatchMagnitudes; failing that, when they lie within kWideMatchArcsec, their magnitudes
// differ by at most kWideMatchMagnitudes and their distances by at most kWideMatchDistance
// (a fraction of the second's). Both catalogues give J2000 positions. Pairs are taken closest
// first (angle over its limit plus magnitude difference over its limit), each star in at
// most one pair; only stars with a measured magnitude take part.
inline constexpr double kMatchArcsec = 5;
inline constexpr double kMatchMagnitudes = 1.0;
inline constexpr double kWideMatchArcsec = 60;
inline constexpr double kWideMatchMagnitudes = 0.25;
inline constexpr double kWideMatchDistance = 0.10;

// Pairs of (index into second, index into first) by the rule above.
std::vector<std::pair<size_t, size_t>> MatchStars(
    const std::vector<ImportStar>& first, const std::vector<ImportStar>& second);

// What bringing one catalogue in did.
struct MergeReport {
    ImportReport read; // what was read from it
    bool adds = false; // every star added (--add), or the matched ones relabelled (--annotate)
    int64_t matched = 0; // stars found in the catalogue they were brought into
    int64_t added = 0; // stars added that were not there
    int64_t typesChanged = 0; // matched stars whose spectral type changed
    int64_t namesChanged = 0; // matched stars whose name changed
};

// Every star of extra joins stars; a star of stars that matches one is replaced by it, in its
// place, since extra holds the better data (position, distance, magnitude, type, name).
void AddStars(std::vector<ImportStar>& stars, std::vector<ImportStar> extra, MergeReport& report);

// Stars that match a star of labels take its published spectral type, and its name when that
// is of a kind at least as good as theirs (NameKind's order).
void AnnotateStars(
    std::vector<ImportStar>& stars, const std::vector<ImportStar>& labels, MergeReport& report);

// Stars that share one name ("Fomalhaut" for the star and two wide companions, "61 Cygni" for
// both stars of the pair) and lie within a parsec of the brightest of them get component
// letters, brightest first: "Fomalhaut A", "B", "C". A star whose source gives its own letter
// (ImportStar::component) takes that one first, while no other star carries it ("Omicron2
// Eridani B" and "C" for the companions of Keid). A letter another star already carries is
// passed over, so no name is written twice ("Sirius A", "Sirius C" beside "Sirius B").
// Names made from the position and names that already end in a component letter are left, and
// so are stars far apart that share a name and names shared by more stars than there are free
// letters.
// Returns how many names were lettered.
int64_t LetterSharedNames(std::vector<ImportStar>& stars);

// The visual magnitude the star is seen at from the Sun.
double ApparentMagnitude(const ImportStar& star);
