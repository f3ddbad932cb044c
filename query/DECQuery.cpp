// The declination test.
#include "query/DECQuery.h"

#include "catalog/Universe.h"
#include "core/Constants.h"
#include "core/SVector.h"

#include <cmath>

namespace {

// The sine of a bound in radians; bounds beyond the poles lie beyond every value.
double BoundKey(double angle)
{
    if (angle < -kPI / 2)
        return -2;
    if (angle > kPI / 2)
        return 2;
    return std::sin(angle);
}

// The arcsine rises at least as fast as its argument, and the declination as computed stays
// within about 1e-8 of the arcsine even next to the poles; a unit y this far from a bound's
// sine is on the same side of the bound as its declination.
constexpr double kKeyMargin = 1e-6;

} // namespace

DECQuery::DECQuery(Universe* universe)
    : StarSysQuery(universe)
    , target(0)
    , boundKeys {}
    , keyTarget(0)
{
    MakeBoundKeys();
}

DECQuery::~DECQuery() = default;

int32_t DECQuery::GetSysMask(StarSysMask* mask, void* param)
{
    target = static_cast<const DECQueryParam*>(param)->declination;
    return StarSysQuery::GetSysMask(mask, param);
}

double DECQuery::Declination(double x, double y, double z)
{
    // The arcsine of y of the unit vector, taken through atan2 so that the poles stay exact.
    // Only y of the normalised vector is needed; it is divided exactly as Normalize would.
    const double unitY = y / SVector(x, y, z).Magnitude();
    return std::atan2(unitY, std::sqrt(1 - unitY * unitY));
}

void DECQuery::MakeBoundKeys()
{
    keyTarget = target;
    boundKeys[0] = BoundKey(target - kTolerance);
    boundKeys[1] = BoundKey(target + kTolerance);
    boundKeys[2] = BoundKey(target);
}

bool DECQuery::Query(int32_t index, void* param)
{
    void* const* systems = Systems();
    PrefetchPosition(systems, index + kPrefetchAhead);
    const auto* p = static_cast<const DECQueryParam*>(param);
    if (!(target == keyTarget))
        MakeBoundKeys();
    const SVector& position = static_cast<const StarSystem*>(systems[index])->position;
    // At the poles and beyond (rounding can give 1 + 1e-16), at the origin (NaN) and for a NaN
    // target, only the declination itself tells.
    const double unitY = position.y / position.Magnitude();
    if (std::fabs(unitY) < 1) {
        const int32_t decided = CompareByKey(p->mode, unitY, boundKeys, kKeyMargin);
        if (decided >= 0)
            return decided;
    }
    return Compare(p->mode, Declination(position.x, position.y, position.z), target, kTolerance);
}
