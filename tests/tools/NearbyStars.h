// Published facts about the Sun's neighbours that every catalogue the program reads must
// reproduce, whichever source it was imported from.
#pragma once

#include "catalog/Star.h"
#include "catalog/Universe.h"
#include "core/CCoord.h"

#include <gtest/gtest.h>

#include <cmath>
#include <string>

inline const StarSystem* FindSystem(const Universe& u, const std::string& starName)
{
    for (int32_t i = 0; i < u.CountItems(); i++) {
        const StarSystem* s = u.SystemAt(i);
        for (int32_t j = 0; j < s->CountItems(); j++) {
            if (starName == s->StarAt(j)->GetName())
                return s;
        }
    }
    return nullptr;
}

// The published facts every import of these stars must reproduce.
inline void CheckNearbyStars(const Universe& u, const std::string& sirius,
    const std::string& alphaA, const std::string& alphaB, const std::string& cygA,
    const std::string& cygB)
{
    ASSERT_GT(u.CountItems(), 0);
    const StarSystem* sun = u.SystemAt(0);
    EXPECT_STREQ(sun->GetName(), "The Sun");
    EXPECT_EQ(sun->position.x, 0);
    EXPECT_EQ(sun->position.y, 0);
    EXPECT_EQ(sun->position.z, 0);

    const StarSystem* s = FindSystem(u, sirius);
    ASSERT_NE(s, nullptr) << sirius;
    EXPECT_NEAR(s->position.Magnitude(), 2.64, 0.02);
    EXPECT_NEAR(s->StarAt(0)->magnitude, 1.4, 0.1);
    // Seen from the Sun: the vector from Sirius back to the Sun.
    const CCoord c(SVector(-s->position.x, -s->position.y, -s->position.z));
    EXPECT_EQ(c.raHours, 6);
    EXPECT_NEAR(c.raMinutes, 45, 1);
    EXPECT_EQ(c.decDegrees, -16);
    EXPECT_NEAR(c.decMinutes, 43, 2);

    const StarSystem* alpha = FindSystem(u, alphaA);
    ASSERT_NE(alpha, nullptr) << alphaA;
    ASSERT_EQ(alpha->CountItems(), 2);
    EXPECT_EQ(alpha, FindSystem(u, alphaB));
    EXPECT_STREQ(alpha->StarAt(0)->GetName(), alphaA.c_str());
    EXPECT_LT(alpha->StarAt(0)->magnitude, alpha->StarAt(1)->magnitude);
    EXPECT_NEAR(alpha->position.Magnitude(), 1.35, 0.02);
    EXPECT_EQ(alpha->StarAt(0)->spectralClass.harvardClass, kClassG);
    EXPECT_EQ(alpha->StarAt(1)->spectralClass.harvardClass, kClassK);

    const StarSystem* cyg = FindSystem(u, cygA);
    ASSERT_NE(cyg, nullptr) << cygA;
    EXPECT_EQ(cyg->CountItems(), 2);
    EXPECT_EQ(cyg, FindSystem(u, cygB));
    EXPECT_NEAR(cyg->position.Magnitude(), 3.5, 0.05);

    // Every system's luminosity follows its first star.
    for (int32_t i = 0; i < u.CountItems(); i++) {
        const StarSystem* system = u.SystemAt(i);
        EXPECT_DOUBLE_EQ(system->luminosity, std::pow(2.512, 4.7 - system->StarAt(0)->magnitude))
            << system->GetName();
    }
}
