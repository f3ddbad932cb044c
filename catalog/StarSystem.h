// One point in space owning one or more stars; its first star is the primary, whose name
// and luminosity the system carries.
#pragma once

#include "catalog/GravSystem.h"
#include "core/SVector.h"

struct ColorTable;
class Star;

class StarSystem : public GravSystem {
public:
    StarSystem(GravName name, SVector position, double luminosity, const ColorTable* colorTable,
        int32_t blockSize);

    int32_t WhatAmI() const override { return kStarSystemKind; }

    // The i-th star; null outside the range.
    Star* StarAt(int32_t index) const { return static_cast<Star*>(ItemAt(index)); }

    SVector position; // parsecs, the Sun at the origin
    double luminosity; // in Suns: 2.512^(4.7 - absolute magnitude of the primary)
    const ColorTable* colorTable; // the spectral ramp it is drawn with; not owned, may be null
};
