// The queries over the real catalogue the build put beside the program.
#include "catalog/Universe.h"
#include "query/DistanceQuery.h"
#include "query/StarNameQuery.h"
#include "query/StarSysMask.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <string>

namespace {

const Universe& RealUniverse()
{
    static const Universe universe((std::string(ND_APP_DIR) + "/stars.dat").c_str(), 1000000, 5000);
    return universe;
}

} // namespace

TEST(RealCatalogueQueries, WithinFiveParsecsAreTheSystemsTheCataloguePlacesThere)
{
    ASSERT_TRUE(std::filesystem::exists(std::string(ND_APP_DIR) + "/stars.dat"))
        << "run scripts/setup, then build, to make the catalogue";
    Universe& u = const_cast<Universe&>(RealUniverse());
    ASSERT_GT(u.CountItems(), 100000);

    DistanceQuery query(&u);
    DistanceQueryParam param { kQueryLessThan, -1, 5.0 };
    StarSysMask mask(u.CountItems(), false, 0);
    const int32_t found = query.GetSysMask(&mask, &param);

    int32_t expected = 0;
    for (int32_t i = 0; i < u.CountItems(); i++) {
        const bool near = u.SystemAt(i)->position.Magnitude() < 5.0;
        expected += near;
        ASSERT_EQ(mask.GetStateSafe(i), near) << u.SystemAt(i)->GetName();
    }
    EXPECT_EQ(found, expected);
    // The catalogue holds 17 stars within 5 pc; alpha Centauri B and 61 Cygni B are folded
    // into their systems, and the Sun is added: 16 systems.
    EXPECT_EQ(found, 16);
    EXPECT_TRUE(mask.GetStateSafe(0)); // the Sun
}

TEST(RealCatalogueQueries, NameContainsFindsACommonName)
{
    Universe& u = const_cast<Universe&>(RealUniverse());
    ASSERT_GT(u.CountItems(), 0);
    StarNameQuery query(&u);
    const NameQueryParam param { kNameContains, "sirius", false };
    StarSysMask mask(u.CountItems(), false, 0);
    EXPECT_EQ(query.GetSysMask(&mask, const_cast<NameQueryParam*>(&param)), 1);
    const int32_t index = mask.FindFirst();
    ASSERT_GE(index, 0);
    EXPECT_STREQ(u.SystemAt(index)->GetName(), "Sirius");
}
