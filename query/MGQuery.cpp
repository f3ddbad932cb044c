// The magnitude test on each tested star of a system.
#include "query/MGQuery.h"

#include "catalog/Star.h"
#include "catalog/Universe.h"

MGQuery::MGQuery(Universe* universe)
    : StarSysQuery(universe)
    , target(0)
{
}

MGQuery::~MGQuery() = default;

int32_t MGQuery::GetSysMask(StarSysMask* mask, void* param)
{
    target = static_cast<const MGQueryParam*>(param)->magnitude;
    return StarSysQuery::GetSysMask(mask, param);
}

bool MGQuery::Query(int32_t index, void* param)
{
    void* const* systems = Systems();
    PrefetchMembers(systems, index + 2 * kPrefetchAhead);
    PrefetchFirstStar(systems, index + kPrefetchAhead);
    const auto* p = static_cast<const MGQueryParam*>(param);
    const StarSystem* system = static_cast<const StarSystem*>(systems[index]);
    const int32_t stars = StarsToTest(system, p->starMode);
    for (int32_t i = 0; i < stars; i++) {
        if (Compare(p->mode, system->StarAt(i)->GetMagnitude(), target, kTolerance))
            return true;
    }
    return false;
}
