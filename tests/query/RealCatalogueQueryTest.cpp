// The queries over the real catalogue the build put beside the program.
#include "catalog/Universe.h"
#include "query/DistanceQuery.h"
#include "query/StarNameQuery.h"
#include "query/StarSysMask.h"
#include "tools/importer/SourceReaders.h"
#include "tools/importer/SystemGrouping.h"

#include <gtest/gtest.h>

#include <cmath>
#include <filesystem>
#include <fstream>
#include <string>

namespace {

const Universe& RealUniverse()
{
    static const Universe universe((std::string(ND_APP_DIR) + "/stars.dat").c_str(), 1000000, 5000);
    return universe;
}

} // namespace

TEST(RealCatalogueQueries, WithinFiveParsecsAreTheSystemsTheNearestStarsPlaceThere)
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
    EXPECT_TRUE(mask.GetStateSafe(0)); // the Sun

    // The 10-parsec sample's own systems within 5 pc, grouped as the importer groups them: each
    // is one system found, at its brightest star's place, and the query finds no other.
    const std::string file = std::string(ND_SOUTHERN_STARS) + "/Nearest.csv";
    std::ifstream in(file);
    std::vector<ImportStar> rows;
    ImportReport report;
    ReadSouthernStars(in, file, rows, report);
    std::vector<ImportStar> within;
    for (const ImportStar& row : rows) {
        if (ParsecsFromParallax(row.parallax) < 5.2) // members beyond 5 pc join systems within
            within.push_back(row);
    }
    int32_t sampleSystems = 0;
    for (const StarGroup& group : GroupSystems(within)) {
        double x, y, z;
        CartesianPosition(within[group.members[0]], &x, &y, &z);
        if (std::hypot(x, y, z) >= 5.0)
            continue;
        sampleSystems++;
        int32_t matches = 0;
        for (int32_t i = 0; i < u.CountItems(); i++) {
            const SVector& p = u.SystemAt(i)->position;
            // The file holds the place to a millionth of a parsec.
            matches += mask.GetStateSafe(i) && std::hypot(p.x - x, p.y - y, p.z - z) < 1e-5;
        }
        EXPECT_EQ(matches, 1) << within[group.members[0]].name;
    }
    EXPECT_EQ(found, sampleSystems + 1); // and the Sun
    EXPECT_GT(sampleSystems, 40); // red dwarfs and white dwarfs included, not 15 as before
}

TEST(RealCatalogueQueries, NameContainsFindsAFaintNeighbour)
{
    Universe& u = const_cast<Universe&>(RealUniverse());
    ASSERT_GT(u.CountItems(), 0);
    StarNameQuery query(&u);
    const NameQueryParam param { kNameContains, "Proxima", false };
    StarSysMask mask(u.CountItems(), false, 0);
    EXPECT_EQ(query.GetSysMask(&mask, const_cast<NameQueryParam*>(&param)), 1);
    const int32_t index = mask.FindFirst();
    ASSERT_GE(index, 0);
    EXPECT_STREQ(u.SystemAt(index)->GetName(), "Proxima Centauri");
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

TEST(RealCatalogueQueries, NameIsFindsAPrimaryByItsBareName)
{
    Universe& u = const_cast<Universe&>(RealUniverse());
    ASSERT_GT(u.CountItems(), 0);
    StarNameQuery query(&u);
    NameQueryParam param { kNameIs, "Sirius", true };
    StarSysMask mask(u.CountItems(), false, 0);
    EXPECT_EQ(query.GetSysMask(&mask, &param), 1);
    const int32_t index = mask.FindFirst();
    ASSERT_GE(index, 0);
    const StarSystem* sirius = u.SystemAt(index);
    EXPECT_STREQ(sirius->GetName(), "Sirius");
    ASSERT_EQ(sirius->CountItems(), 2);
    EXPECT_STREQ(sirius->StarAt(1)->GetName(), "Sirius B");
    // The companion is found by its own name, in the same system.
    param.text = "Sirius B";
    StarSysMask companion(u.CountItems(), false, 0);
    EXPECT_EQ(query.GetSysMask(&companion, &param), 1);
    EXPECT_EQ(companion.FindFirst(), index);
}
