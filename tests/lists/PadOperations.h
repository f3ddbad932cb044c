// What each drop target of a list window makes of a list of systems {1, 2, 3} when {3, 4} is
// dropped on it, in a universe of 20 systems: the set operations the list tests check for every
// kind of drop.
#pragma once

#include <cstdint>
#include <vector>

struct PadOperation {
    const char* pad; // null: the window outside any pad
    std::vector<int32_t> expected;
};

inline std::vector<PadOperation> PadOperationsOnOneTwoThree()
{
    std::vector<int32_t> notExpected; // every system but those dropped
    for (int32_t i = 0; i < 20; i++) {
        if (i != 3 && i != 4)
            notExpected.push_back(i);
    }
    return {
        { nullptr, { 1, 2, 3, 4 } },
        { "Plus", { 1, 2, 3, 4 } },
        { "Equals", { 3, 4 } },
        { "Minus", { 1, 2 } },
        { "NOT", notExpected },
        { "AND", { 3 } },
        { "OR", { 1, 2, 3, 4 } },
        { "XOR", { 1, 2, 4 } },
    };
}
