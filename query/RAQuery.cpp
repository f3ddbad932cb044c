// The right-ascension test.
#include "query/RAQuery.h"

#include "catalog/Universe.h"
#include "core/Constants.h"

#include <cmath>

namespace {

// A pseudo-angle of the direction (x, z): 0 to 4 as the angle goes from 0 to 2 pi, one unit
// per quadrant, rising with the angle at between 1/2 and 1 times its rate. NaN for (0, 0).
// Coordinates are parsecs, far below the 1e300 where x + z could overflow.
double PseudoAngle(double x, double z)
{
    if (z >= 0)
        return x >= 0 ? z / (x + z) : 1 - x / (z - x);
    return x < 0 ? 2 - z / (-x - z) : 3 + x / (x - z);
}

// The pseudo-angle of a bound in radians; bounds outside [0, 2 pi] lie beyond every value.
double BoundKey(double angle)
{
    if (angle < 0)
        return -1;
    if (angle > kPI + kPI)
        return 5;
    return PseudoAngle(std::cos(angle), std::sin(angle));
}

// Both pseudo-angles carry an error of a few units in 1e-16; a pseudo-angle this far from a
// bound's is at least this many radians away from it, as the pseudo-angle never rises faster
// than the angle.
constexpr double kKeyMargin = 1e-7;

} // namespace

RAQuery::RAQuery(Universe* universe)
    : StarSysQuery(universe)
    , target(0)
    , boundKeys {}
    , keyTarget(0)
{
    MakeBoundKeys();
}

RAQuery::~RAQuery() = default;

int32_t RAQuery::GetSysMask(StarSysMask* mask, void* param)
{
    target = static_cast<const RAQueryParam*>(param)->rightAscension;
    return StarSysQuery::GetSysMask(mask, param);
}

double RAQuery::RightAscension(double x, double z)
{
    const double angle = std::atan2(z, x);
    return angle < 0 ? angle + (kPI + kPI) : angle;
}

void RAQuery::MakeBoundKeys()
{
    keyTarget = target;
    boundKeys[0] = BoundKey(target - kTolerance);
    boundKeys[1] = BoundKey(target + kTolerance);
    boundKeys[2] = BoundKey(target);
}

bool RAQuery::Query(int32_t index, void* param)
{
    void* const* systems = Systems();
    PrefetchPosition(systems, index + kPrefetchAhead);
    const auto* p = static_cast<const RAQueryParam*>(param);
    if (!(target == keyTarget))
        MakeBoundKeys();
    const SVector& position = static_cast<const StarSystem*>(systems[index])->position;
    // Undecided near a bound, at (0, 0) where the pseudo-angle is NaN, and for a NaN target.
    const int32_t decided
        = CompareByKey(p->mode, PseudoAngle(position.x, position.z), boundKeys, kKeyMargin);
    if (decided >= 0)
        return decided;
    return Compare(p->mode, RightAscension(position.x, position.z), target, kTolerance);
}
