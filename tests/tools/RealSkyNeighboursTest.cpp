// The default sky the build made: every star within 10 parsecs from the nearest-stars table,
// and the bright stars' published types, checked against published facts and the table itself.
#include "NearbyStars.h"

#include "tools/importer/SourceReaders.h"
#include "tools/importer/SpectralEstimates.h"
#include "tools/importer/SystemGrouping.h"

#include "catalog/Star.h"
#include "catalog/Universe.h"
#include "core/CCoord.h"

#include <gtest/gtest.h>

#include <cmath>
#include <filesystem>
#include <fstream>
#include <map>
#include <string>

namespace {

const std::string kNearest = std::string(ND_SOUTHERN_STARS) + "/Nearest.csv";

const Universe& Sky()
{
    static const Universe universe((std::string(ND_APP_DIR) + "/stars.dat").c_str(), 1000000, 5000);
    return universe;
}

// The nearest-stars table as the importer reads it.
std::vector<ImportStar> NearestRows()
{
    std::ifstream in(kNearest);
    std::vector<ImportStar> stars;
    ImportReport report;
    ReadSouthernStars(in, kNearest, stars, report);
    return stars;
}

double Distance(const StarSystem* s)
{
    return s->position.Magnitude();
}

// Right ascension in hours and declination in degrees of a system, seen from the Sun.
void SkyPosition(const StarSystem* s, double* raHours, double* decDegrees)
{
    const SVector& p = s->position;
    double ra = std::atan2(p.z, p.x) * 12 / M_PI;
    *raHours = ra < 0 ? ra + 24 : ra;
    *decDegrees = std::asin(p.y / p.Magnitude()) * 180 / M_PI;
}

} // namespace

class RealSky : public ::testing::Test {
protected:
    void SetUp() override
    {
        ASSERT_TRUE(std::filesystem::exists(std::string(ND_APP_DIR) + "/stars.dat"))
            << "run scripts/setup, then build, to make the catalogue";
        ASSERT_GT(Sky().CountItems(), 100000);
    }
};

TEST_F(RealSky, ProximaCentauri)
{
    const StarSystem* proxima = FindSystem(Sky(), "Proxima Centauri");
    ASSERT_NE(proxima, nullptr);
    EXPECT_NEAR(Distance(proxima), 1.30, 0.01);
    double ra, dec;
    SkyPosition(proxima, &ra, &dec);
    EXPECT_NEAR(ra, 14 + 29.7 / 60, 0.2 / 60);
    EXPECT_NEAR(dec, -(62 + 41 / 60.0), 2 / 60.0);
    EXPECT_EQ(proxima->StarAt(0)->spectralClass.harvardClass, kClassM);
    // Its own system, apart from alpha Centauri A and B.
    EXPECT_EQ(proxima->CountItems(), 1);
    const StarSystem* alpha = FindSystem(Sky(), "Rigil Kentaurus");
    ASSERT_NE(alpha, nullptr);
    EXPECT_EQ(alpha->CountItems(), 2);
    EXPECT_EQ(alpha, FindSystem(Sky(), "Toliman"));
}

TEST_F(RealSky, TheFaintNeighbours)
{
    const std::map<std::string, double> distances = { { "Barnard's Star", 1.83 },
        { "Wolf 359", 2.41 }, { "Ross 154", 2.98 }, { "Ross 128", 3.37 }, { "GJ 1061", 3.67 } };
    for (const auto& [name, parsecs] : distances) {
        const StarSystem* s = FindSystem(Sky(), name);
        ASSERT_NE(s, nullptr) << name;
        EXPECT_NEAR(Distance(s), parsecs, 0.01) << name;
        EXPECT_EQ(s->StarAt(0)->spectralClass.harvardClass, kClassM) << name;
    }
}

// Where Barnard's Star stood at J2000 (it moves 10.4" a year): 17 h 57 m 48.5 s, +4 41' 36".
TEST_F(RealSky, BarnardsStarStandsAtItsJ2000Place)
{
    const StarSystem* barnard = FindSystem(Sky(), "Barnard's Star");
    ASSERT_NE(barnard, nullptr);
    EXPECT_NEAR(Distance(barnard), 1.83, 0.0183);
    const double ra = (17 + 57 / 60.0 + 48.5 / 3600) * M_PI / 12;
    const double dec = (4 + 41 / 60.0 + 36 / 3600.0) * M_PI / 180;
    const SVector& p = barnard->position;
    const double cosine = (std::cos(dec) * std::cos(ra) * p.x + std::sin(dec) * p.y
                              + std::cos(dec) * std::sin(ra) * p.z)
        / p.Magnitude();
    EXPECT_LT(std::acos(std::clamp(cosine, -1.0, 1.0)) * 180 / M_PI * 60, 1.0) << "arc-minutes";
}

TEST_F(RealSky, SiriusBIsAWhiteDwarfInSiriussSystem)
{
    const StarSystem* sirius = FindSystem(Sky(), "Sirius");
    ASSERT_NE(sirius, nullptr);
    ASSERT_EQ(sirius, FindSystem(Sky(), "Sirius B"));
    ASSERT_EQ(sirius->CountItems(), 2);
    EXPECT_STREQ(sirius->StarAt(0)->GetName(), "Sirius");
    EXPECT_STREQ(sirius->GetName(), "Sirius");
    const Star* b = sirius->StarAt(1);
    EXPECT_STREQ(b->GetName(), "Sirius B");
    EXPECT_STREQ(b->GetSpectralClassString(), "DA1.9");
    // Far below the main sequence: an A star of the main sequence is near magnitude 1.
    EXPECT_GT(b->magnitude, 10);
    EXPECT_EQ(b->spectralClass.harvardClass, kClassA);
}

// The white dwarfs whose types hold no Harvard letter ("DQZ", "DZ") carry the main-sequence
// class of their temperature after a colon, and stand far below the main sequence of that
// class on the H-R diagram; no white dwarf within 25 parsecs is left without a class.
TEST_F(RealSky, WhiteDwarfsHaveAClassBelowTheMainSequence)
{
    const std::map<std::string, std::string> placed
        = { { "Procyon B", "DQZ:" }, { "van Maanen's Star", "DZ:" }, { "LAWD 37", "DQ:" },
              { "Stein 2051 B", "DC:" }, { "EGGR 372", "DQ9P:" }, { "EGGR 45", "DZ11:" },
              { "EGGR 453", "DZ13:" }, { "EGGR 246", "DQ9:" }, { "EGGR 41", "DQ8:" } };
    for (const auto& [name, type] : placed) {
        const StarSystem* s = FindSystem(Sky(), name);
        ASSERT_NE(s, nullptr) << name;
        for (int32_t j = 0; j < s->CountItems(); j++) {
            const Star* star = s->StarAt(j);
            if (name != star->GetName())
                continue;
            const std::string word = star->GetSpectralClassString();
            EXPECT_EQ(word.rfind(type, 0), 0u) << name << ": " << word;
            EXPECT_NE(star->spectralClass.harvardClass, kNoClass) << name << ": " << word;
            const std::string harvard = word.substr(type.size());
            const auto mainSequence = MagnitudeOfType(harvard + "V");
            ASSERT_TRUE(mainSequence.has_value()) << name << ": " << word;
            EXPECT_GT(star->magnitude, *mainSequence + 5) << name << ": " << word;
        }
    }
    int whiteDwarfs = 0;
    for (int32_t i = 1; i < Sky().CountItems(); i++) {
        const StarSystem* s = Sky().SystemAt(i);
        if (Distance(s) > 25)
            continue;
        for (int32_t j = 0; j < s->CountItems(); j++) {
            const Star* star = s->StarAt(j);
            const std::string word = star->GetSpectralClassString();
            if (word.size() < 2 || word[0] != 'D'
                || std::string("ABCOQZXPHEV").find(word[1]) == std::string::npos)
                continue;
            whiteDwarfs++;
            EXPECT_NE(star->spectralClass.harvardClass, kNoClass)
                << star->GetName() << ": " << word;
        }
    }
    EXPECT_GE(whiteDwarfs, 20);
}

// The primaries the table names both bare and with the letter A carry the bare name, each
// once in the sky, in one system with the companion that keeps its letter B; no star is left
// with the letter A.
TEST_F(RealSky, PrimariesCarryTheirBareNames)
{
    std::map<std::string, int> named;
    for (int32_t i = 0; i < Sky().CountItems(); i++) {
        const StarSystem* s = Sky().SystemAt(i);
        for (int32_t j = 0; j < s->CountItems(); j++)
            named[s->StarAt(j)->GetName()]++;
    }
    for (const char* primary : { "Sirius", "Procyon", "Kruger 60", "Ross 614", "Stein 2051",
             "Achird", "Ross 775", "Wolf 922" }) {
        const std::string name = primary;
        EXPECT_EQ(named[name], 1) << name;
        EXPECT_EQ(named[name + " B"], 1) << name;
        EXPECT_EQ(named.count(name + " A"), 0u) << name;
        const StarSystem* system = FindSystem(Sky(), name);
        ASSERT_NE(system, nullptr) << name;
        EXPECT_EQ(system, FindSystem(Sky(), name + " B")) << name;
    }
}

// Companions that share their system's designation carry the letters the table gives them:
// 40 Eridani's white dwarf is B and its red dwarf C beside Keid, not A and B; mu Herculis'
// red dwarfs B and C beside its lettered Aa and Ab.
TEST_F(RealSky, CompanionsCarryTheirOwnLetters)
{
    const StarSystem* keid = FindSystem(Sky(), "Keid");
    ASSERT_NE(keid, nullptr);
    EXPECT_NEAR(Distance(keid), 5.01, 0.01);
    ASSERT_EQ(keid->CountItems(), 3);
    EXPECT_STREQ(keid->StarAt(0)->GetName(), "Keid");
    const std::map<std::string, std::string> companions
        = { { "Omicron2 Eridani B", "DA2.9" }, { "Omicron2 Eridani C", "M4.5V" },
              { "Mu Herculis B", "M3.5V" }, { "Mu Herculis C", "M4K" } };
    for (const auto& [name, type] : companions) {
        const StarSystem* s = FindSystem(Sky(), name);
        ASSERT_NE(s, nullptr) << name;
        for (int32_t j = 0; j < s->CountItems(); j++) {
            if (name == s->StarAt(j)->GetName()) {
                EXPECT_STREQ(s->StarAt(j)->GetSpectralClassString(), type.c_str()) << name;
            }
        }
    }
    EXPECT_EQ(keid, FindSystem(Sky(), "Omicron2 Eridani B"));
    EXPECT_EQ(keid, FindSystem(Sky(), "Omicron2 Eridani C"));
    EXPECT_EQ(FindSystem(Sky(), "Omicron2 Eridani A"), nullptr);
    EXPECT_EQ(FindSystem(Sky(), "Mu Herculis A"), nullptr);
    // The white dwarf lies far below the main sequence, the red dwarf on it.
    EXPECT_GT(keid->StarAt(1)->magnitude, 10);
    EXPECT_EQ(keid->StarAt(1)->spectralClass.harvardClass, kClassA);
    EXPECT_EQ(keid->StarAt(2)->spectralClass.harvardClass, kClassM);
}

TEST_F(RealSky, BrightStarsCarryTheirPublishedTypes)
{
    const StarSystem* capella = FindSystem(Sky(), "Capella");
    ASSERT_NE(capella, nullptr);
    EXPECT_EQ(capella->StarAt(0)->GetSpectralClassString()[0], 'G')
        << capella->StarAt(0)->GetSpectralClassString();
    const StarSystem* betelgeuse = FindSystem(Sky(), "Betelgeuse");
    ASSERT_NE(betelgeuse, nullptr);
    EXPECT_EQ(std::string(betelgeuse->StarAt(0)->GetSpectralClassString()).rfind("M1", 0), 0u);
}

// Each row of the table is one star of the sky, found by its magnitude and type in a system
// at its place (a component sits at its primary's place, within the grouping's reach of 5,000
// AU across and three errors of 2% along the line of sight), each star standing for one row.
// A system that holds a row's star holds nothing else: no star of the base catalogue joined
// one because the two catalogues' places for it differ.
TEST_F(RealSky, EveryNearestStarIsInTheSkyExactlyOnce)
{
    const std::vector<ImportStar> rows = NearestRows();
    ASSERT_EQ(rows.size(), 380u);
    std::map<const Star*, const StarSystem*> taken;
    for (const ImportStar& row : rows) {
        double x, y, z;
        CartesianPosition(row, &x, &y, &z);
        const double reach = 0.1 * std::hypot(x, y, z) + 0.03;
        const Star* best = nullptr;
        const StarSystem* bestSystem = nullptr;
        double bestDistance = reach;
        for (int32_t i = 1; i < Sky().CountItems(); i++) {
            const StarSystem* s = Sky().SystemAt(i);
            const SVector& p = s->position;
            const double d = std::hypot(p.x - x, p.y - y, p.z - z);
            if (d > bestDistance)
                continue;
            for (int32_t j = 0; j < s->CountItems(); j++) {
                const Star* star = s->StarAt(j);
                if (!taken.count(star) && star->GetSpectralClassString() == row.spectralClass
                    && std::fabs(star->magnitude - row.absoluteMagnitude) < 0.0015) {
                    best = star;
                    bestSystem = s;
                    bestDistance = d;
                    break;
                }
            }
        }
        EXPECT_NE(best, nullptr) << row.name << " (line " << row.line << ") is not in the sky";
        if (best)
            taken[best] = bestSystem;
    }
    EXPECT_EQ(taken.size(), rows.size());
    for (const auto& [star, system] : taken) {
        for (int32_t j = 0; j < system->CountItems(); j++)
            EXPECT_TRUE(taken.count(system->StarAt(j)))
                << system->StarAt(j)->GetName() << " joined " << system->GetName();
    }
}

// A star the base catalogue and the table both hold would show as two systems at one place.
TEST_F(RealSky, NoNeighbourIsThereTwice)
{
    std::vector<const StarSystem*> near;
    for (int32_t i = 1; i < Sky().CountItems(); i++) {
        if (Distance(Sky().SystemAt(i)) < 10)
            near.push_back(Sky().SystemAt(i));
    }
    EXPECT_GT(near.size(), 250u);
    for (size_t i = 0; i < near.size(); i++) {
        for (size_t j = i + 1; j < near.size(); j++) {
            const SVector &a = near[i]->position, &b = near[j]->position;
            const double angle = std::acos(std::clamp(
                (a.x * b.x + a.y * b.y + a.z * b.z) / (a.Magnitude() * b.Magnitude()), -1.0, 1.0));
            const double da = a.Magnitude(), db = b.Magnitude();
            EXPECT_FALSE(angle < M_PI / 180 / 60 && std::fabs(da - db) < 0.02 * std::min(da, db))
                << near[i]->GetName() << " and " << near[j]->GetName();
        }
    }
}
