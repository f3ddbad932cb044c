#include "catalog/Star.h"
#include "catalog/StarSystem.h"

#include <gtest/gtest.h>

#include <string>

TEST(GravSystem, IdsFollowConstructionOrderOfSystemsAndStars)
{
    auto* system = new StarSystem("Alpha Centauri", SVector(1, 2, 3), 1.5, nullptr, 2);
    auto* a = new Star("Alpha Centauri A", "G2V", 4.38, 1);
    auto* b = new Star("Alpha Centauri B", "K1V", 5.71, 1);
    EXPECT_EQ(a->GetID(), system->GetID() + 1);
    EXPECT_EQ(b->GetID(), system->GetID() + 2);
    EXPECT_EQ(GravSystem::nextID, b->GetID() + 1);
    system->AddItem(a);
    system->AddItem(b);
    EXPECT_EQ(system->StarAt(0), a);
    EXPECT_EQ(system->StarAt(1), b);
    EXPECT_EQ(system->StarAt(2), nullptr);
    delete system; // deletes its stars too; the leak checker would notice otherwise
}

TEST(GravSystem, KindsAndFields)
{
    GravSystem plain("plain", 4);
    const StarSystem system("Sirius", SVector(-0.5, -0.7, 2.5), 25.4, nullptr, 2);
    const Star star("Sirius A", "A1V", 1.42, 1);
    EXPECT_EQ(plain.WhatAmI(), 0);
    EXPECT_EQ(system.WhatAmI(), 1);
    EXPECT_EQ(star.WhatAmI(), 2);
    const GravSystem& asBase = star;
    EXPECT_EQ(asBase.WhatAmI(), 2);
    EXPECT_STREQ(system.GetName(), "Sirius");
    EXPECT_EQ(system.position.z, 2.5);
    EXPECT_EQ(system.luminosity, 25.4);
    EXPECT_EQ(star.GetMagnitude(), 1.42);
    EXPECT_STREQ(star.GetSpectralClassString(), "A1V");
    EXPECT_EQ(star.GetSpectralClass()->harvardClass, kClassA);
    EXPECT_EQ(star.GetSpectralClass()->decimalClass, 1.0);
}

TEST(GravSystem, NamesAreKeptToSeventyNineCharacters)
{
    const std::string longName(120, 'n');
    GravSystem g(longName.c_str(), 1);
    EXPECT_EQ(std::string(g.GetName()), longName.substr(0, 79));
    g.SetName("short");
    EXPECT_STREQ(g.GetName(), "short");
}
