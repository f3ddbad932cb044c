// Running a query over every system of its universe.
#include "query/StarSysQuery.h"

#include "catalog/Universe.h"
#include "query/StarSysMask.h"

StarSysQuery::StarSysQuery(Universe* universe)
    : universe(universe)
    , systemCount(universe->CountItems())
{
}

StarSysQuery::~StarSysQuery() = default;

int32_t StarSysQuery::GetSysMask(StarSysMask* mask, void* param)
{
    uint8_t* states = mask->states;
    int32_t count = 0;
    for (int32_t i = 0; i < systemCount; i++) {
        const bool match = Query(i, param);
        states[i] = match;
        count += match;
    }
    return count;
}
