// The universe the program starts with: a catalogue given on the command line, the default one
// wherever it is installed, or a generated one, and what to tell the user about it.
#pragma once

#include "app/CommandLine.h"
#include "catalog/Universe.h"

#include <cstdint>
#include <filesystem>
#include <string>
#include <vector>

// Stars the program's universe holds; a catalogue is read up to here.
inline constexpr int32_t kUniverseMaxStars = 1000000;
// The list of systems grows by this many at a time.
inline constexpr int32_t kUniverseBlockSize = 5000;
// The control window's help line is this many pixels wide: what start-up says there is fitted
// to it, a long file name shortened in its middle.
inline constexpr int kHelpLineWidth = 316;
// A catalogue of this many bytes or more (about 300,000 stars) takes longer than half a second
// or so to read: while it is read, a window shows how far the reading has come. Decided by
// size, not by a clock, so that the same file always shows it or never.
inline constexpr uint64_t kProgressCatalogueBytes = uint64_t(16) << 20;

struct StartedUniverse {
    Universe* universe = nullptr; // never null; the caller owns it
    std::filesystem::path catalogue; // the file read; empty for a generated or empty sky
    std::string report; // for standard error: whole lines, or nothing when all went well
    std::string helpLine; // for the control window's help line at start; empty for nothing
};

// Where the default catalogue may lie, in the order they are tried: stars.dat beside the
// program (a build tree), in $XDG_DATA_HOME/nightdome, in the installation's share/nightdome
// (found from the program's own folder, then the prefix it was built for), then in the
// nightdome folder of each of $XDG_DATA_DIRS.
std::vector<std::filesystem::path> CatalogueCandidates();

// Builds the universe options ask for. A catalogue that cannot be read, holds no stars, or
// holds NUL bytes (no text does) gives an empty sky; one with more than maxStars stars is read
// up to that many. Either is reported on one line of report and on the help line, as is each
// kind of flaw the reading met in a catalogue (lines too long, missing fields, numbers not
// finite or far out of range), with the line of the first and how many records it touched.
// A catalogue of kProgressCatalogueBytes or more is read under a progress window.
StartedUniverse StartUniverse(const StartOptions& options, int32_t maxStars = kUniverseMaxStars);
