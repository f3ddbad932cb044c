// One number per star of every system of a universe, packed in system order: what the
// magnitude and spectral-class queries compare. The universe never changes, so a query reads
// these arrays instead of visiting every system and star object on the heap, which costs far
// more than the comparisons.
#pragma once

#include "catalog/Star.h"
#include "catalog/Universe.h"
#include "query/StarSysMask.h"

#include <cstdint>
#include <vector>

class PackedStarValues {
public:
    // The first systemCount systems of universe; valueOf gives each star's number.
    PackedStarValues(const Universe* universe, int32_t systemCount, double (*valueOf)(const Star*));

    // How many leading stars of system index a star mode tests, never more than it has.
    int32_t StarsToTest(int32_t index, int32_t starMode) const;
    // The numbers of the stars of system index, in order.
    const double* ValuesOf(int32_t index) const { return fValues.data() + fBegin[size_t(index)]; }

    // Writes 1 for every system with a tested star whose number satisfies test, 0 for the
    // others, into mask; returns how many matched.
    template <typename Test> int32_t Select(StarSysMask* mask, int32_t starMode, Test test) const
    {
        uint8_t* states = mask->states;
        int32_t count = 0;
        const int32_t systems = int32_t(fBegin.size()) - 1;
        for (int32_t i = 0; i < systems; i++) {
            const double* v = ValuesOf(i);
            const int32_t n = StarsToTest(i, starMode);
            bool match = false;
            for (int32_t j = 0; j < n && !match; j++)
                match = test(v[j]);
            states[i] = match;
            count += match;
        }
        return count;
    }

private:
    std::vector<int32_t> fBegin; // per system, where its stars' numbers start; one more at the end
    std::vector<double> fValues;
};
