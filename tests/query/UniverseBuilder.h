// Small universes built in code for the query tests: systems at chosen positions with chosen
// stars, without going through a catalogue file.
#pragma once

#include "catalog/Star.h"
#include "catalog/Universe.h"

#include <initializer_list>

struct TestStar {
    const char* name;
    const char* spectralClass;
    double magnitude;
};

// Appends a system at (x, y, z) parsecs holding the given stars in order; the system takes
// the first star's name. Returns its index.
inline int32_t AddTestSystem(
    Universe& universe, double x, double y, double z, std::initializer_list<TestStar> stars)
{
    const char* name = stars.size() > 0 ? stars.begin()->name : "";
    auto* system = new StarSystem(name, SVector(x, y, z), 1.0, nullptr, 2);
    for (const TestStar& star : stars)
        system->AddItem(new Star(star.name, star.spectralClass, star.magnitude, 1));
    universe.AddItem(system);
    return universe.CountItems() - 1;
}

// Three neighbours of the Sun at their places, for the window tests: the Sun, Sirius with its
// white dwarf, and Vega, appended in that order.
struct Neighbours {
    int32_t sun, sirius, vega;
};
inline Neighbours AddNeighbours(Universe& universe)
{
    Neighbours n {};
    n.sun = AddTestSystem(universe, 0, 0, 0, { { "The Sun", "G2V", 4.83 } });
    n.sirius = AddTestSystem(universe, -0.494, -0.759, 2.477,
        { { "Sirius", "A1V", 1.43 }, { "Sirius B", "DA2", 11.3 } });
    n.vega = AddTestSystem(universe, 1.0, 4.9, -5.0, { { "Vega", "A0V", 0.58 } });
    return n;
}
