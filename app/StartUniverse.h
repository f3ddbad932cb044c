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

// Builds the universe options ask for. A catalogue that cannot be read, or holds no stars,
// gives an empty sky; one with more than maxStars stars is read up to that many. Either is
// reported on one line of report and on the help line.
StartedUniverse StartUniverse(const StartOptions& options, int32_t maxStars = kUniverseMaxStars);
