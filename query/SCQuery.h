// Finds systems by the spectral class of their stars, on SpectralClass's numeric scale.
#pragma once

#include "core/MessageCodes.h"
#include "query/PackedStarValues.h"
#include "query/StarSysQuery.h"

class SpectralClass;

struct SCQueryParam {
    int32_t mode; // comparison mode; "is" is exact equality of the numeric classes
    int32_t starMode;
    const SpectralClass* spectralClass; // not owned
};

class SCQuery final : public StarSysQuery {
public:
    static constexpr uint32_t kType = kSpectralClassQueryType;

    explicit SCQuery(Universe* universe);
    ~SCQuery() override;

    int32_t GetSysMask(StarSysMask* mask, void* param) override; // param: SCQueryParam*
    uint32_t QueryType() const override { return kType; }
    bool Query(int32_t index, void* param) override;

    double target; // the wanted class as SCToDouble gives it

private:
    PackedStarValues fClasses; // every star's class as SCToDouble gives it
};
