// The magnitude test on each tested star of a system.
#include "query/MGQuery.h"

#include "catalog/Star.h"
#include "catalog/Universe.h"

MGQuery::MGQuery(Universe* universe)
    : StarSysQuery(universe)
    , target(0)
    , fMagnitudes(universe, systemCount, [](const Star* star) { return star->GetMagnitude(); })
{
}

MGQuery::~MGQuery() = default;

int32_t MGQuery::GetSysMask(StarSysMask* mask, void* param)
{
    const auto* p = static_cast<const MGQueryParam*>(param);
    target = p->magnitude;
    const int32_t mode = p->mode;
    const double wanted = target;
    return fMagnitudes.Select(mask, p->starMode,
        [mode, wanted](double m) { return Compare(mode, m, wanted, kTolerance); });
}

bool MGQuery::Query(int32_t index, void* param)
{
    const auto* p = static_cast<const MGQueryParam*>(param);
    const double* magnitudes = fMagnitudes.ValuesOf(index);
    const int32_t stars = fMagnitudes.StarsToTest(index, p->starMode);
    for (int32_t i = 0; i < stars; i++) {
        if (Compare(p->mode, magnitudes[i], target, kTolerance))
            return true;
    }
    return false;
}
