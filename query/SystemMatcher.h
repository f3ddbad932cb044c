// Finding the star system a row of a table means, by name or by position, over a universe
// that never changes: the names in a hash map and the positions in an index sorted by x, both
// built once. Plain C++, no Qt.
#pragma once

#include "catalog/Universe.h"
#include "core/SVector.h"

#include <cstdint>
#include <memory>
#include <optional>
#include <string_view>
#include <unordered_map>
#include <vector>

class SystemMatcher {
public:
    // Positions this close, in parsecs, on every axis are the same place; so are positions
    // that differ by no more than this fraction of their largest coordinate.
    static constexpr double kAbsoluteTolerance = 1e-6;
    static constexpr double kRelativeTolerance = 1e-12;

    // Indexes every system of universe (not owned; it must outlive the matcher and not change).
    explicit SystemMatcher(const Universe* universe);

    // The matcher of universe, built on the first call and shared by every caller while any
    // holds it: over a million systems it takes the better part of a second to build and
    // about 100 MB, too much for each list window to have its own.
    static std::shared_ptr<const SystemMatcher> Shared(const Universe* universe);

    const Universe* GetUniverse() const { return fUniverse; }

    // The system with a star, or itself, named exactly name: when several are, the one nearest
    // near if given, else the one first in the universe. -1 when none is.
    int32_t ByName(std::string_view name, const std::optional<SVector>& near) const;
    // The system at position, within the tolerance; the nearest when several are. -1 when
    // none is.
    int32_t ByPosition(const SVector& position) const;

private:
    struct Placed {
        double x, y, z;
        int32_t index;
    };

    const Universe* fUniverse; // not owned
    int32_t fCount; // the universe's systems when indexed
    // Every star's and system's name to the first system bearing it; names point into the
    // universe's own name buffers.
    std::unordered_map<std::string_view, int32_t> fFirstNamed;
    // Names borne by two or more systems, to all of them in universe order.
    std::unordered_map<std::string_view, std::vector<int32_t>> fShared;
    std::vector<Placed> fByX; // every system, sorted by x
};
