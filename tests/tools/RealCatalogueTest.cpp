// The catalogue the build made from kstars-data and put beside the program, read the way the
// program reads it.
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
    CheckNearbyStars(
        u, "Sirius", "Rigel Kentaurus", "Alpha2 Centauri", "J210654.0+384458", "J210655.3+384431");
    int32_t stars = 0;
    for (int32_t i = 0; i < u.CountItems(); i++)
        stars += u.SystemAt(i)->CountItems();
    EXPECT_EQ(stars, 124609); // every star with a parallax, and the Sun
}
