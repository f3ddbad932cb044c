// Readers of the catalogues the importer understands. Each appends the usable stars of its
// input to a list, counts the ones it leaves out, and throws ImportError on bad input.
#pragma once

#include "tools/importer/ImportStar.h"

#include <istream>
#include <string>
#include <vector>

// The Hipparcos-derived catalogue of Debian's kstars-data package: '#' comment lines, then
// fixed columns (right ascension hhmmss.ss, declination +ddmmss.s, proper motions, parallax in
// milliarcseconds, V magnitude, B-V, a two-character spectral type, flags), then
// ", designation, common name".
void ReadKStars(std::istream& in, const std::string& file, std::vector<ImportStar>& stars,
    ImportReport& report);

// The HYG database: a header row naming the columns (ra in hours, dec in degrees, dist in
// parsecs, mag, absmag, spect, ci, proper, bf, gl, hip, hd, ...).
void ReadHyg(std::istream& in, const std::string& file, std::vector<ImportStar>& stars,
    ImportReport& report);

// A plain CSV with a header row: name, ra and dec in degrees, parallax in milliarcseconds or
// distance in parsecs, mag (apparent V) or absmag, and optionally spect and bv.
void ReadPlainCsv(std::istream& in, const std::string& file, std::vector<ImportStar>& stars,
    ImportReport& report);

// The star tables of Southern Stars Group (SSCore, SSData/Stars: Nearest.csv, Brightest.csv):
// a header row, then RA "h m s", Dec "+d m s" (J2000), V and B magnitudes, Dist in parsecs,
// the spectral type as published right after RV, IDs and Names separated by semicolons.
void ReadSouthernStars(std::istream& in, const std::string& file, std::vector<ImportStar>& stars,
    ImportReport& report);

// A deterministic synthetic catalogue of count stars for benchmarks: names, classes,
// magnitudes and positions drawn from seed, about one star in eight a companion of the star
// before it at the same position.
void GenerateStars(
    int64_t count, uint64_t seed, std::vector<ImportStar>& stars, ImportReport& report);

// The Harvard letter a B-V colour index suggests, for stars without a spectral type.
const char* ClassFromColour(double bv);

// Splits one CSV line into fields: commas separate, double quotes enclose fields that hold
// commas, and a doubled quote inside them stands for one.
std::vector<std::string> SplitCsvLine(const std::string& line);
