// The seed inputs of the Gaia harnesses (tests/fuzz/corpus/gaia and gaialabels) are files this
// test makes: it checks that the ones in the corpus are still what it would write, and writes
// them anew when ND_WRITE_FUZZ_SEEDS is set.
#include "GaiaFiles.h"
#include "fuzz/GaiaFuzzInputs.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <map>
#include <string>

namespace fs = std::filesystem;

namespace {

const fs::path kCorpus = fs::path(ND_TEST_DATA_DIR).parent_path() / "fuzz" / "corpus";

std::map<std::string, std::string> StarSeeds()
{
    std::map<std::string, std::string> seeds;
    seeds["seed-labelled"] = GaiaFuzzStarFile();

    // Proper motions, a parallax exactly five times its error and one just under, none.
    GaiaTestFile moving;
    GaiaTestStar star;
    star.ra = 269.45;
    star.dec = 4.69;
    star.motionEast = -801600;
    star.motionNorth = 10362400;
    star.parallax = 27349;
    star.v = 9511;
    star.bv = 1570;
    star.hip = 4;
    moving.stars.push_back(star);
    star.ra = 0.001;
    star.motionEast = 9e6;
    star.parallax = 85;
    star.parallaxError = 34;
    moving.stars.push_back(star);
    star.parallaxError = 35;
    moving.stars.push_back(star);
    star.parallax = 0;
    moving.stars.push_back(star);
    seeds["seed-moving"] = moving.Bytes();

    // Level 1, a star in the last zone, at the pole.
    GaiaTestFile level1;
    level1.level = 1;
    star = GaiaTestStar();
    star.dec = 90;
    star.zone = 80;
    star.sourceId = 2;
    star.spectralLine = 3;
    level1.stars.push_back(star);
    seeds["seed-level1"] = level1.Bytes();

    // A right ascension that rounded up to a full turn.
    GaiaTestFile whisker;
    star = GaiaTestStar();
    star.rawDirection = std::array<int32_t, 3> { 2000000000, 92513, 0 };
    star.rawMotion = std::array<int32_t, 3> { 0, 596318, 0 };
    whisker.stars.push_back(star);
    seeds["repro-ra-full-turn"] = whisker.Bytes();
    return seeds;
}

std::map<std::string, std::string> LabelSeeds()
{
    std::map<std::string, std::string> seeds;
    seeds["seed-cross-ids"] = '\0'
        + GaiaCrossIdBytes({ { 1, 1, 151881, 48915, 2491 }, { 2, 0, 0, 128620, 5459 },
            { 3, 2, 0, 7, 0 }, { 1, 0, 0, 0, 9 } });
    seeds["seed-designations"] = "\x01# HIP/Gaia3 |Bayer/Flamsteed\n"
                                 "  1|\xCE\xB1_CMa\n  1|9_CMa\n  2|\xCE\xB1\x31_Cen\n"
                                 "  3|p_Eri\n  3|R_And\n  4|\xCE\xB1_Cen_C\n  2|61_Cyg_B\n";
    seeds["seed-iau-names"] = "\x02 1|_(\"Sirius\") 2\n 4|_(\"Proxima Centauri \") 2\n"
                              "# comment\n 2|_(\"Rigil Kentaurus\") 2\n";
    seeds["seed-types"] = "\x03\nA0mA1Va\nK2-IIIb\nDQ6\nM5.5Ve\nB9.5IIIpHgMn\n";
    return seeds;
}

std::string Contents(const fs::path& path)
{
    std::ifstream in(path, std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
}

void CheckSeeds(const std::string& harness, const std::map<std::string, std::string>& seeds)
{
    const fs::path dir = kCorpus / harness;
    const bool write = std::getenv("ND_WRITE_FUZZ_SEEDS") != nullptr;
    for (const auto& [name, bytes] : seeds) {
        if (write)
            std::ofstream(dir / name, std::ios::binary) << bytes;
        EXPECT_EQ(Contents(dir / name), bytes)
            << harness << "/" << name << " is not what this test makes: ND_WRITE_FUZZ_SEEDS=1";
    }
}

} // namespace

TEST(GaiaFuzzSeedsTest, StarFileSeedsAreCurrent)
{
    CheckSeeds("gaia", StarSeeds());
}

TEST(GaiaFuzzSeedsTest, LabelSeedsAreCurrent)
{
    CheckSeeds("gaialabels", LabelSeeds());
}
