// The catalogue the build made from kstars-data and the nearest and brightest stars' tables,
// put beside the program, read the way the program reads it.
#include "NearbyStars.h"

#include "catalog/Universe.h"

#include <gtest/gtest.h>

#include <filesystem>

TEST(RealCatalogue, StandsBesideTheProgramAndHoldsTheSky)
{
    const std::string path = std::string(ND_APP_DIR) + "/stars.dat";
    ASSERT_TRUE(std::filesystem::exists(path))
        << path << " is missing: run scripts/setup to fetch the kstars-data catalogue, then build.";
    const Universe u(path.c_str(), 1000000, 5000);
    EXPECT_GT(u.CountItems(), 100000);
    CheckNearbyStars(u, "Sirius", "Rigil Kentaurus", "Toliman", "61 Cygni A", "61 Cygni B");
    int32_t stars = 0;
    for (int32_t i = 0; i < u.CountItems(); i++)
        stars += u.SystemAt(i)->CountItems();
    // Every star of kstars-data with a parallax (124,608), less the 76 the nearest-stars table
    // holds too, plus its 380 stars, and the Sun.
    EXPECT_EQ(stars, 124608 - 76 + 380 + 1);
}
