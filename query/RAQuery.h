// Finds systems by right ascension: the angle of the position in the x-z plane, from +x
// toward +z, in [0, 2 pi).
#pragma once

#include "core/MessageCodes.h"
#include "query/StarSysQuery.h"

// Doubles in the records follow the 32-bit fields on a 4-byte boundary, as the panels lay
// them out.
#pragma pack(push, 4)
struct RAQueryParam {
    int32_t mode; // comparison mode
    double rightAscension; // radians
};
#pragma pack(pop)

class RAQuery final : public StarSysQuery {
public:
    static constexpr uint32_t kType = kRightAscensionQueryType;
    // "is" accepts angles this close to the target, either side included; radians. The
    // window does not wrap around 0.
    static constexpr double kTolerance = 0.015;

    explicit RAQuery(Universe* universe);
    ~RAQuery() override;

    int32_t GetSysMask(StarSysMask* mask, void* param) override; // param: RAQueryParam*
    uint32_t QueryType() const override { return kType; }
    bool Query(int32_t index, void* param) override;

    // The right ascension of a position, radians in [0, 2 pi); 0 on the y axis.
    static double RightAscension(double x, double z);

    double target; // radians

private:
    // Most systems are decided without atan2: the angle's order is that of a pseudo-angle
    // made of one division. These are scratch, remade whenever target differs from keyTarget.
    void MakeBoundKeys();
    double boundKeys[3]; // pseudo-angles of target - kTolerance, target + kTolerance, target
    double keyTarget; // the target boundKeys were made for
};
