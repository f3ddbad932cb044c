// White dwarfs' types that hold no Harvard letter, placed on the Harvard scale by their
// temperature so that the program's class reader gives them a class.
#include "ImporterFixture.h"
#include "SouthernStarsRows.h"

#include "tools/importer/SourceReaders.h"
#include "tools/importer/SpectralEstimates.h"

#include "catalog/SpectralClass.h"
#include "catalog/Star.h"
#include "catalog/Universe.h"

#include <gtest/gtest.h>

#include <cmath>
#include <sstream>

namespace {

std::vector<ImportStar> ReadRows(const std::string& rows, ImportReport& report)
{
    std::istringstream in(kSouthernHeader + rows);
    std::vector<ImportStar> stars;
    ReadSouthernStars(in, "Nearest.csv", stars, report);
    return stars;
}

// The class the program's reader finds in a word, on its scale (G6 is 5.6).
double ReadClass(const std::string& word)
{
    return SpectralClass(word.c_str()).SCToDouble();
}

} // namespace

// The main-sequence table: its own rows come back exactly, and it runs one way.
TEST(WhiteDwarfs, TemperaturesAndColoursOfTheMainSequence)
{
    EXPECT_DOUBLE_EQ(TemperatureOfColour(0.650), 5770); // G2V
    EXPECT_DOUBLE_EQ(TemperatureOfColour(0.000), 9700); // A0V
    EXPECT_EQ(HarvardClassOfTemperature(5770), "G2");
    EXPECT_EQ(HarvardClassOfTemperature(9700), "A0");
    EXPECT_EQ(HarvardClassOfTemperature(3870), "M0");
    // Either side of halfway between F0 (7,220 K) and F1 (7,030 K), and halfway in colour.
    EXPECT_EQ(HarvardClassOfTemperature(7120), "F1");
    EXPECT_EQ(HarvardClassOfTemperature(7130), "F0");
    EXPECT_DOUBLE_EQ(TemperatureOfColour((0.294 + 0.334) / 2), (7220.0 + 7030.0) / 2);
    // Beyond the ends: the hottest and the coolest of the table.
    EXPECT_EQ(HarvardClassOfTemperature(200000), "O3");
    EXPECT_EQ(HarvardClassOfTemperature(1000), "M9");
    EXPECT_DOUBLE_EQ(TemperatureOfColour(-1), 46000);
    EXPECT_DOUBLE_EQ(TemperatureOfColour(5), 2500); // M8, the reddest with a colour

    // Redder is cooler, and cooler is later on the program's scale.
    double last = TemperatureOfColour(-0.5);
    for (double bv = -0.5; bv <= 2.5; bv += 0.01) {
        const double kelvins = TemperatureOfColour(bv);
        EXPECT_LE(kelvins, last) << bv;
        last = kelvins;
    }
    double previous = ReadClass(HarvardClassOfTemperature(60000));
    for (double kelvins = 60000; kelvins >= 2000; kelvins -= 50) {
        const double scale = ReadClass(HarvardClassOfTemperature(kelvins));
        EXPECT_GE(scale, previous) << kelvins;
        previous = scale;
    }
}

TEST(WhiteDwarfs, TheTemperatureIndexGivesTheTemperature)
{
    // DQ9: 50,400 K / 9 = 5,600 K, between G5 (5,660 K) and G6 (5,590 K), nearer G6.
    const WhiteDwarfClass dq9 = PlaceWhiteDwarf("DQ9", std::nullopt);
    EXPECT_EQ(dq9.source, WhiteDwarfSource::TemperatureIndex);
    EXPECT_NEAR(dq9.temperature, 5600, 1e-9);
    EXPECT_EQ(dq9.word, "DQ9:G6");
    // The index wins over the colour, and what follows the index stays.
    const WhiteDwarfClass dq9p = PlaceWhiteDwarf("DQ9P", 1.5);
    EXPECT_EQ(dq9p.source, WhiteDwarfSource::TemperatureIndex);
    EXPECT_EQ(dq9p.word, "DQ9P:G6");
    // DZ11 (4,582 K) between K4 (4,620 K) and K5 (4,410 K); DZ13 (3,877 K) by M0 (3,870 K).
    EXPECT_EQ(PlaceWhiteDwarf("DZ11", std::nullopt).word, "DZ11:K4");
    EXPECT_EQ(PlaceWhiteDwarf("DZ13", std::nullopt).word, "DZ13:M0");
    EXPECT_NEAR(PlaceWhiteDwarf("DC4.5", std::nullopt).temperature, 11200, 1e-9);
    // A hot one is an O star; an index of 0 is none.
    EXPECT_EQ(PlaceWhiteDwarf("DQ1", std::nullopt).word, "DQ1:O3");
    EXPECT_EQ(PlaceWhiteDwarf("DC0", std::nullopt).source, WhiteDwarfSource::Unplaced);
}

TEST(WhiteDwarfs, TheColourGivesTheTemperatureWithoutAnIndex)
{
    // van Maanen's Star as the nearest-stars table gives it: V 12.37, B 12.92, B-V 0.55, the
    // colour of an F9 dwarf (6,040 K at 0.552).
    ImportReport report;
    const auto stars
        = ReadRows(SouthernRow("00 49 09.90", "+05 23 19.0", "+12.37", "+12.92", "4.314E+00", "DZ",
                       "GJ 35;HIP 3829", "Wolf 28;van Maanen's Star"),
            report);
    ASSERT_EQ(stars.size(), 1u);
    EXPECT_EQ(stars[0].spectralClass, "DZ:F9");
    EXPECT_FALSE(stars[0].classEstimated); // the type is the published one
    EXPECT_EQ(report.whiteDwarfsFromColour, 1);
    EXPECT_EQ(report.classesFromColour, 0);
    const WhiteDwarfClass placed = PlaceWhiteDwarf("DZ", 12.92 - 12.37);
    EXPECT_EQ(placed.source, WhiteDwarfSource::Colour);
    EXPECT_NEAR(placed.temperature, 6052, 1); // 6,170 K at 0.530, 6,040 K at 0.552
    const double scale = ReadClass(placed.word);
    EXPECT_GE(scale, ReadClass("F8.5"));
    EXPECT_LE(scale, ReadClass("G1.5"));
}

TEST(WhiteDwarfs, TheWordStaysSevenCharactersLong)
{
    // The white dwarf's part is cut, never inside the index's whole number.
    EXPECT_EQ(PlaceWhiteDwarf("DQ9.5P", std::nullopt).word, "DQ9:K0"); // 5,305 K
    EXPECT_EQ(PlaceWhiteDwarf("DQZ10", std::nullopt).word, "DQZ:K2"); // 5,040 K
    EXPECT_EQ(PlaceWhiteDwarf("DQ10.5P", std::nullopt).word, "DQ10:K3"); // 4,800 K
    EXPECT_EQ(PlaceWhiteDwarf("DQ12345", std::nullopt).word, "DQ:M9");
    EXPECT_EQ(PlaceWhiteDwarf("DQpec", 0.0).word, "DQpe:A0");
    EXPECT_EQ(PlaceWhiteDwarf("DZQ", 0.0).word, "DZQ:A0");
    for (const char* type : { "DC", "DQZ", "DQ9P", "DZ11", "DQ9.5P", "DXP", "DQpec", "DCP1234" }) {
        const std::string word = PlaceWhiteDwarf(type, 0.3).word;
        EXPECT_LE(word.size(), 7u) << type;
        EXPECT_EQ(word.substr(0, 2), std::string(type).substr(0, 2)) << type;
    }
}

TEST(WhiteDwarfs, TypesTheProgramReadsAreLeftAlone)
{
    // Each holds a Harvard letter (DA1.9 is read as A1.9, DB as B), or is no white dwarf's.
    for (const char* type : { "DA1.9", "DB", "DAZ", "DZA", "DO", "G2V", "M4.5Ve", "DQ+dM", "DXk",
             "sdB", "D", "Dz", "?", "" }) {
        for (const std::optional<double> bv : { std::optional<double>(), std::optional(0.5) }) {
            const WhiteDwarfClass placed = PlaceWhiteDwarf(type, bv);
            EXPECT_EQ(placed.word, type);
            EXPECT_EQ(placed.source, WhiteDwarfSource::NotNeeded) << type;
        }
    }
    ImportReport report;
    EXPECT_EQ(PublishedClass("DA1.9", 0.0, report), "DA1.9");
    EXPECT_EQ(report.whiteDwarfsFromIndex + report.whiteDwarfsFromColour, 0);
    EXPECT_EQ(report.whiteDwarfsUnplaced, 0);
}

TEST(WhiteDwarfs, WithNeitherIndexNorColourTheTypeStaysAndIsCounted)
{
    const WhiteDwarfClass dc = PlaceWhiteDwarf("DC", std::nullopt);
    EXPECT_EQ(dc.source, WhiteDwarfSource::Unplaced);
    EXPECT_EQ(dc.word, "DC");
    // A row with V but no B has no colour; one without V takes its magnitude from the type.
    ImportReport report;
    const auto stars = ReadRows(
        SouthernRow("11 34 30.48", "-32 50 02.4", "+15.00", "", "9.555", "DC", "GJ 432B", "")
            + SouthernRow("00 00 20", "+00 00 00", "", "", "8.0", "DQ", "", "")
            + SouthernRow("00 00 30", "+00 00 00", "", "", "8.0", "DQ8", "", ""),
        report);
    ASSERT_EQ(stars.size(), 3u);
    EXPECT_EQ(stars[0].spectralClass, "DC");
    EXPECT_EQ(SpectralClass(stars[0].spectralClass.c_str()).harvardClass, kNoClass);
    EXPECT_EQ(stars[1].spectralClass, "DQ");
    EXPECT_EQ(stars[2].spectralClass, "DQ8:F6"); // 6,300 K, between F6 and F7
    EXPECT_GT(stars[2].absoluteMagnitude, 10);
    EXPECT_EQ(report.whiteDwarfsUnplaced, 2);
    EXPECT_EQ(report.whiteDwarfsFromIndex, 1);
}

// The program's class reader finds in the word the class estimated for the temperature.
TEST(WhiteDwarfs, TheProgramReadsTheEstimatedClass)
{
    const SpectralClass literal("DQ9P:G3");
    EXPECT_EQ(literal.harvardClass, kClassG);
    EXPECT_DOUBLE_EQ(literal.decimalClass, 3.0);
    EXPECT_STREQ(literal.GetSCString(), "DQ9P:G3");

    for (const char* letters : { "DC", "DQ", "DZ", "DQZ", "DXP" }) {
        for (double index = 1; index <= 20; index += 0.5) {
            std::ostringstream type;
            type << letters << index;
            const WhiteDwarfClass placed = PlaceWhiteDwarf(type.str(), std::nullopt);
            ASSERT_EQ(placed.source, WhiteDwarfSource::TemperatureIndex) << type.str();
            const std::string estimate = HarvardClassOfTemperature(50400 / index);
            const SpectralClass read(placed.word.c_str());
            EXPECT_EQ(read.GetHCCharacter(), estimate[0]) << placed.word;
            EXPECT_DOUBLE_EQ(read.decimalClass, estimate[1] - '0') << placed.word;
            EXPECT_STREQ(read.GetSCString(), placed.word.c_str());
        }
    }
    for (double bv = -0.4; bv <= 2.4; bv += 0.05) {
        const WhiteDwarfClass placed = PlaceWhiteDwarf("DQZ", bv);
        EXPECT_DOUBLE_EQ(
            ReadClass(placed.word), ReadClass(HarvardClassOfTemperature(TemperatureOfColour(bv))))
            << placed.word;
    }
}

using WhiteDwarfImport = ImportFolder;

// The other readers place the types too, and the import's report counts them once a source.
TEST_F(WhiteDwarfImport, TheCommandPlacesAndReports)
{
    const std::string base = Write("base.csv",
        "name,ra,dec,parallax,mag,spect,bv\n"
        "EGGR 246,10.358,-22.351,109.9,14.60,DQ9,0.65\n"
        "LAWD 37,176.429,-64.842,215.7,11.51,DQ,0.22\n"
        "Sirius B,101.289,-16.717,374.5,8.44,DA1.9,-0.03\n"
        "Nameless,20,20,50,15,DC,\n");
    const std::string nearest = Write("nearest.csv",
        std::string(kSouthernHeader)
            + SouthernRow("07 39 17.88", "+05 13 26.8", "+10.92", "+10.70", "3.514E+00", "DQZ",
                "alpha CMi;GJ 280B", "Procyon;Procyon B"));
    std::string output;
    ASSERT_EQ(Run(base + " --add=" + nearest + " -o " + PathOf("stars.dat"), &output), 0) << output;
    EXPECT_NE(output.find("\nWhite dwarf types placed on the Harvard scale for 2 stars (from the "
                          "temperature index for 1, the B-V colour for 1); 1 left without a "
                          "class.\n"),
        std::string::npos)
        << output;
    EXPECT_NE(output.find("\n  White dwarf types placed on the Harvard scale for 1 stars (from "
                          "the temperature index for 0, the B-V colour for 1).\n"),
        std::string::npos)
        << output;

    const Universe u(PathOf("stars.dat").c_str(), 1000000, 5000);
    auto classOf = [&](const char* name) {
        const StarSystem* s = nullptr;
        for (int32_t i = 0; i < u.CountItems() && !s; i++) {
            if (std::string(u.SystemAt(i)->StarAt(0)->GetName()) == name)
                s = u.SystemAt(i);
        }
        return s ? s->StarAt(0)->spectralClass : SpectralClass();
    };
    EXPECT_STREQ(classOf("EGGR 246").GetSCString(), "DQ9:G6");
    EXPECT_STREQ(classOf("LAWD 37").GetSCString(), "DQ:A7"); // 7,725 K
    EXPECT_EQ(classOf("LAWD 37").harvardClass, kClassA);
    EXPECT_STREQ(classOf("Sirius B").GetSCString(), "DA1.9");
    EXPECT_STREQ(classOf("Nameless").GetSCString(), "DC");
    EXPECT_EQ(classOf("Nameless").harvardClass, kNoClass);
    // The table's B-V of Procyon B, -0.22, is that of a B2 dwarf.
    EXPECT_STREQ(classOf("Procyon B").GetSCString(), "DQZ:B2");
    EXPECT_EQ(classOf("Procyon B").harvardClass, kClassB);
}
