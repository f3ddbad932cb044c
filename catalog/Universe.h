// The whole catalogue in memory: the ordered list of star systems. A system's index in this
// list is its identity everywhere in the program.
#pragma once

#include "catalog/CatalogueArena.h"
#include "catalog/SpectralClass.h"
#include "catalog/StarNames.h"
#include "catalog/StarSystem.h"
#include "core/Random.h"
#include "platform/BList.h"

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <functional>

// Densities of a generated universe; the value is a factor on the number of systems.
enum stellarDensity : int32_t {
    kSparseDensity = 1,
    kMediumDensity = 5,
    kDenseDensity = 10,
};

// The colour ramp systems of a Harvard class are drawn with: O, B, A, F, G, K, M take spectral
// tables 0 to 6, every other class (W, R, N, none) the table of G. Null while the spectral
// tables are not built.
const ColorTable* SpectralTableFor(HarvardClass hc);

class Universe : public BList {
public:
    explicit Universe(int32_t blockSize);

    // Reads a catalogue of two-line records: a name, then "class magnitude x y z". Stars at
    // exactly the position of the record before them join its system. A relative fileName is
    // looked for beside the executable, an absolute one is taken as it is. A file that cannot
    // be read, or that holds NUL bytes and so is no catalogue, gives an empty universe. Numbers
    // that are not finite read as 0. At most maxStars records are read.
    Universe(const char* fileName, int32_t maxStars, int32_t blockSize);

    // About pi x radius^3 x density / 100 unnamed, starless systems of luminosity 1 at
    // random positions drawn from random; coordinates fall between -3 radius and +radius, as
    // the generator's values can be negative.
    Universe(double radius, stellarDensity density, int32_t blockSize, Random random = Random());

    // Exactly count systems as the constructor above makes them, at the density given, in a cube
    // whose radius is chosen so that the density holds: for demonstrations and measurements.
    static Universe* Generate(
        int32_t count, stellarDensity density, int32_t blockSize, Random random = Random());

    // Destroys every system and, through them, their stars.
    ~Universe() override;
    Universe(const Universe&) = delete;
    Universe& operator=(const Universe&) = delete;

    StarSystem* SystemAt(int32_t index) const { return static_cast<StarSystem*>(ItemAt(index)); }

    // Where the systems, stars and names read from a catalogue are built; released with the
    // universe, after its systems.
    CatalogueArena* Arena() { return &fArena; }

    // Every other name of the stars, by system: filled from a names file beside the catalogue
    // (ReadStarNames) before the universe is shown, only read after that. Empty when there is
    // none.
    StarNames otherNames;

private:
    CatalogueArena fArena;

    // Appends count unnamed, starless systems at random positions drawn from random.
    void Scatter(int64_t count, double radius, Random& random);
};

// The catalogue is read through a window of this many bytes, so a catalogue of a million stars
// never needs its whole text in memory at once.
inline constexpr size_t kCatalogueWindow = size_t(1) << 20;

// What reading a catalogue met that a well-made catalogue does not hold. Lines are the file's
// own, counted from 1: a line longer than the reader takes is still one line.
struct CatalogueReport {
    // The file holds NUL bytes, which no text does: it is not a star catalogue, and nothing of
    // it was kept.
    bool notText = false;

    // What made the first malformed record so.
    enum Cause {
        kLongName, // a name line longer than 500 characters: its rest is read as the data line
        kLongData, // a data line longer than 500 characters: its rest is read as the next name
        kMissingFields, // a data line without its five fields: the missing ones keep the values
                        // of the record before
    };
    // Records whose lines do not give a name and five fields, and where the first of them went
    // wrong. One line too long shifts the pairing of every line after it, so the count says how
    // far the damage reaches.
    int64_t malformed = 0;
    int64_t malformedLine = 0;
    Cause cause = kMissingFields;

    // Records with a number that is not finite (nan, inf, or too large for a double), which
    // is read as 0; and the line of the first.
    int64_t nonFinite = 0;
    int64_t nonFiniteLine = 0;

    // Records kept as read whose position lies farther than kFarthestCatalogueStar parsecs on
    // an axis, or whose absolute magnitude is beyond kBrightestCatalogueMagnitude either way:
    // finite, but no star of a catalogue of the Sun's neighbourhood; and the line of the first.
    int64_t outOfRange = 0;
    int64_t outOfRangeLine = 0;

    bool Clean() const { return !notText && malformed == 0 && nonFinite == 0 && outOfRange == 0; }
    bool operator==(const CatalogueReport&) const = default;
};

// A million parsecs: past the Local Group of galaxies, let alone the Milky Way.
inline constexpr double kFarthestCatalogueStar = 1e6;
// No star is brighter than absolute magnitude -100 or fainter than +100.
inline constexpr double kBrightestCatalogueMagnitude = 100;

// Told how many bytes of the file have been read so far, each time the reading window slides.
using CatalogueProgress = std::function<void(uint64_t bytesRead)>;

// Reads catalogue records from file, from where it stands, and appends their systems to
// universe, as the file constructor does; at most maxStars records. A file holding NUL bytes is
// not a catalogue: what was read of it is taken out of universe again. What the reading met
// goes to report when one is given, how far it got to progress. window is the size of the
// reading window (tests and fuzzing make it small, to reach its edges often). True when reading
// stopped at maxStars with more of the file left.
bool ReadCatalogue(std::FILE* file, int32_t maxStars, Universe* universe,
    size_t window = kCatalogueWindow, CatalogueReport* report = nullptr,
    const CatalogueProgress& progress = {});
