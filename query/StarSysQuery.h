// The common part of the six star-system queries: one criterion, decided for every system of
// a universe and written into a StarSysMask.
#pragma once

#include "catalog/Star.h"
#include "catalog/Universe.h"

#include <cstdint>

class StarSysMask;

// Comparison modes of the numeric queries; any other value matches nothing.
enum : int32_t {
    kQueryIs = 0, // equal, within the query's tolerance
    kQueryLessThan = 1, // strictly less
    kQueryGreaterThan = 2, // strictly greater
};

// Which stars of a system the spectral-class and magnitude queries test; any other value
// means the first star only.
enum : int32_t {
    kAnyStarInSystem = 0,
    kFirstStarInSystem = 1,
    kFirstOrSecondStar = 2,
};

class StarSysQuery {
public:
    // Takes the universe's system count now: systems added later are not searched.
    explicit StarSysQuery(Universe* universe);
    virtual ~StarSysQuery();
    StarSysQuery(const StarSysQuery&) = delete;
    StarSysQuery& operator=(const StarSysQuery&) = delete;

    // Writes 1 for every matching system and 0 for every other at indices 0 to systemCount - 1
    // of mask, which must cover at least that many; returns the number of matches. param
    // points at the record of the concrete query's kind.
    virtual int32_t GetSysMask(StarSysMask* mask, void* param);
    virtual uint32_t QueryType() const = 0; // four characters, e.g. 'Dist'
    virtual bool Query(int32_t index, void* param) = 0; // whether the system at index matches

    // Comparison of value with target in one of the comparison modes; tolerance widens "is"
    // to the closed interval [target - tolerance, target + tolerance].
    static bool Compare(int32_t mode, double value, double target, double tolerance)
    {
        switch (mode) {
        case kQueryIs:
            return target - tolerance <= value && value <= target + tolerance;
        case kQueryLessThan:
            return value < target;
        case kQueryGreaterThan:
            return value > target;
        default:
            return false;
        }
    }

    // Compare, decided from a cheap key of the value where it can be: bounds holds the keys of
    // target - tolerance, target + tolerance and target, the key rising with the value, and
    // margin is more than the key's error can hide. Answers 1 or 0 when the key is clear of
    // every bound the mode looks at by margin, -1 when only the value itself can tell.
    static int32_t CompareByKey(int32_t mode, double key, const double bounds[3], double margin)
    {
        switch (mode) {
        case kQueryIs:
            if (key < bounds[0] - margin || key > bounds[1] + margin)
                return 0;
            if (key > bounds[0] + margin && key < bounds[1] - margin)
                return 1;
            return -1;
        case kQueryLessThan:
            if (key < bounds[2] - margin)
                return 1;
            return key > bounds[2] + margin ? 0 : -1;
        case kQueryGreaterThan:
            if (key > bounds[2] + margin)
                return 1;
            return key < bounds[2] - margin ? 0 : -1;
        default:
            return 0;
        }
    }

    // How many leading stars of system a star mode tests, never more than the system has.
    static int32_t StarsToTest(const StarSystem* system, int32_t starMode)
    {
        return StarsToTest(system->CountItems(), starMode);
    }
    // The same for a system of `stars` stars.
    static int32_t StarsToTest(int32_t stars, int32_t starMode)
    {
        switch (starMode) {
        case kAnyStarInSystem:
            return stars;
        case kFirstOrSecondStar:
            return stars < 2 ? stars : 2;
        default:
            return stars < 1 ? stars : 1;
        }
    }

    Universe* universe; // not owned
    int32_t systemCount; // the universe's count when the query was made

protected:
    // Systems are separate heap objects and a pass touches each once, so without help every
    // system is a wait on memory. Query(index) is called in index order; these ask for the
    // lines of a system some places ahead of the one being tested. They only hint: nothing is
    // read from the lines they name.
    //
    // They are always inlined: GCC takes a function that does nothing but prefetch for one
    // without side effects and drops every call to it, prefetches and all, before it would
    // inline it.
    static constexpr int32_t kPrefetchAhead = 16;

    // The universe's systems, contiguous: one call per test instead of one per system read.
    void* const* Systems() const { return universe->Items(); }

    // The position of the system at index.
    [[gnu::always_inline]] void PrefetchPosition(void* const* systems, int32_t index) const
    {
        if (index < systemCount) {
            const auto* system = static_cast<const StarSystem*>(systems[index]);
            __builtin_prefetch(&system->position.x);
            __builtin_prefetch(&system->position.z);
        }
    }

    // The member list of the system at index, which PrefetchFirstStar reads later.
    [[gnu::always_inline]] void PrefetchMembers(void* const* systems, int32_t index) const
    {
        if (index < systemCount)
            __builtin_prefetch(systems[index]);
    }

    // The magnitude, class and name pointer of the first star of the system at index.
    [[gnu::always_inline]] void PrefetchFirstStar(void* const* systems, int32_t index) const
    {
        if (index < systemCount) {
            const auto* system = static_cast<const StarSystem*>(systems[index]);
            if (system->CountItems() > 0) {
                const Star* star = system->StarAt(0);
                __builtin_prefetch(&star->name); // the star itself; no load before the search
                __builtin_prefetch(&star->magnitude);
                __builtin_prefetch(&star->spectralClass.decimalClass);
            }
        }
    }
};
