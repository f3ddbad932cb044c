// Grouping stars into systems: the rule for one pair, and a search that puts to it only the
// pairs that could pass, in time near-linear in the number of stars whatever their distances.
#include "tools/importer/SystemGrouping.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <numeric>
#include <unordered_map>

namespace {

constexpr double kAUPerParsec = 206264.806;
// The widest angle on the sky (radians) the rule allows a pair at a mean distance of 1 pc.
constexpr double kMaxAngleAtOneParsec = kMaxSeparationAU / kAUPerParsec;
// A star's parallax error (mas): the larger of the floor and the fraction of its parallax.
constexpr double kErrorFloorMas = 1.0;
constexpr double kErrorFraction = 0.02;

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
    return std::max(kErrorFloorMas, kErrorFraction * parallax);
}

bool ParallaxesAgree(double a, double b)
{
    const double ea = ParallaxError(a), eb = ParallaxError(b);
    return std::fabs(a - b) <= 3 * std::sqrt(ea * ea + eb * eb);
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

// Parallax shells. Two parallaxes that agree differ by at most 3·√2 times the larger one's
// error, so on the scale
//     s(p) = ∫ from 0 to p of dq / (kShellScale · 3·√2 · ParallaxError(q))
// they lie at most 1.093 / kShellScale = 0.874 apart (the larger error is at most 1.093 times
// the smaller one when they agree). Shell number floor(s) then differs by at most one between
// the stars of any pair the rule accepts, with room to spare for rounding. Shells are 5.3 mas
// wide up to 50 mas and 11% of their parallax beyond.
constexpr double kShellScale = 1.25;
constexpr double kShellWidthMas = kShellScale * 3 * 1.4142135623730951 * kErrorFloorMas;
constexpr double kKneeMas = kErrorFloorMas / kErrorFraction; // where the error leaves its floor
// No finite parallax reaches shell 7,000; the cap only keeps odd values inside the keys.
constexpr int64_t kLastShell = 60000;

int64_t ShellOf(double parallax)
{
    double s = parallax <= kKneeMas
        ? parallax / kShellWidthMas
        : kKneeMas / kShellWidthMas * (1 + std::log(parallax / kKneeMas));
    if (!(s < double(kLastShell)))
        s = double(kLastShell);
    if (!(s >= 0))
        s = 0;
    return static_cast<int64_t>(s);
}

// The parallax (mas) where shell ends, the inverse of the scale above.
double ShellTop(int64_t shell)
{
    const double s = double(shell + 1);
    return s * kShellWidthMas <= kKneeMas ? s * kShellWidthMas
                                          : kKneeMas * std::exp(s * kShellWidthMas / kKneeMas - 1);
}

// A pair whose larger parallax is p (mas) has a mean distance of at least 1000 / p parsecs,
// so an angle of at most kMaxAngleAtOneParsec · p / 1000; a pair whose stars lie in shells
// s - 1 and s, or both in s, is therefore closer on the unit sphere than the cell of shell s.
// The 1% margin covers rounding; no cell needs to be wider than the sphere.
constexpr double kCellMargin = 1.01;
constexpr double kWidestCell = 4.0;

double CellOf(int64_t shell)
{
    return std::min(kWidestCell, kCellMargin * kMaxAngleAtOneParsec * ShellTop(shell) / 1000);
}

// Each shell has its own grid over the unit sphere: a key packs the shell and the cell's
// three coordinates, kCellBits each, z lowest, so the cells of one row along z have
// consecutive keys. Coordinates start at 1 so that a neighbour one below is still inside.
constexpr int kCellBits = 16;
constexpr uint64_t kRow = uint64_t(1) << kCellBits;
constexpr double kNarrowestCell = kCellMargin * kMaxAngleAtOneParsec * kShellWidthMas / 1000;
static_assert(2 / kNarrowestCell + 3 < double(kRow), "cell coordinates overflow their bits");
static_assert(kLastShell + 1 < int64_t(kRow), "shell numbers overflow their bits");

uint64_t CellKey(int64_t shell, const Direction& d, double cell)
{
    auto coordinate
        = [&](double v) { return static_cast<uint64_t>(std::floor((v + 1) / cell)) + 1; };
    return ((uint64_t(shell) * kRow + coordinate(d.x)) * kRow + coordinate(d.y)) * kRow
        + coordinate(d.z);
}

// A star in the grid of its own shell, or in the grid of the shell above as a partner for
// that shell's stars.
struct GridEntry {
    uint64_t key;
    uint64_t item; // star index times two, plus one when in the grid of the shell above
};

} // namespace

bool SameSystem(const ImportStar& a, const ImportStar& b)
{
    const double meanDistance = (1000.0 / a.parallax + 1000.0 / b.parallax) / 2;
    const double separationAU
        = AngleBetween(UnitVector(a), UnitVector(b)) * meanDistance * kAUPerParsec;
    if (separationAU > kMaxSeparationAU)
        return false;
    return ParallaxesAgree(a.parallax, b.parallax);
}

void CartesianPosition(const ImportStar& star, double* x, double* y, double* z)
{
    const double d = ParsecsFromParallax(star.parallax);
    const double c = std::cos(star.dec);
    *x = d * c * std::cos(star.ra);
    *y = d * std::sin(star.dec);
    *z = d * c * std::sin(star.ra);
}

namespace {

// Joins every pair of stars the rule makes one system, among the stars of no fixed group.
void JoinByTheRule(const std::vector<ImportStar>& stars, UnionFind& sets, GroupingStats& counted)
{
    const size_t n = stars.size();
    std::vector<Direction> directions(n);
    std::vector<GridEntry> entries;
    entries.reserve(2 * n);
    for (size_t i = 0; i < n; i++) {
        if (stars[i].group >= 0)
            continue;
        directions[i] = UnitVector(stars[i]);
        const int64_t shell = ShellOf(stars[i].parallax);
        entries.push_back({ CellKey(shell, directions[i], CellOf(shell)), 2 * i });
        entries.push_back({ CellKey(shell + 1, directions[i], CellOf(shell + 1)), 2 * i + 1 });
    }
    std::sort(entries.begin(), entries.end(),
        [](const GridEntry& a, const GridEntry& b) { return a.key < b.key; });

    // What the search reads of each entry's star, in the entries' order, so that stars near
    // each other in the grids are near each other in memory.
    struct Near {
        Direction d;
        double parallax; // mas
    };
    std::vector<Near> near(entries.size());
    for (size_t e = 0; e < entries.size(); e++) {
        const size_t i = entries[e].item / 2;
        near[e] = { directions[i], stars[i].parallax };
    }

    // A pair found in a grid: two stars of its shell, or one of its shell and one of the shell
    // below. Two of the shell below met there already in their own grid.
    double cell = 0;
    auto consider = [&](size_t a, size_t b) {
        if ((entries[a].item & entries[b].item & 1) != 0)
            return;
        counted.candidatePairs++;
        // Cheap tests the rule implies before the rule itself: agreeing parallaxes, and a
        // chord shorter than the grid's cell.
        if (!ParallaxesAgree(near[a].parallax, near[b].parallax))
            return;
        const Direction &u = near[a].d, &v = near[b].d;
        const double dx = u.x - v.x, dy = u.y - v.y, dz = u.z - v.z;
        if (dx * dx + dy * dy + dz * dz > cell * cell)
            return;
        const size_t i = std::min(entries[a].item, entries[b].item) / 2;
        const size_t j = std::max(entries[a].item, entries[b].item) / 2;
        if (sets.Find(i) != sets.Find(j) && SameSystem(stars[i], stars[j]))
            sets.Join(i, j);
    };

    // Each cell meets itself and the 13 of its 26 neighbours with higher keys: the next cell
    // along z, and three cells along z in each of four rows. Both ends of each row's range
    // only move forward as the cells go by, so one cursor a row finds them all.
    constexpr uint64_t kRowsAhead[4]
        = { kRow, kRow * kRow - kRow, kRow * kRow, kRow * kRow + kRow };
    size_t rowStart[4] = { 0, 0, 0, 0 };
    const size_t m = entries.size();
    for (size_t begin = 0, end; begin < m; begin = end) {
        const uint64_t key = entries[begin].key;
        end = begin + 1;
        while (end < m && entries[end].key == key)
            end++;
        cell = CellOf(static_cast<int64_t>(key / (kRow * kRow * kRow)));
        for (size_t a = begin; a < end; a++) {
            for (size_t b = a + 1; b < end; b++)
                consider(a, b);
        }
        for (size_t b = end; b < m && entries[b].key == key + 1; b++) {
            for (size_t a = begin; a < end; a++)
                consider(a, b);
        }
        for (int r = 0; r < 4; r++) {
            const uint64_t first = key + kRowsAhead[r] - 1, last = key + kRowsAhead[r] + 1;
            size_t& b0 = rowStart[r];
            while (b0 < m && entries[b0].key < first)
                b0++;
            for (size_t b = b0; b < m && entries[b].key <= last; b++) {
                for (size_t a = begin; a < end; a++)
                    consider(a, b);
            }
        }
    }
}

} // namespace

std::vector<StarGroup> GroupSystems(const std::vector<ImportStar>& stars, GroupingStats* stats)
{
    const size_t n = stars.size();
    UnionFind sets(n);
    std::unordered_map<int64_t, size_t> fixedFirst;
    for (size_t i = 0; i < n; i++) {
        const int64_t group = stars[i].group;
        if (group < 0)
            continue;
        const auto [it, inserted] = fixedFirst.emplace(group, i);
        if (!inserted)
            sets.Join(it->second, i);
    }
    GroupingStats counted;
    JoinByTheRule(stars, sets, counted);

    // Systems in the order of their first star; members brightest first, then in list order.
    std::vector<StarGroup> systems;
    constexpr size_t kNone = std::numeric_limits<size_t>::max();
    std::vector<size_t> systemOfRoot(n, kNone);
    for (size_t i = 0; i < n; i++) {
        size_t& system = systemOfRoot[sets.Find(i)];
        if (system == kNone) {
            system = systems.size();
            systems.emplace_back();
        }
        systems[system].members.push_back(i);
    }
    for (StarGroup& system : systems) {
        if (system.members.size() > 1)
            std::stable_sort(system.members.begin(), system.members.end(), [&](size_t a, size_t b) {
                return stars[a].absoluteMagnitude < stars[b].absoluteMagnitude;
            });
    }
    if (stats)
        *stats = counted;
    return systems;
}
