// Grouping stars into systems on a grid over the unit sphere, and writing the catalogue.
#include "tools/importer/SystemGrouping.h"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <cstring>
#include <numeric>
#include <sys/stat.h>
#include <unistd.h>
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

WriteSummary WriteCatalogue(const std::string& path, const std::vector<ImportStar>& stars,
    const std::vector<StarGroup>& systems)
{
    std::string pattern = path + ".XXXXXX";
    const int fd = mkstemp(pattern.data());
    if (fd < 0)
        throw ImportError(
            path, 0, std::string("cannot create a file beside it: ") + std::strerror(errno));
    std::FILE* out = fdopen(fd, "w");
    if (!out) {
        close(fd);
        unlink(pattern.c_str());
        throw ImportError(path, 0, std::string("cannot write: ") + std::strerror(errno));
    }

    WriteSummary summary;
    auto count = [&](size_t size) {
        if (summary.systemsBySize.size() <= size)
            summary.systemsBySize.resize(size + 1);
        summary.systemsBySize[size]++;
        summary.systems++;
        summary.stars += static_cast<int64_t>(size);
    };

    std::fprintf(out, "The Sun\nG2V 4.83 0 0 0\n");
    count(1);
    char previous[128] = "0.000000 0.000000 0.000000";
    for (const StarGroup& system : systems) {
        const ImportStar& primary = stars[system.members.front()];
        double x, y, z;
        CartesianPosition(primary, &x, &y, &z);
        char position[128];
        std::snprintf(position, sizeof position, "%.6f %.6f %.6f", x, y, z);
        // Two systems whose positions print alike would read back as one: move the second by
        // the smallest step the file shows.
        if (std::strcmp(position, previous) == 0)
            std::snprintf(position, sizeof position, "%.6f %.6f %.6f", x + 1e-6, y, z);
        std::strcpy(previous, position);
        for (size_t member : system.members) {
            const ImportStar& star = stars[member];
            std::fprintf(out, "%s\n%s %.3f %s\n", star.name.c_str(), star.spectralClass.c_str(),
                star.absoluteMagnitude, position);
        }
        count(system.members.size());
    }

    const bool failed = std::ferror(out) != 0;
    const int error = errno;
    if (std::fclose(out) != 0 || failed) {
        unlink(pattern.c_str());
        throw ImportError(
            path, 0, std::string("cannot write: ") + std::strerror(failed ? error : errno));
    }
    // Readable like any data file, whatever mkstemp chose.
    chmod(pattern.c_str(), 0644);
    if (std::rename(pattern.c_str(), path.c_str()) != 0) {
        const int renameError = errno;
        unlink(pattern.c_str());
        throw ImportError(path, 0, std::string("cannot replace it: ") + std::strerror(renameError));
    }
    return summary;
}
