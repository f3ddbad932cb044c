// The whole catalogue in memory: the ordered list of star systems. A system's index in this
// list is its identity everywhere in the program.
#pragma once

#include "catalog/SpectralClass.h"
#include "catalog/StarSystem.h"
#include "core/Random.h"
#include "platform/BList.h"

#include <cstddef>
#include <cstdint>
#include <cstdio>

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
    // be read gives an empty universe. At most maxStars records are read.
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

private:
    // Appends count unnamed, starless systems at random positions drawn from random.
    void Scatter(int64_t count, double radius, Random& random);
};

// The catalogue is read through a window of this many bytes, so a catalogue of a million stars
// never needs its whole text in memory at once.
inline constexpr size_t kCatalogueWindow = size_t(1) << 20;

// Reads catalogue records from file, from where it stands, and appends their systems to
// universe, as the file constructor does; at most maxStars records. window is the size of the
// reading window (tests and fuzzing make it small, to reach its edges often). True when reading
// stopped at maxStars with more of the file left.
bool ReadCatalogue(
    std::FILE* file, int32_t maxStars, Universe* universe, size_t window = kCatalogueWindow);
