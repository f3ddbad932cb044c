// The spectral-class test: exact numeric equality, or hotter/cooler on the numeric scale.
#include "query/SCQuery.h"

#include "catalog/Star.h"
#include "catalog/Universe.h"

SCQuery::SCQuery(Universe* universe)
    : StarSysQuery(universe)
    , target(0)
    , fClasses(
          universe, systemCount, [](const Star* star) { return star->spectralClass.SCToDouble(); })
{
}

SCQuery::~SCQuery() = default;

int32_t SCQuery::GetSysMask(StarSysMask* mask, void* param)
{
    const auto* p = static_cast<const SCQueryParam*>(param);
    target = p->spectralClass->SCToDouble();
    const int32_t mode = p->mode;
    const double wanted = target;
    return fClasses.Select(
        mask, p->starMode, [mode, wanted](double c) { return Compare(mode, c, wanted, 0); });
}

bool SCQuery::Query(int32_t index, void* param)
{
    const auto* p = static_cast<const SCQueryParam*>(param);
    const double* classes = fClasses.ValuesOf(index);
    const int32_t stars = fClasses.StarsToTest(index, p->starMode);
    for (int32_t i = 0; i < stars; i++) {
        if (Compare(p->mode, classes[i], target, 0))
            return true;
    }
    return false;
}
