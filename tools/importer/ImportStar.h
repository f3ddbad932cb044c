// What the importer knows of one star, whatever catalogue it came from, and how it reports
// trouble with its input.
#pragma once

#include <cstdint>
#include <map>
#include <stdexcept>
#include <string>

// Where a star's name came from, best first, for the import's report.
enum class NameKind {
    Proper, // a common name: "Sirius", "Barnard's Star"
    Designation, // Bayer or Flamsteed, written out: "Alpha Centauri", "61 Cygni"
    Gliese, // "GJ 1061"
    HenryDraper, // "HD 48915"
    Other, // a name the input gave without saying what it is, or another catalogue's number
    Position, // built from the position: "J210654.0+384458"
};

struct ImportStar {
    std::string name; // as written: at most 79 characters, no line feeds
    double ra = 0; // right ascension, radians
    double dec = 0; // declination, radians
    double parallax = 0; // milliarcseconds, > 0
    double absoluteMagnitude = 0;
    std::string spectralClass; // one word without blanks
    int64_t line = 0; // where the star stood in its source, for messages
    // Stars with the same group number of 0 or more are one system as they stand; -1 leaves
    // the grouping to the sky-and-parallax rule.
    int64_t group = -1;
    NameKind nameKind = NameKind::Other;
    // The absolute magnitude is measured (from an apparent magnitude and the distance), not
    // estimated from the spectral type; only measured stars are matched across catalogues.
    bool measured = true;
    bool classEstimated = false; // the spectral class is not published but estimated
    // The star's own letter in its multiple system as its source publishes it ('A' to 'Z'), 0
    // when it gives none; a name the star shares with its companions takes this letter.
    char component = 0;
    // The star's Gaia DR3 source id, 0 when its catalogue gives none: the same id in two
    // catalogues is the same star.
    uint64_t gaiaId = 0;
    // The star's other names ("HD 48915", "alf CMa", "Gaia DR3 ..."), each ended by a tab;
    // the shown name may be among them and is left out when they are written.
    std::string aliases;
};

// Adds name to the star's other names unless it is empty or already there.
void AddAlias(ImportStar& star, const std::string& name);
// Adds every name of a tab-ended list (ImportStar::aliases) to the star's other names.
void AddAliases(ImportStar& star, const std::string& names);
// Calls f with each name of a tab-ended list (ImportStar::aliases).
template <typename F> void ForEachAlias(const std::string& names, F f)
{
    size_t begin = 0;
    for (size_t tab; (tab = names.find('\t', begin)) != std::string::npos; begin = tab + 1)
        f(names.substr(begin, tab - begin));
}

// What the importer did with its input: stars read, and the ones left out, by reason.
struct ImportReport {
    std::string source; // file name, or a description of generated data
    std::string format;
    int64_t read = 0;
    std::map<std::string, int64_t> skipped; // reason -> count
    int64_t classesFromColour = 0; // spectral class estimated from the B-V colour index
    int64_t classesFromMagnitude = 0; // estimated from the absolute magnitude
    int64_t magnitudesFromClass = 0; // absolute magnitude estimated from the spectral type
    int64_t classesAssumed = 0; // neither type, colour nor magnitude: a typical red dwarf
    // White dwarfs' types the program reads no class in, given the main-sequence class of the
    // temperature from their temperature index, from their B-V colour, or left as they were.
    int64_t whiteDwarfsFromIndex = 0;
    int64_t whiteDwarfsFromColour = 0;
    int64_t whiteDwarfsUnplaced = 0;

    int64_t Skipped() const;
    void Skip(const std::string& reason) { skipped[reason]++; }
};

// Bad input: names the file, the line (0 when the trouble is the whole file) and the reason.
class ImportError : public std::runtime_error {
public:
    ImportError(const std::string& file, int64_t line, const std::string& reason);

    std::string file;
    int64_t line;
    std::string reason;
};

// Distance in parsecs for a parallax in milliarcseconds.
inline double ParsecsFromParallax(double parallaxMas)
{
    return 1000.0 / parallaxMas;
}
