// What a query selects, as a set of system indices.
#pragma once

#include "catalog/Universe.h"
#include "query/StarSysMask.h"
#include "query/StarSysQuery.h"

#include <gtest/gtest.h>

#include <set>

// Runs query into a fresh mask of the universe's count that starts all true, so every 0 in the
// answer was written by the query; checks the returned count against the mask's.
inline std::set<int32_t> Matches(StarSysQuery& query, void* param)
{
    StarSysMask mask(query.universe->CountItems(), true, 0);
    const int32_t count = query.GetSysMask(&mask, param);
    EXPECT_EQ(count, mask.CountItems(true));
    std::set<int32_t> found;
    for (int32_t i = 0; i < mask.systemCount; i++) {
        if (mask.GetStateSafe(i))
            found.insert(i);
    }
    return found;
}
