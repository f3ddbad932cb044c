// Finds systems by the absolute magnitude of their stars.
#pragma once

#include "core/MessageCodes.h"
#include "query/PackedStarValues.h"
#include "query/StarSysQuery.h"

// Doubles in the records follow the 32-bit fields on a 4-byte boundary, as the panels lay
// them out.
#pragma pack(push, 4)
struct MGQueryParam {
    int32_t mode; // comparison mode
    int32_t starMode;
    double magnitude; // absolute
};
#pragma pack(pop)

class MGQuery final : public StarSysQuery {
public:
    static constexpr uint32_t kType = kMagnitudeQueryType;
    // "is" accepts magnitudes this close to the target, either side included.
    static constexpr double kTolerance = 0.05;

    explicit MGQuery(Universe* universe);
    ~MGQuery() override;

    int32_t GetSysMask(StarSysMask* mask, void* param) override; // param: MGQueryParam*
    uint32_t QueryType() const override { return kType; }
    bool Query(int32_t index, void* param) override;

    double target; // absolute magnitude

private:
    PackedStarValues fMagnitudes; // every star's absolute magnitude
};
