// What the importer accepts and what it writes: values out of range are bad input, numbers have
// one sign, names and classes are cleaned into what the program's reader reads back whole,
// and CR LF line ends import like LF ones.
#include "ImporterFixture.h"

#include "catalog/Star.h"
#include "catalog/Universe.h"
#include "tools/importer/CatalogueWriter.h"
#include "tools/importer/Designations.h"
#include "tools/importer/StrictNumbers.h"

#include <gtest/gtest.h>

#include <cmath>
#include <cstdio>
#include <memory>
#include <regex>
#include <string>
#include <vector>

namespace {

using ImporterValidationTest = ImportFolder;

const char* const kEarlier = "Earlier\nG2V 4.83 1 2 3\n";

// One kstars data line: Sirius's, with the given fields put in their columns.
std::string KStarsLine(const std::string& dec, const std::string& parallax,
    const std::string& magnitude, const std::string& type, const std::string& names,
    const std::string& ra = "064508.92")
{
    std::string line = "064508.92 -164258.0 -000546.0-001223.100379.2 -1.4400.01A0 1            ";
    line.replace(0, 9, ra);
    line.replace(10, 9, dec);
    line.replace(38, 7, parallax);
    line.replace(45, 6, magnitude);
    line.replace(56, 2, type);
    return line + names + "\n";
}

const char* const kHygHeader = "id,hip,hd,hr,gl,bf,proper,ra,dec,dist,mag,absmag,spect,ci\n";
const char* const kHygSirius
    = "1,32349,48915,,,,Sirius,6.752481,-16.716116,2.6371,-1.440,1.454,A0m...,0.009\n";
const char* const kCsvHeader = "name,ra,dec,parallax,mag,spect\n";
const char* const kCsvSirius = "Sirius,101.287155,-16.716116,379.21,-1.46,A1V\n";
const char* const kDistanceHeader = "name,ra,dec,distance,absmag,spect\n";
const char* const kDistanceSirius = "Sirius,101.287155,-16.716116,2.637,1.43,A1V\n";

struct BadInput {
    const char* file;
    std::string text;
    int line;
    const char* reason;
};

// One star as the program's reader gave it back.
struct ReadStar {
    std::string name, spectralClass;
    double magnitude;
};

std::vector<ReadStar> StarsOf(const Universe& u)
{
    std::vector<ReadStar> stars;
    for (int32_t i = 0; i < u.CountItems(); i++) {
        const StarSystem* system = u.SystemAt(i);
        for (int32_t j = 0; j < system->CountItems(); j++) {
            const Star* star = system->StarAt(j);
            stars.push_back({ star->GetName(), star->GetSpectralClassString(), star->magnitude });
        }
    }
    return stars;
}

// The stars read back from catalogue, the Sun first, each system of one star.
void ExpectReadBack(const std::string& catalogue, const std::vector<ReadStar>& expected)
{
    const Universe u(catalogue.c_str(), 1000000, 5000);
    const std::vector<ReadStar> stars = StarsOf(u);
    EXPECT_EQ(u.CountItems(), static_cast<int32_t>(expected.size()) + 1);
    ASSERT_EQ(stars.size(), expected.size() + 1);
    EXPECT_EQ(stars[0].name, "The Sun");
    for (size_t i = 0; i < expected.size(); i++) {
        EXPECT_EQ(stars[i + 1].name, expected[i].name) << "star " << i + 1;
        EXPECT_EQ(stars[i + 1].spectralClass, expected[i].spectralClass) << "star " << i + 1;
        EXPECT_NEAR(stars[i + 1].magnitude, expected[i].magnitude, 0.0005) << "star " << i + 1;
    }
}

} // namespace

TEST(StrictNumbers, OneSignAtMost)
{
    double value = 0;
    EXPECT_FALSE(ParseNumber("+-5", &value));
    EXPECT_FALSE(ParseNumber(" +-5 ", &value));
    EXPECT_FALSE(ParseNumber("++5", &value));
    EXPECT_FALSE(ParseNumber("-+5", &value));
    EXPECT_FALSE(ParseNumber("--5", &value));
    EXPECT_FALSE(ParseNumber("+", &value));
    EXPECT_EQ(value, 0);
    ASSERT_TRUE(ParseNumber(" +5.5 ", &value));
    EXPECT_EQ(value, 5.5);
    ASSERT_TRUE(ParseNumber("-5", &value));
    EXPECT_EQ(value, -5);
}

TEST(StrictNumbers, RangesOfAStar)
{
    EXPECT_EQ(InRange(90, -90, 90, "f", 3, "dec"), 90);
    try {
        InRange(1e20, -90, 90, "f", 3, "dec");
        ADD_FAILURE() << "1e20 degrees accepted";
    } catch (const ImportError& error) {
        EXPECT_STREQ(error.what(), "f:3: dec 1e+20 out of range -90..90");
    }
    EXPECT_THROW(InRange(std::nan(""), -90, 90, "f", 3, "dec"), ImportError);
    EXPECT_THROW(CheckedMagnitude(40.001, "f", 3, "mag"), ImportError);
    EXPECT_EQ(CheckedMagnitude(-30, "f", 3, "mag"), -30);
    // One astronomical unit is 1/206264.8 pc; a million parsecs the far end.
    EXPECT_THROW(CheckedParsecs(4.8e-6, "f", 3, "d"), ImportError);
    EXPECT_EQ(CheckedParsecs(4.9e-6, "f", 3, "d"), 4.9e-6);
    EXPECT_EQ(CheckedParsecs(1e6, "f", 3, "d"), 1e6);
    EXPECT_THROW(CheckedParsecs(1.000001e6, "f", 3, "d"), ImportError);
    EXPECT_THROW(CheckedParsecs(INFINITY, "f", 3, "d"), ImportError);
}

TEST(SpectralClasses, OneShortPrintableWord)
{
    EXPECT_EQ(CleanSpectralClass("G2V"), "G2V");
    EXPECT_EQ(CleanSpectralClass(" K2 III "), "K2III");
    EXPECT_EQ(CleanSpectralClass("M1.5Ve+DA2.5"), "M1.5Ve+");
    EXPECT_EQ(CleanSpectralClass("\t\t"), "");
    EXPECT_EQ(CleanSpectralClass("A0\x01V\r"), "A0V");
    EXPECT_EQ(CleanSpectralClass("\xc3\xa9"), "");
    EXPECT_EQ(CleanSpectralClass(std::string(600, 'K')), "KKKKKKK");
}

// Every bad value: exit status 1, "file:line: reason", and the catalogue there before left
// byte for byte as it was.
TEST_F(ImporterValidationTest, ValuesOutOfRangeAreBadInput)
{
    const std::string kstarsHead
        = "# kstars\n" + KStarsLine("-164258.0", "00379.2", " -1.44", "A0", ", alp CMa, Sirius");
    const std::vector<BadInput> cases = {
        { "far.dat", kstarsHead + KStarsLine("+100000.0", " 1e-300", " 05.00", "G2", ", , Far"), 3,
            "parallax 1e-300 mas places the star beyond 1,000,000 pc" },
        { "denormal.dat",
            kstarsHead + KStarsLine("+100000.0", " 1e-320", " 05.00", "G2", ", , Far"), 3,
            "parallax 1e-320 mas places the star beyond 1,000,000 pc" },
        { "near.dat", kstarsHead + KStarsLine("+100000.0", "2.1e+08", " 05.00", "G2", ", , Near"),
            3, "parallax 2.1e+08 mas places the star nearer than 1 AU" },
        { "bright.dat",
            kstarsHead + KStarsLine("+100000.0", "00100.0", "-1e300", "G2", ", , Bright"), 3,
            "V magnitude -1e+300 out of range -30..40" },
        { "pole.dat", kstarsHead + KStarsLine("+905960.0", "00100.0", " 05.00", "G2", ", , Pole"),
            3, "declination +90 59 60.0 lies beyond the pole" },
        { "hyg-dec.csv", std::string(kHygHeader) + kHygSirius + "2,7,,,,,,6.0,1e20,10,,5,G2V,\n", 3,
            "dec 1e+20 out of range -90..90" },
        { "hyg-ra.csv", std::string(kHygHeader) + kHygSirius + "2,7,,,,,,24.5,10,10,,5,G2V,\n", 3,
            "ra 24.5 out of range 0..24" },
        { "hyg-ra-negative.csv",
            std::string(kHygHeader) + kHygSirius + "2,7,,,,,,-1,10,10,,5,G2V,\n", 3,
            "ra -1 out of range 0..24" },
        { "hyg-dist.csv", std::string(kHygHeader) + kHygSirius + "2,7,,,,,,6.0,10,1e-320,,5,G2V,\n",
            3, "dist 1e-320 pc places the star nearer than 1 AU" },
        { "hyg-absmag.csv",
            std::string(kHygHeader) + kHygSirius + "2,7,,,,,,6.0,10,10,,-1e300,G2V,\n", 3,
            "absmag -1e+300 out of range -30..40" },
        { "hyg-mag.csv", std::string(kHygHeader) + kHygSirius + "2,7,,,,,,6.0,10,10,99,,G2V,\n", 3,
            "mag 99 out of range -30..40" },
        { "csv-ra.csv", std::string(kCsvHeader) + kCsvSirius + "Far,400,10,10,5,G2V\n", 3,
            "ra 400 out of range 0..360" },
        { "csv-dec.csv", std::string(kCsvHeader) + kCsvSirius + "Far,40,-91,10,5,G2V\n", 3,
            "dec -91 out of range -90..90" },
        { "csv-parallax.csv", std::string(kCsvHeader) + kCsvSirius + "Far,40,10,1e-300,5,G2V\n", 3,
            "parallax 1e-300 mas places the star beyond 1,000,000 pc" },
        { "csv-near.csv", std::string(kCsvHeader) + kCsvSirius + "Near,40,10,3e8,5,G2V\n", 3,
            "parallax 3e8 mas places the star nearer than 1 AU" },
        { "csv-mag.csv", std::string(kCsvHeader) + kCsvSirius + "Faint,40,10,10,50,G2V\n", 3,
            "mag 50 out of range -30..40" },
        // An apparent magnitude in range, an absolute one far out of it: 39 at 5e-6 pc.
        { "csv-absolute.csv", std::string(kCsvHeader) + kCsvSirius + "Near,40,10,2e8,39,G2V\n", 3,
            "absolute magnitude 70.5051 out of range -30..40" },
        { "csv-sign.csv", std::string(kCsvHeader) + kCsvSirius + "Signs,40,10,+-5,5,G2V\n", 3,
            "bad number in parallax: '+-5'" },
        { "csv-distance.csv",
            std::string(kDistanceHeader) + kDistanceSirius + "Far,40,10,2e6,5,G2V\n", 3,
            "distance 2e6 pc places the star beyond 1,000,000 pc" },
        { "csv-distance-near.csv",
            std::string(kDistanceHeader) + kDistanceSirius + "Near,40,10,1e-320,5,G2V\n", 3,
            "distance 1e-320 pc places the star nearer than 1 AU" },
        { "csv-absmag.csv",
            std::string(kDistanceHeader) + kDistanceSirius + "Bright,40,10,10,-31,G2V\n", 3,
            "absmag -31 out of range -30..40" },
    };
    for (const BadInput& bad : cases) {
        const std::string previous = Write("stars.dat", kEarlier);
        const std::string input = Write(bad.file, bad.text);
        std::string output;
        EXPECT_EQ(Run(input + " -o " + previous, &output), 1) << bad.file << ": " << output;
        const std::string message
            = input + ":" + std::to_string(bad.line) + ": " + std::string(bad.reason);
        EXPECT_NE(output.find(message), std::string::npos)
            << bad.file << ": wanted '" << message << "' in\n"
            << output;
        EXPECT_EQ(Read(previous), kEarlier) << bad.file;
    }
}

// HYG's distance of 100000 pc stands for an unknown parallax: skipped, as before.
TEST_F(ImporterValidationTest, UnknownHygDistanceIsSkipped)
{
    const std::string input = Write("hyg.csv",
        std::string(kHygHeader) + kHygSirius + "2,7,,,,,,12.0,10.0,100000.0000,9.5,,G2V,0.6\n");
    std::string output;
    ASSERT_EQ(Run(input + " -o " + PathOf("stars.dat"), &output), 0) << output;
    EXPECT_NE(output.find("1 without a usable parallax"), std::string::npos) << output;
    ExpectReadBack(PathOf("stars.dat"), { { "Sirius", "A0m...", 1.454 } });
}

// Dirty names and spectral types from each format read back as the stars they were meant to
// be, and the stars after them are not shifted.
TEST_F(ImporterValidationTest, HygNamesAndClassesReadBackWhole)
{
    const std::string longType(600, 'K');
    const std::string longHip = "12\x0b" + std::string(100, '3');
    const std::string text = std::string(kHygHeader) + "1,,,,,,Long Type,1.0,10.0,10,,1.000,\""
        + longType + "\",\n" + "2,,,,,,Tab Type,3.0,20.0,10,,2.000,\"G2\tV\",\n" + "3,\"" + longHip
        + "\",,,,,,5.0,30.0,10,,3.000,M5Ve,\n" + "4,,\"48\x7f"
        + "915\",,,,,7.0,-10.0,10,,4.000,\"\x02\x03\",0.65\n"
        + "5,,,,,,Accented Type,9.0,-20.0,10,,5.000,\"\xc3\xa9\",\n"
        + "6,32349,48915,,,,Sirius,6.752481,-16.716116,2.6371,-1.440,1.454,A0m...,0.009\n";
    const std::string input = Write("hyg.csv", text);
    std::string output;
    ASSERT_EQ(Run("--format=hyg " + input + " -o " + PathOf("stars.dat"), &output), 0) << output;
    const std::string hipName = ("HIP 12 " + std::string(100, '3')).substr(0, 79);
    ExpectReadBack(PathOf("stars.dat"),
        { { "Long Type", "KKKKKKK", 1 }, { "Tab Type", "G2V", 2 }, { hipName, "M5Ve", 3 },
            { "HD 48 915", "G", 4 }, { "Accented Type", "?", 5 }, { "Sirius", "A0m...", 1.454 } });
}

TEST_F(ImporterValidationTest, CsvNamesAndClassesReadBackWhole)
{
    const std::string longName = "A" + std::string(200, 'b');
    const std::string text = std::string(kCsvHeader) + "Long Type,15,10,100,5,"
        + std::string(600, 'M') + "\n" + "\"" + longName + "\",45,20,100,5,K2 III\n"
        + "\"Bell\aStar\",75,30,100,5,\"A0\r\x01V\"\n" + kCsvSirius;
    const std::string input = Write("plain.csv", text);
    std::string output;
    ASSERT_EQ(Run("--format=csv " + input + " -o " + PathOf("stars.dat"), &output), 0) << output;
    ExpectReadBack(PathOf("stars.dat"),
        { { "Long Type", "MMMMMMM", 5 }, { longName.substr(0, 79), "K2III", 5 },
            { "Bell Star", "A0V", 5 }, { "Sirius", "A1V", -1.46 + 5 + 5 * std::log10(0.37921) } });
}

TEST_F(ImporterValidationTest, KStarsNamesAndClassesReadBackWhole)
{
    // A tab in the spectral-type columns, and one with the colour to estimate from.
    const std::string text = "# kstars\n"
        + KStarsLine("+100000.0", "00100.0", " 05.00", "\t\t", ", , Tabbed\tName", "010000.00")
        + KStarsLine("+200000.0", "00100.0", " 05.00", "K\x01", ", , Control Type", "030000.00")
        + KStarsLine("-164258.0", "00379.2", " -1.44", "A0", ", alp CMa, Sirius");
    const std::string input = Write("kstars.dat", text);
    std::string output;
    ASSERT_EQ(Run("--format=kstars " + input + " -o " + PathOf("stars.dat"), &output), 0) << output;
    // V 5.00 at 10 pc is absolute 5.00; the colour 0.01 of the line suggests A.
    ExpectReadBack(PathOf("stars.dat"),
        { { "Tabbed Name", "A", 5 }, { "Control Type", "K", 5 },
            { "Sirius", "A0", -1.44 + 5 + 5 * std::log10(0.3792) } });
}

// The writer itself never writes a line the reader would misread, whatever it is given.
TEST_F(ImporterValidationTest, FormatCatalogueWritesOnlyWhatReadsBack)
{
    auto format = [&](const std::vector<ImportStar>& stars, const std::vector<StarGroup>& systems) {
        const std::string path = PathOf("formatted.dat");
        std::unique_ptr<std::FILE, int (*)(std::FILE*)> out(
            std::fopen(path.c_str(), "w"), &std::fclose);
        EXPECT_NE(out, nullptr);
        FormatCatalogue(out.get(), stars, systems);
        return path;
    };
    ImportStar dirty;
    dirty.name = "Dirty\nName " + std::string(100, 'x');
    dirty.spectralClass = "G2 V\t" + std::string(600, 'I');
    dirty.parallax = 100;
    dirty.absoluteMagnitude = 4.5;
    // Two systems 1e-9 pc apart across the y = 0 plane print "0.000000" and "-0.000000", which
    // the reader takes for one position.
    ImportStar above;
    above.name = "Above";
    above.spectralClass = "K0";
    above.parallax = 200;
    above.dec = 1e-10;
    ImportStar below = above;
    below.name = "Below";
    below.dec = -1e-10;
    const std::string path = format({ dirty, above, below }, { { { 0 } }, { { 1 } }, { { 2 } } });
    ExpectReadBack(path,
        { { ("Dirty Name " + std::string(100, 'x')).substr(0, 79), "G2VIIII", 4.5 },
            { "Above", "K0", 0 }, { "Below", "K0", 0 } });

    ImportStar infinite = dirty;
    infinite.absoluteMagnitude = INFINITY;
    infinite.line = 12;
    try {
        format({ infinite }, { { { 0 } } });
        ADD_FAILURE() << "an infinite magnitude was written";
    } catch (const ImportError& error) {
        EXPECT_EQ(error.line, 12);
        EXPECT_NE(error.reason.find("absolute magnitude inf out of range"), std::string::npos)
            << error.reason;
    }
    ImportStar nowhere = dirty;
    nowhere.dec = NAN;
    EXPECT_THROW(format({ nowhere }, { { { 0 } } }), ImportError);
}

// CR LF line ends import to exactly the catalogue the LF file gives.
TEST_F(ImporterValidationTest, CrLfImportsLikeLf)
{
    const std::string excerpt = Read(std::string(ND_TEST_DATA_DIR) + "/kstars-excerpt.dat");
    ASSERT_FALSE(excerpt.empty());
    const std::string hyg = std::string(kHygHeader) + kHygSirius
        + "2,71683,128620,,Gl 559A,Alp1Cen,Rigil Kentaurus,14.660765,-60.833976,1.3475,-0.010,"
          "4.340,G2V,0.710\n"
        + "3,71681,128621,,Gl 559B,Alp2Cen,,14.660346,-60.837398,1.3475,1.350,5.700,K1V,\n"
        + "4,70890,,,,,,14.495985,-62.679485,1.2959,11.010,15.447,,1.807\n"
        + "5,104217,201092,,\"Gl 820B\",,,21.115470,38.742050,3.5039,6.050,8.330,K7V,\n";
    const std::string csv = std::string(kCsvHeader) + kCsvSirius
        + "\"61 Cygni A\",316.724766,38.749414,286.82,5.21,K5V\n"
        + "Gliese 412,165.656,43.527,204.0,8.77,\n" + "Quoted End,10.0,10.0,100,5,\"G2V\"\n"
        + "Toliman,219.896056,-60.837528,742.12,1.33,K1V";
    const struct {
        const char* name;
        std::string text;
    } inputs[] = { { "kstars.dat", excerpt }, { "hyg.csv", hyg }, { "plain.csv", csv } };
    for (const auto& input : inputs) {
        const std::string lf = Write(std::string("lf-") + input.name, input.text);
        const std::string crlf = Write(std::string("crlf-") + input.name,
            std::regex_replace(input.text, std::regex("\n"), "\r\n"));
        std::string output;
        ASSERT_EQ(Run(lf + " -o " + PathOf("lf.out"), &output), 0) << output;
        ASSERT_EQ(Run(crlf + " -o " + PathOf("crlf.out"), &output), 0) << output;
        const std::string written = Read(PathOf("lf.out"));
        EXPECT_GT(written.size(), 100u) << input.name;
        EXPECT_EQ(Read(PathOf("crlf.out")), written) << input.name;
        EXPECT_EQ(written.find('\r'), std::string::npos) << input.name;
    }
}
