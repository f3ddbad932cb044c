// Finds systems by declination: the angle of the position above the x-z plane, in
// [-pi/2, pi/2].
#pragma once

#include "core/MessageCodes.h"
#include "query/StarSysQuery.h"

// Doubles in the records follow the 32-bit fields on a 4-byte boundary, as the panels lay
// them out.
#pragma pack(push, 4)
struct DECQueryParam {
    int32_t mode; // comparison mode
    double declination; // radians
};
#pragma pack(pop)

class DECQuery final : public StarSysQuery {
public:
    static constexpr uint32_t kType = kDeclinationQueryType;
    // "is" accepts angles this close to the target, either side included; radians.
    static constexpr double kTolerance = 0.02;

    explicit DECQuery(Universe* universe);
    ~DECQuery() override;

    int32_t GetSysMask(StarSysMask* mask, void* param) override; // param: DECQueryParam*
    uint32_t QueryType() const override { return kType; }
    bool Query(int32_t index, void* param) override;

    // The declination of a position, radians; NaN at the origin, which then matches nothing.
    static double Declination(double x, double y, double z);

    double target; // radians

private:
    // Most systems are decided without atan2: the declination rises with y of the unit
    // vector, so that y is compared with the sines of the bounds. These are scratch, remade
    // whenever target differs from keyTarget.
    void MakeBoundKeys();
    double boundKeys[3]; // sines of target - kTolerance, target + kTolerance, target
    double keyTarget; // the target boundKeys were made for
};
