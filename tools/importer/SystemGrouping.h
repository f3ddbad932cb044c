// Turning a list of stars into star systems.
#pragma once

#include "tools/importer/ImportStar.h"

#include <cstdint>
#include <vector>

// Two stars are one system when they lie close together on the sky, at most
// kMaxSeparationAU apart across the line of sight at their mean distance, and their
// parallaxes agree within three combined errors, each star's error taken as the larger of
// 1 mas and 2% of its parallax (the catalogues carry no errors of their own). Pairs chain:
// a star close to either component joins the system.
inline constexpr double kMaxSeparationAU = 5000.0;

struct StarGroup {
    std::vector<size_t> members; // indices into the star list, brightest first
};

// How much searching a grouping took, for tests and benchmarks.
struct GroupingStats {
    // Pairs of stars the search found in neighbouring cells, each put to quick tests and,
    // when it passes them, to the rule.
    int64_t candidatePairs = 0;
};

// Stars that share a group number of 0 or more are one system as they stand; the rest are
// grouped by the rule above. Systems come in the order of their first star in the list.
// stats, when given, receives how much searching it took (not owned).
std::vector<StarGroup> GroupSystems(
    const std::vector<ImportStar>& stars, GroupingStats* stats = nullptr);

// Whether the rule above makes one system of a and b.
bool SameSystem(const ImportStar& a, const ImportStar& b);

// Position in parsecs in the program's frame: x toward right ascension 0 h, z toward 6 h,
// y toward the north celestial pole.
void CartesianPosition(const ImportStar& star, double* x, double* y, double* z);
