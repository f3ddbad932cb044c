// The name map and the position index of a universe's systems.
#include "query/SystemMatcher.h"

#include "catalog/Star.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <mutex>

namespace {

double SquaredDistance(const SVector& a, double x, double y, double z)
{
    const double dx = a.x - x, dy = a.y - y, dz = a.z - z;
    return dx * dx + dy * dy + dz * dz;
}

} // namespace

std::shared_ptr<const SystemMatcher> SystemMatcher::Shared(const Universe* universe)
{
    static std::mutex lock;
    static std::unordered_map<const Universe*, std::weak_ptr<const SystemMatcher>> matchers;
    const std::lock_guard<std::mutex> hold(lock);
    std::erase_if(matchers, [](const auto& entry) { return entry.second.expired(); });
    std::weak_ptr<const SystemMatcher>& slot = matchers[universe];
    std::shared_ptr<const SystemMatcher> matcher = slot.lock();
    // A universe of another size at the address of one still indexed is another universe.
    if (!matcher || matcher->fCount != universe->CountItems()) {
        matcher = std::make_shared<const SystemMatcher>(universe);
        slot = matcher;
    }
    return matcher;
}

SystemMatcher::SystemMatcher(const Universe* universe)
    : fUniverse(universe)
    , fCount(universe->CountItems())
{
    const int32_t count = fCount;
    fFirstNamed.reserve(size_t(count) * 2);
    fByX.reserve(size_t(count));
    auto addName = [&](const char* text, int32_t index) {
        const std::string_view name(text);
        if (name.empty())
            return;
        const auto [where, added] = fFirstNamed.emplace(name, index);
        if (added || where->second == index)
            return;
        std::vector<int32_t>& all = fShared[name];
        if (all.empty())
            all.push_back(where->second);
        // A system whose stars share a name, or whose name is its star's, is listed once.
        if (all.back() != index)
            all.push_back(index);
    };
    for (int32_t i = 0; i < count; i++) {
        const StarSystem* system = universe->SystemAt(i);
        addName(system->GetName(), i);
        const int32_t stars = system->CountItems();
        for (int32_t s = 0; s < stars; s++)
            addName(system->StarAt(s)->GetName(), i);
        // A system without a finite position is at no position a row can give.
        const SVector& p = system->position;
        if (std::isfinite(p.x) && std::isfinite(p.y) && std::isfinite(p.z))
            fByX.push_back({ p.x, p.y, p.z, i });
    }
    std::sort(fByX.begin(), fByX.end(), [](const Placed& a, const Placed& b) {
        return a.x < b.x || (a.x == b.x && a.index < b.index);
    });
}

int32_t SystemMatcher::ByName(std::string_view name, const std::optional<SVector>& near) const
{
    const auto first = fFirstNamed.find(name);
    if (first == fFirstNamed.end())
        return -1;
    if (!near)
        return first->second;
    const auto shared = fShared.find(name);
    if (shared == fShared.end())
        return first->second;
    int32_t best = first->second;
    double bestDistance = std::numeric_limits<double>::infinity();
    for (const int32_t index : shared->second) {
        const SVector& p = fUniverse->SystemAt(index)->position;
        const double d = SquaredDistance(*near, p.x, p.y, p.z);
        // Strictly nearer only: among equals the first in the universe stays.
        if (d < bestDistance) {
            bestDistance = d;
            best = index;
        }
    }
    return best;
}

int32_t SystemMatcher::ByPosition(const SVector& position) const
{
    if (!std::isfinite(position.x) || !std::isfinite(position.y) || !std::isfinite(position.z))
        return -1;
    const double largest
        = std::max({ std::fabs(position.x), std::fabs(position.y), std::fabs(position.z) });
    const double tolerance = std::max(kAbsoluteTolerance, largest * kRelativeTolerance);
    auto at = std::lower_bound(fByX.begin(), fByX.end(), position.x - tolerance,
        [](const Placed& p, double x) { return p.x < x; });
    int32_t best = -1;
    double bestDistance = std::numeric_limits<double>::infinity();
    for (; at != fByX.end() && at->x <= position.x + tolerance; ++at) {
        if (std::fabs(at->y - position.y) > tolerance || std::fabs(at->z - position.z) > tolerance)
            continue;
        const double d = SquaredDistance(position, at->x, at->y, at->z);
        if (d < bestDistance || (d == bestDistance && at->index < best)) {
            bestDistance = d;
            best = at->index;
        }
    }
    return best;
}
