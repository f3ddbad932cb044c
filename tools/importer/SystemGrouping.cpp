// Grouping stars into systems on a grid over the unit sphere.
#include "tools/importer/SystemGrouping.h"

#include <algorithm>
#include <cmath>
#include <numeric>
#include <unordered_map>

namespace {

constexpr double kAUPerParsec = 206264.806;

struct Direction {
    double x, y, z;
};

Direction UnitVector(const ImportStar& s)
{
    const double c = std::cos(s.dec);
    return { c * std::cos(s.ra), std::sin(s.dec), c * std::sin(s.ra) };
}

double AngleBetween(const Direction& a, const Direction& b)
{
    const double dx = a.x - b.x, dy = a.y - b.y, dz = a.z - b.z;
    const double chord = std::sqrt(dx * dx + dy * dy + dz * dz);
    return 2 * std::asin(std::min(1.0, chord / 2));
}

double ParallaxError(double parallax)
{
    return std::max(1.0, 0.02 * parallax);
}

class UnionFind {
public:
    explicit UnionFind(size_t n)
        : fParent(n)
    {
        std::iota(fParent.begin(), fParent.end(), size_t(0));
    }
    size_t Find(size_t i)
    {
        while (fParent[i] != i)
            i = fParent[i] = fParent[fParent[i]];
        return i;
    }
    void Join(size_t a, size_t b)
    {
        a = Find(a);
        b = Find(b);
        if (a != b)
            fParent[std::max(a, b)] = std::min(a, b);
    }

private:
    std::vector<size_t> fParent;
};

} // namespace

bool SameSystem(const ImportStar& a, const ImportStar& b)
{
    const double meanDistance = (1000.0 / a.parallax + 1000.0 / b.parallax) / 2;
    const double separationAU
        = AngleBetween(UnitVector(a), UnitVector(b)) * meanDistance * kAUPerParsec;
    if (separationAU > kMaxSeparationAU)
        return false;
    const double ea = ParallaxError(a.parallax), eb = ParallaxError(b.parallax);
    return std::fabs(a.parallax - b.parallax) <= 3 * std::sqrt(ea * ea + eb * eb);
}

void CartesianPosition(const ImportStar& star, double* x, double* y, double* z)
{
    const double d = ParsecsFromParallax(star.parallax);
    const double c = std::cos(star.dec);
    *x = d * c * std::cos(star.ra);
    *y = d * std::sin(star.dec);
    *z = d * c * std::sin(star.ra);
}

std::vector<StarGroup> GroupSystems(const std::vector<ImportStar>& stars)
{
    const size_t n = stars.size();
    UnionFind sets(n);
    std::vector<size_t> free; // stars the rule groups
    std::unordered_map<int64_t, size_t> fixedFirst;
    for (size_t i = 0; i < n; i++) {
        const int64_t group = stars[i].group;
        if (group < 0) {
            free.push_back(i);
            continue;
        }
        const auto [it, inserted] = fixedFirst.emplace(group, i);
        if (!inserted)
            sets.Join(it->second, i);
    }

    // The widest angle a pair can have is that of the nearest star; a grid of cells that size
    // over the unit sphere then finds every candidate among the 27 cells around a star.
    double cell = 1e-4;
    for (size_t i : free)
        cell = std::max(
            cell, kMaxSeparationAU / kAUPerParsec / ParsecsFromParallax(stars[i].parallax));
    cell = std::min(cell, 0.5);
    auto key = [&](long ix, long iy, long iz) { return (ix * 4096 + iy) * 4096 + iz; };
    std::unordered_map<long, std::vector<size_t>> grid;
    std::vector<Direction> directions(n);
    auto cellOf = [&](const Direction& d) { return std::floor((d.x + 1) / cell); };
    for (size_t i : free) {
        directions[i] = UnitVector(stars[i]);
        const Direction& d = directions[i];
        grid[key(long(cellOf(d)), long(std::floor((d.y + 1) / cell)),
                 long(std::floor((d.z + 1) / cell)))]
            .push_back(i);
    }
    for (size_t i : free) {
        const Direction& d = directions[i];
        const long cx = long(cellOf(d)), cy = long(std::floor((d.y + 1) / cell)),
                   cz = long(std::floor((d.z + 1) / cell));
        for (long dx = -1; dx <= 1; dx++) {
            for (long dy = -1; dy <= 1; dy++) {
                for (long dz = -1; dz <= 1; dz++) {
                    const auto found = grid.find(key(cx + dx, cy + dy, cz + dz));
                    if (found == grid.end())
                        continue;
                    for (size_t j : found->second) {
                        if (j > i && SameSystem(stars[i], stars[j]))
                            sets.Join(i, j);
                    }
                }
            }
        }
    }

    // Systems in the order of their first star; members brightest first, then in list order.
    std::vector<StarGroup> systems;
    std::unordered_map<size_t, size_t> systemOfRoot;
    for (size_t i = 0; i < n; i++) {
        const size_t root = sets.Find(i);
        const auto [it, inserted] = systemOfRoot.emplace(root, systems.size());
        if (inserted)
            systems.emplace_back();
        systems[it->second].members.push_back(i);
    }
    for (StarGroup& system : systems) {
        std::stable_sort(system.members.begin(), system.members.end(), [&](size_t a, size_t b) {
            return stars[a].absoluteMagnitude < stars[b].absoluteMagnitude;
        });
    }
    return systems;
}
