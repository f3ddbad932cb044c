// Finds systems by their distance from the origin or from another system.
#pragma once

#include "core/MessageCodes.h"
#include "core/SVector.h"
#include "query/StarSysQuery.h"

// Doubles in the records follow the 32-bit fields on a 4-byte boundary, as the panels lay
// them out.
#pragma pack(push, 4)
struct DistanceQueryParam {
    int32_t mode; // comparison mode
    int32_t referenceIndex; // the system distances are measured from; negative: the origin
    double distance; // parsecs
};
#pragma pack(pop)

class DistanceQuery final : public StarSysQuery {
public:
    static constexpr uint32_t kType = kDistanceQueryType;
    // "is" accepts distances this close to the target, either side included; parsecs.
    static constexpr double kTolerance = 0.3;

    explicit DistanceQuery(Universe* universe);
    ~DistanceQuery() override;

    int32_t GetSysMask(StarSysMask* mask, void* param) override; // param: DistanceQueryParam*
    uint32_t QueryType() const override { return kType; }
    bool Query(int32_t index, void* param) override;

    double target; // parsecs
    SVector reference; // parsecs, in the universe's coordinates
};
