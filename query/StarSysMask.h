// A set of star systems: one byte per system of a universe, addressed by the system's index in
// the universe's list, with in-place set operators.
#pragma once

#include <cstdint>

class StarSysMask {
public:
    // count is the universe's system count at this moment; a negative count gives an empty
    // mask. universe is an identifier kept for SameUniverse (callers pass 0).
    StarSysMask(int32_t count, bool initial, int32_t universe);
    ~StarSysMask();
    // A mask never changes size and is never duplicated: owners create it with new and copy
    // states between masks of one universe with operator=.
    StarSysMask(const StarSysMask&) = delete;

    void SetAll(bool state);
    void SetStateSafe(int32_t index, bool state); // ignores an index outside the mask
    bool GetStateSafe(int32_t index) const; // false outside the mask
    int32_t CountItems(bool state) const; // elements whose byte equals state exactly
    int32_t GetSystemCount() const { return systemCount; }
    int32_t FindFirst() const; // lowest index in the set, -1 when the set is empty

    // Stores universe as this mask's identifier and answers whether it is non-zero. It is an
    // assignment, not a test: no operation depends on universeID.
    bool SameUniverse(int32_t universe);

    // In place, over this mask's systemCount indices; other must cover at least as many
    // systems (asserted in debug builds). None allocates.
    void operator=(const StarSysMask& other); // states only; count and universeID stay
    void operator+=(const StarSysMask& other); // union, kept apart from |=
    void operator-=(const StarSysMask& other); // a >> b: for 0/1 elements, a and not b
    void operator&=(const StarSysMask& other);
    void operator|=(const StarSysMask& other);
    void operator^=(const StarSysMask& other);
    void operator~(); // complements this mask itself and yields nothing

    int32_t universeID;
    int32_t systemCount;
    uint8_t* states; // systemCount bytes, each 0 or 1; owned, from malloc
};
