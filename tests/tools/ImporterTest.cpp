// The importer on real data: an excerpt of the kstars-data catalogue, and HYG and plain CSV
// files holding the same stars with their published values. Each import is read back through
// the program's own catalogue reader.
#include "tools/importer/Importer.h"
#include "ImporterFixture.h"
#include "NearbyStars.h"

#include "catalog/Star.h"
#include "catalog/Universe.h"
#include "core/CCoord.h"

#include <gtest/gtest.h>

#include <array>
#include <cmath>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <memory>
#include <sstream>
#include <string>
#include <unistd.h>

namespace fs = std::filesystem;

namespace {

using ImporterTest = ImportFolder;

const char* kHyg
    = "id,hip,hd,hr,gl,bf,proper,ra,dec,dist,pmra,pmdec,rv,mag,absmag,spect,ci,x,y,z\n"
      "0,,,,,,Sol,0.000000,0.000000,0.0000,0.00,0.00,0.0,-26.700,4.850,G2V,0.656,0.000005,0,0\n"
      "32263,32349,48915,2491,Gl 244A,9Alp CMa,Sirius,6.752481,-16.716116,2.6371,-546.01,"
      "-1223.08,-9.4,-1.440,1.454,A0m...,0.009,-0.494323,2.476731,-0.758485\n"
      "71456,71683,128620,5459,Gl 559A,Alp1Cen,Rigil Kentaurus,14.660765,-60.833976,1.3475,"
      "-3678.19,481.84,-22.4,-0.010,4.340,G2V,0.710,-0.495203,-0.414084,-1.175986\n"
      "71454,71681,128621,5460,Gl 559B,Alp2Cen,,14.660346,-60.837398,1.3475,-3600.35,952.11,"
      "-18.6,1.350,5.700,K1V,0.900,-0.495305,-0.414253,-1.176019\n"
      "70667,70890,,,Gl 551,,Proxima Centauri,14.495985,-62.679485,1.2959,-3775.75,765.54,"
      "-22.4,11.010,15.447,M5Ve,1.807,-0.472264,-0.361451,-1.151219\n"
      "104000,104214,201091,8085,Gl 820A,61    Cyg,,21.115106,38.749415,3.4831,4155.10,3258.90,"
      "-65.7,5.200,7.490,K5V,1.069,1.978457,-1.863094,2.180458\n"
      "104003,104217,201092,8086,Gl 820B,,,21.115470,38.742050,3.5039,4107.40,3143.72,-64.8,"
      "6.050,8.330,K7V,1.309,1.990638,-1.874452,2.193197\n"
      "37173,37279,61421,2943,Gl 280A,10Alp CMi,Procyon,7.655033,5.224993,3.5142,-716.57,"
      "-1034.58,-3.2,0.400,2.680,F5IV-V,0.432,-1.364879,3.227813,0.320020\n"
      "119000,,,,,,,12.000000,10.000000,100000.0000,0,0,0,9.5,,,0.4,0,0,0\n";

const char* kPlainCsv = "name,ra,dec,parallax,mag,spect,bv\n"
                        "Sirius,101.287155,-16.716116,379.21,-1.46,A1V,0.00\n"
                        "Rigil Kentaurus,219.902066,-60.833976,742.12,-0.01,G2V,0.71\n"
                        "Toliman,219.896056,-60.837528,742.12,1.33,K1V,0.88\n"
                        "\"61 Cygni A\",316.724766,38.749414,286.82,5.21,K5V,1.18\n"
                        "\"61 Cygni B\",316.730262,38.742050,285.99,6.03,K7V,1.31\n"
                        "\"Gliese 412, no spectrum\",165.656,43.527,204.0,8.77,,1.54\n"
                        "Unmeasured,10.0,10.0,,9.0,G0V,0.6\n";

} // namespace

TEST_F(ImporterTest, RealKStarsExcerpt)
{
    ImportOptions options;
    options.input = std::string(ND_TEST_DATA_DIR) + "/kstars-excerpt.dat";
    options.output = PathOf("stars.dat");
    const ImportResult result = RunImport(options);
    EXPECT_EQ(result.report.format, "kstars");
    EXPECT_EQ(result.report.read, 38);
    EXPECT_EQ(result.report.Skipped(), 2);
    EXPECT_EQ(result.report.skipped.at("without a usable parallax"), 2);
    EXPECT_EQ(result.summary.stars, 37); // 36 stars and the Sun

    const Universe u(options.output.c_str(), 1000000, 5000);
    CheckNearbyStars(
        u, "Sirius", "Rigel Kentaurus", "Alpha2 Centauri", "J210654.0+384458", "J210655.3+384431");
    EXPECT_EQ(u.CountItems(), result.summary.systems);
    // A designation written out, and "kap Cas" with its 60.00 seconds of right ascension.
    EXPECT_NE(FindSystem(u, "Epsilon Eridani"), nullptr);
    EXPECT_NE(FindSystem(u, "Kappa Cassiopeiae"), nullptr);
    EXPECT_EQ(FindSystem(u, "Xi Ursae Majoris"), nullptr); // no parallax
}

TEST_F(ImporterTest, HygDatabase)
{
    ImportOptions options;
    options.input = Write("hygdata.csv", kHyg);
    options.output = PathOf("stars.dat");
    const ImportResult result = RunImport(options);
    EXPECT_EQ(result.report.format, "HYG");
    EXPECT_EQ(result.report.read, 9);
    EXPECT_EQ(result.report.skipped.at("the Sun (always written first)"), 1);
    EXPECT_EQ(result.report.skipped.at("without a usable parallax"), 1);

    const Universe u(options.output.c_str(), 1000000, 5000);
    CheckNearbyStars(u, "Sirius", "Rigil Kentaurus", "Alpha2 Centauri", "61 Cygni", "Gl 820B");
    // Proxima is 10,000 AU from alpha Centauri across the sky: a system of its own.
    const StarSystem* proxima = FindSystem(u, "Proxima Centauri");
    ASSERT_NE(proxima, nullptr);
    EXPECT_EQ(proxima->CountItems(), 1);
    EXPECT_NEAR(proxima->position.Magnitude(), 1.30, 0.01);
    EXPECT_EQ(u.CountItems(), 6); // the Sun, Sirius, alpha Cen, Proxima, 61 Cyg, Procyon
}

TEST_F(ImporterTest, PlainCsv)
{
    ImportOptions options;
    options.input = Write("nearby.csv", kPlainCsv);
    options.output = PathOf("stars.dat");
    const ImportResult result = RunImport(options);
    EXPECT_EQ(result.report.format, "plain CSV");
    EXPECT_EQ(result.report.read, 7);
    EXPECT_EQ(result.report.skipped.at("without a usable parallax"), 1);
    EXPECT_EQ(result.report.classesFromColour, 1);

    const Universe u(options.output.c_str(), 1000000, 5000);
    CheckNearbyStars(u, "Sirius", "Rigil Kentaurus", "Toliman", "61 Cygni A", "61 Cygni B");
    const StarSystem* gliese = FindSystem(u, "Gliese 412, no spectrum");
    ASSERT_NE(gliese, nullptr);
    EXPECT_STREQ(gliese->StarAt(0)->GetSpectralClassString(), "M"); // from B-V 1.54
}

TEST_F(ImporterTest, SyntheticCataloguesAreDeterministic)
{
    std::string output;
    ASSERT_EQ(Run("--generate=5000 --seed=7 -q -o " + PathOf("a.dat"), &output), 0) << output;
    ASSERT_EQ(Run("--generate=5000 --seed=7 -q -o " + PathOf("b.dat"), &output), 0) << output;
    ASSERT_EQ(Run("--generate=5000 --seed=8 -q -o " + PathOf("c.dat"), &output), 0) << output;
    auto slurp = [](const std::string& path) {
        std::stringstream text;
        text << std::ifstream(path).rdbuf();
        return text.str();
    };
    EXPECT_EQ(slurp(PathOf("a.dat")), slurp(PathOf("b.dat")));
    EXPECT_NE(slurp(PathOf("a.dat")), slurp(PathOf("c.dat")));

    const Universe u(PathOf("a.dat").c_str(), 1000000, 5000);
    int32_t stars = 0;
    for (int32_t i = 0; i < u.CountItems(); i++)
        stars += u.SystemAt(i)->CountItems();
    EXPECT_EQ(stars, 5001);
    EXPECT_LT(u.CountItems(), 5001); // some companions
    EXPECT_GT(u.CountItems(), 4000);
}

TEST_F(ImporterTest, CommandReportsWhatItDid)
{
    std::string output;
    const std::string input = std::string(ND_TEST_DATA_DIR) + "/kstars-excerpt.dat";
    ASSERT_EQ(Run(input + " -o " + PathOf("stars.dat"), &output), 0) << output;
    EXPECT_NE(output.find("Read 38 stars"), std::string::npos) << output;
    EXPECT_NE(output.find("2 without a usable parallax"), std::string::npos) << output;
    EXPECT_NE(output.find("of 2 stars"), std::string::npos) << output;
    ASSERT_EQ(Run("--help", &output), 0);
    EXPECT_NE(output.find("Star systems:"), std::string::npos);
    EXPECT_NE(output.find("5,000 AU"), std::string::npos);
    // The shipped star tables are credited as their author asks.
    EXPECT_NE(output.find("\"Star data: Southern Stars Group, SSCore, SSData/Stars\""),
        std::string::npos);
}

// Bad input: a clear message with file, line and reason, a non-zero exit, and the catalogue
// that was there before still there, unchanged.
TEST_F(ImporterTest, BadInputLeavesTheCatalogueAlone)
{
    const std::string previous = Write("stars.dat", "Earlier\nG2V 4.83 1 2 3\n");
    auto unchanged = [&] {
        std::stringstream text;
        text << std::ifstream(previous).rdbuf();
        return text.str() == "Earlier\nG2V 4.83 1 2 3\n";
    };
    std::string output;

    std::string excerpt;
    {
        std::stringstream text;
        text << std::ifstream(std::string(ND_TEST_DATA_DIR) + "/kstars-excerpt.dat").rdbuf();
        excerpt = text.str();
    }
    // Line 15 of the excerpt is the third star; spoil its parallax.
    std::string bad = excerpt;
    size_t at = 0;
    for (int line = 1; line < 15; line++)
        at = bad.find('\n', at) + 1;
    bad.replace(at + 38, 7, "00x88.8");
    const std::string badNumber = Write("bad-number.dat", bad);
    EXPECT_EQ(Run(badNumber + " -o " + previous, &output), 1);
    EXPECT_NE(output.find(badNumber + ":15: bad number in parallax: '00x88.8'"), std::string::npos)
        << output;
    EXPECT_NE(output.find("was not changed"), std::string::npos) << output;
    EXPECT_TRUE(unchanged());

    const std::string noDec
        = Write("no-dec.csv", "name,ra,parallax,mag\nSirius,101.3,379.2,-1.46\n");
    EXPECT_EQ(Run(noDec + " -o " + previous, &output), 1);
    EXPECT_NE(output.find(noDec + ":1: missing column for declination"), std::string::npos)
        << output;
    EXPECT_TRUE(unchanged());

    const std::string shortRow = Write("short.csv", "name,ra,dec,parallax,mag\nSirius,101.3\n");
    EXPECT_EQ(Run(shortRow + " -o " + previous, &output), 1);
    EXPECT_NE(output.find(shortRow + ":2: row has 2 fields"), std::string::npos) << output;
    EXPECT_TRUE(unchanged());

    const std::string missing = PathOf("no-such-catalogue.dat");
    EXPECT_EQ(Run(missing + " -o " + previous, &output), 1);
    EXPECT_NE(output.find(missing + ": cannot open"), std::string::npos) << output;
    EXPECT_TRUE(unchanged());

    const std::string empty = Write("empty.dat", "");
    EXPECT_EQ(Run(empty + " -o " + previous, &output), 1);
    EXPECT_NE(output.find(empty + ": the file is empty"), std::string::npos) << output;
    EXPECT_TRUE(unchanged());

    const std::string onlyComments = Write("comments.dat", "# nothing here\n#\n");
    EXPECT_EQ(Run(onlyComments + " -o " + previous, &output), 1);
    EXPECT_NE(output.find("no stars in the file"), std::string::npos) << output;
    EXPECT_TRUE(unchanged());

    // Nothing but the catalogue is left in the folder: no temporary files.
    int files = 0;
    for (const auto& entry : fs::directory_iterator(fDir))
        files += entry.path().filename().string().rfind("stars.dat", 0) == 0;
    EXPECT_EQ(files, 1);

    EXPECT_EQ(Run("--format=fits x", &output), 2);
    EXPECT_NE(output.find("unknown format 'fits'"), std::string::npos) << output;
}
