// Packing one number per star.
#include "query/PackedStarValues.h"

#include "query/StarSysQuery.h"

PackedStarValues::PackedStarValues(
    const Universe* universe, int32_t systemCount, double (*valueOf)(const Star*))
{
    fBegin.reserve(size_t(systemCount) + 1);
    fValues.reserve(size_t(systemCount));
    for (int32_t i = 0; i < systemCount; i++) {
        fBegin.push_back(int32_t(fValues.size()));
        const StarSystem* system = universe->SystemAt(i);
        for (int32_t j = 0; j < system->CountItems(); j++)
            fValues.push_back(valueOf(system->StarAt(j)));
    }
    fBegin.push_back(int32_t(fValues.size()));
}

int32_t PackedStarValues::StarsToTest(int32_t index, int32_t starMode) const
{
    return StarSysQuery::StarsToTest(fBegin[size_t(index) + 1] - fBegin[size_t(index)], starMode);
}
