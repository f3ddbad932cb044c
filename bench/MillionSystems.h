// The generated universe the query benchmarks search: a dense sphere of just over a million
// systems, each given stars with names, classes and magnitudes like the catalogue's.
#pragma once

#include "catalog/Star.h"
#include "catalog/Universe.h"

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

// Built on the first call and kept for the rest of the run, every system given stars by
// AddCatalogueStars.
inline Universe& MillionSystems()
{
    static std::unique_ptr<Universe> universe = [] {
        auto u = std::make_unique<Universe>(
            kMillionSystemsRadius, kDenseDensity, 5000, Random(20261121, 4096, 150889, 714025));
        std::mt19937 random(7);
        const int32_t count = u->CountItems();
        for (int32_t i = 0; i < count; i++)
            AddCatalogueStars(u->SystemAt(i), i, random);
        return u;
    }();
    return *universe;
}
