// The generated universe the query benchmarks search: a dense sphere of just over a million
// systems, each given stars with names, classes and magnitudes like the catalogue's, and in a
// second universe the other names a star of the Gaia-era sky goes by.
#pragma once

#include "catalog/Star.h"
#include "catalog/Universe.h"

#include <cstdint>
#include <cstdio>
#include <memory>
#include <random>

// Radius of a dense generated universe of just over a million systems (pi r^3 / 10).
inline constexpr double kMillionSystemsRadius = 147.11;

// Gives system number index one star, or two for about one system in eight, named
// "HIP <100000 + index>" and "HIP <100000 + index> B", with classes and magnitudes spread over
// the usual range, and names the system after its first star. Draws from random.
template <typename Generator>
inline void AddCatalogueStars(StarSystem* system, int32_t index, Generator& random)
{
    static const char* kClasses[]
        = { "O9V", "B2IV", "A0V", "F5V", "G2V", "K1III", "M4Ve", "K5", "B9.5V", "G8III" };
    char name[32];
    const int32_t stars = random() % 8 == 0 ? 2 : 1;
    for (int32_t s = 0; s < stars; s++) {
        std::snprintf(name, sizeof name, "HIP %d%s", 100000 + index, s ? " B" : "");
        const double magnitude = static_cast<int32_t>(random() % 2100) * 0.01 - 5;
        system->AddItem(new Star(name, kClasses[random() % 10], magnitude, 1));
    }
    system->SetName(system->StarAt(0)->GetName());
}

// Files under system number index of universe the other names its stars go by in a sky made
// from Gaia and Hipparcos: for each star a Gaia DR3 designation and a Tycho number, for one
// star in three an HD number and for one in eight a Gliese number; about 3.5 names and 70
// bytes a star. Draws from random.
template <typename Generator>
inline void AddOtherNames(Universe& universe, int32_t index, Generator& random)
{
    char name[48];
    const auto add = [&](int length) { universe.otherNames.Add(index, name, size_t(length)); };
    const int32_t stars = universe.SystemAt(index)->CountItems();
    for (int32_t s = 0; s < stars; s++) {
        const unsigned long long gaia = 1000000000000000000ull
            + (uint64_t(random()) << 32 | random()) % 6000000000000000000ull;
        add(std::snprintf(name, sizeof name, "Gaia DR3 %llu", gaia));
        add(std::snprintf(name, sizeof name, "TYC %u-%u-1", unsigned(random() % 9537 + 1),
            unsigned(random() % 20000 + 1)));
        if (random() % 3 == 0)
            add(std::snprintf(name, sizeof name, "HD %u", unsigned(random() % 359083 + 1)));
        if (random() % 8 == 0)
            add(std::snprintf(name, sizeof name, "GJ %u", unsigned(random() % 4000 + 1)));
    }
}

// A new universe of just over a million systems, every system given stars by AddCatalogueStars,
// and other names by AddOtherNames when asked for.
inline std::unique_ptr<Universe> MakeMillionSystems(bool otherNames)
{
    auto u = std::make_unique<Universe>(
        kMillionSystemsRadius, kDenseDensity, 5000, Random(20261121, 4096, 150889, 714025));
    std::mt19937 random(7);
    const int32_t count = u->CountItems();
    for (int32_t i = 0; i < count; i++)
        AddCatalogueStars(u->SystemAt(i), i, random);
    if (otherNames) {
        std::mt19937 more(11);
        for (int32_t i = 0; i < count; i++)
            AddOtherNames(*u, i, more);
        u->otherNames.Trim();
    }
    return u;
}

// Built on the first call and kept for the rest of the run, every system given stars by
// AddCatalogueStars.
inline Universe& MillionSystems()
{
    static std::unique_ptr<Universe> universe = MakeMillionSystems(false);
    return *universe;
}

// The same systems, their stars given other names by AddOtherNames as well.
inline Universe& MillionSystemsWithOtherNames()
{
    static std::unique_ptr<Universe> universe = MakeMillionSystems(true);
    return *universe;
}
