// The catalogue the build made from the Gaia catalogue of stellarium-data (or, where that could
// not be had, from kstars-data) and the nearest and brightest stars' tables, put beside the
// program, read the way the program reads it.
#include "NearbyStars.h"

#include "catalog/Universe.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <string>

namespace {

// The build names the sky it made: "Gaia DR3 and Hipparcos (...)" or "Hipparcos (kstars-data)".
bool GaiaSky()
{
    return std::string(ND_SKY).rfind("Gaia", 0) == 0;
}

} // namespace

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
    if (GaiaSky()) {
        // 578,932 stars with a parallax of at least five times its error, less the 190 the
        // nearest-stars table replaces, plus its 380 and the Sun: 579,123 stars in some
        // 572,000 systems.
        EXPECT_GE(u.CountItems(), 500000);
        EXPECT_EQ(stars, 578932 - 190 + 380 + 1);
    } else {
        // Every star of kstars-data with a parallax (124,608), less the 76 the nearest-stars
        // table holds too, plus its 380 stars, and the Sun.
        EXPECT_EQ(stars, 124608 - 76 + 380 + 1);
    }
}
