// The distance test: the length of a system's position less the reference point.
#include "query/DistanceQuery.h"

#include "catalog/Universe.h"

DistanceQuery::DistanceQuery(Universe* universe)
    : StarSysQuery(universe)
    , target(0)
    , reference(0, 0, 0)
{
}

DistanceQuery::~DistanceQuery() = default;

int32_t DistanceQuery::GetSysMask(StarSysMask* mask, void* param)
{
    const auto* p = static_cast<const DistanceQueryParam*>(param);
    target = p->distance;
    // An index past the universe's systems names no system: measured from the origin then.
    if (p->referenceIndex >= 0 && p->referenceIndex < universe->CountItems())
        reference = universe->SystemAt(p->referenceIndex)->position;
    else
        reference.Set(0, 0, 0);
    return StarSysQuery::GetSysMask(mask, param);
}

bool DistanceQuery::Query(int32_t index, void* param)
{
    void* const* systems = Systems();
    PrefetchPosition(systems, index + kPrefetchAhead);
    const auto* p = static_cast<const DistanceQueryParam*>(param);
    const SVector& position = static_cast<const StarSystem*>(systems[index])->position;
    const SVector offset(
        position.x - reference.x, position.y - reference.y, position.z - reference.z);
    return Compare(p->mode, offset.Magnitude(), target, kTolerance);
}
