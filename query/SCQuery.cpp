// The spectral-class test: exact numeric equality, or hotter/cooler on the numeric scale.
#include "query/SCQuery.h"

#include "catalog/Star.h"
#include "catalog/Universe.h"

SCQuery::SCQuery(Universe* universe)
    : StarSysQuery(universe)
    , target(0)
{
}

SCQuery::~SCQuery() = default;

int32_t SCQuery::GetSysMask(StarSysMask* mask, void* param)
{
    target = static_cast<const SCQueryParam*>(param)->spectralClass->SCToDouble();
    return StarSysQuery::GetSysMask(mask, param);
}

bool SCQuery::Query(int32_t index, void* param)
{
    void* const* systems = Systems();
    PrefetchMembers(systems, index + 2 * kPrefetchAhead);
    PrefetchFirstStar(systems, index + kPrefetchAhead);
    const auto* p = static_cast<const SCQueryParam*>(param);
    const StarSystem* system = static_cast<const StarSystem*>(systems[index]);
    const int32_t stars = StarsToTest(system, p->starMode);
    for (int32_t i = 0; i < stars; i++) {
        const double value = system->StarAt(i)->spectralClass.SCToDouble();
        if (Compare(p->mode, value, target, 0))
            return true;
    }
    return false;
}
