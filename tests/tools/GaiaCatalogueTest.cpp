// The importer's reader of the Gaia DR3 and Hipparcos binary catalogue: every field of a record,
// the stars it leaves out, the names it gives and keeps, the files it refuses, and the command
// that reads a folder of them and writes the catalogue with its names file.
#include "GaiaFiles.h"
#include "ImporterFixture.h"
#include "SouthernStarsRows.h"

#include "tools/importer/GaiaCatalogue.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cmath>
#include <filesystem>
#include <fstream>
#include <map>
#include <sstream>
#include <string>
#include <vector>

namespace fs = std::filesystem;

namespace {

constexpr double kPi = 3.14159265358979323846;
constexpr double kRadian = 180 / kPi * 3600; // arcseconds

// The angle between two directions given in radians, in arcseconds.
double ArcsecondsBetween(double ra1, double dec1, double ra2, double dec2)
{
    const double a = std::sin((dec2 - dec1) / 2), b = std::sin((ra2 - ra1) / 2);
    return 2 * std::asin(std::sqrt(a * a + std::cos(dec1) * std::cos(dec2) * b * b)) * kRadian;
}

double Radians(double degrees)
{
    return degrees * kPi / 180;
}

// The star file's stars read with labels; fails the test on an ImportError.
std::vector<ImportStar> ReadStars(
    const GaiaTestFile& file, const GaiaLabels& labels = {}, ImportReport* report = nullptr)
{
    std::vector<ImportStar> stars;
    ImportReport own;
    try {
        ReadGaiaStars(file.Bytes(), "stars_0_0v0_21.cat", labels, stars, report ? *report : own);
    } catch (const ImportError& error) {
        ADD_FAILURE() << error.what();
    }
    return stars;
}

// What ReadGaiaStars says of bytes it refuses; empty when it takes them.
std::string Refusal(const std::string& bytes)
{
    std::vector<ImportStar> stars;
    ImportReport report;
    try {
        ReadGaiaStars(bytes, "bad.cat", {}, stars, report);
    } catch (const ImportError& error) {
        return error.what();
    }
    return "";
}

std::vector<std::string> AliasesOf(const ImportStar& star)
{
    std::vector<std::string> names;
    ForEachAlias(star.aliases, [&](const std::string& name) { names.push_back(name); });
    return names;
}

bool HasAlias(const ImportStar& star, const std::string& name)
{
    const std::vector<std::string> names = AliasesOf(star);
    return std::find(names.begin(), names.end(), name) != names.end();
}

GaiaTestStar StarAt(double ra, double dec)
{
    GaiaTestStar star;
    star.ra = ra;
    star.dec = dec;
    return star;
}

} // namespace

TEST(GaiaCatalogueTest, ProperMotionIsCarriedBackToJ2000)
{
    // 1" a year toward the east for the 16 years from J2000.0 to J2016.0: 16" west of where the
    // file has it, on the equator and at +60 degrees (where 16" are 32 s of arc of right
    // ascension); and 1" a year north at -45 degrees.
    GaiaTestFile file;
    for (const double dec : { 0.0, 60.0 }) {
        GaiaTestStar star = StarAt(90, dec);
        star.motionEast = 1e6;
        file.stars.push_back(star);
    }
    GaiaTestStar north = StarAt(200, -45);
    north.motionNorth = 1e6;
    file.stars.push_back(north);

    const std::vector<ImportStar> stars = ReadStars(file);
    ASSERT_EQ(stars.size(), 3u);
    EXPECT_NEAR(stars[0].ra, Radians(90 - 16.0 / 3600), 1e-3 / kRadian);
    EXPECT_NEAR(stars[0].dec, 0, 1e-3 / kRadian);
    EXPECT_NEAR(stars[1].ra, Radians(90 - 32.0 / 3600), 2e-3 / kRadian);
    EXPECT_NEAR(ArcsecondsBetween(stars[1].ra, stars[1].dec, Radians(90), Radians(60)), 16, 1e-3);
    EXPECT_NEAR(stars[2].ra, Radians(200), 1e-3 / kRadian);
    EXPECT_NEAR(stars[2].dec, Radians(-45 - 16.0 / 3600), 1e-3 / kRadian);

    // Just east of right ascension 0 and moving east at the pace that puts it a few 1e-16
    // radians west of it at J2000: a whisker under a full turn, which must not round up to one.
    GaiaTestStar whisker;
    whisker.rawDirection = std::array<int32_t, 3> { 2000000000, 92513, 0 };
    whisker.rawMotion = std::array<int32_t, 3> { 0, 596318, 0 };
    GaiaTestFile atZero;
    atZero.stars = { whisker };
    const std::vector<ImportStar> nearZero = ReadStars(atZero);
    ASSERT_EQ(nearZero.size(), 1u);
    EXPECT_GE(nearZero[0].ra, 0);
    EXPECT_LT(nearZero[0].ra, 2 * kPi);

    // A file of epoch J2000.0 needs no carrying back.
    file.epoch = 2451545.0f;
    const std::vector<ImportStar> atJ2000 = ReadStars(file);
    ASSERT_EQ(atJ2000.size(), 3u);
    EXPECT_NEAR(atJ2000[0].ra, Radians(90), 1e-3 / kRadian);
}

TEST(GaiaCatalogueTest, EveryFieldOfARecordIsRead)
{
    GaiaLabels labels;
    ReadGaiaSpectralTypes("\nA0mA1Va\nK2III\n", labels);

    // Sirius as the file has it.
    GaiaTestStar sirius = StarAt(101.287155, -16.716116);
    sirius.sourceId = 2947050466531873024;
    sirius.v = -1460;
    sirius.bv = 0;
    sirius.parallax = 18960;
    sirius.parallaxError = 150;
    sirius.radialVelocity = -55;
    sirius.spectralLine = 1;
    sirius.hip = 32349;
    sirius.component = 1;
    // No type, B-V 1.5: a red star; then a type line past the table's end, B-V 0.45.
    GaiaTestStar red = StarAt(10, 10);
    red.bv = 1500;
    red.v = 9000;
    GaiaTestStar beyond = StarAt(20, 20);
    beyond.bv = 450;
    beyond.spectralLine = 3;
    GaiaTestStar typed = StarAt(30, 30);
    typed.spectralLine = 2;
    typed.hip = 100000; // the largest numbers of the catalogue need all 19 bits
    typed.component = 3;
    typed.zone = 20; // the last zone
    GaiaTestFile file;
    file.stars = { sirius, red, beyond, typed };

    ImportReport report;
    const std::vector<ImportStar> stars = ReadStars(file, labels, &report);
    ASSERT_EQ(stars.size(), 4u);
    EXPECT_EQ(report.read, 4);
    EXPECT_EQ(report.Skipped(), 0);

    const ImportStar& s = stars[0];
    EXPECT_NEAR(s.ra, Radians(101.287155), 1e-3 / kRadian);
    EXPECT_NEAR(s.dec, Radians(-16.716116), 1e-3 / kRadian);
    EXPECT_DOUBLE_EQ(s.parallax, 379.2);
    EXPECT_NEAR(s.absoluteMagnitude, -1.46 + 5 + 5 * std::log10(0.3792), 1e-9);
    EXPECT_EQ(s.spectralClass, "A0mA1Va");
    EXPECT_FALSE(s.classEstimated);
    EXPECT_EQ(s.component, 'A');
    EXPECT_EQ(s.name, "HIP 32349");
    EXPECT_TRUE(HasAlias(s, "Gaia DR3 2947050466531873024"));

    EXPECT_EQ(stars[1].spectralClass, "M");
    EXPECT_TRUE(stars[1].classEstimated);
    EXPECT_NEAR(stars[1].absoluteMagnitude, 9 + 5 + 5 * std::log10(0.1), 1e-9);
    EXPECT_EQ(stars[1].component, 0);
    EXPECT_EQ(stars[2].spectralClass, "F");
    EXPECT_TRUE(stars[2].classEstimated);
    EXPECT_EQ(report.classesFromColour, 2);
    EXPECT_EQ(stars[3].spectralClass, "K2III");
    EXPECT_EQ(stars[3].name, "HIP 100000");
    EXPECT_EQ(stars[3].component, 'C');
}

TEST(GaiaCatalogueTest, StarsWithoutAGoodParallaxAreSkippedAndCounted)
{
    // Parallaxes in 0.02 mas, errors in 0.01 mas: each pair exactly five times its error, then
    // just under it.
    const std::vector<std::pair<uint16_t, uint16_t>> exactlyFive
        = { { 100, 40 }, { 85, 34 }, { 170, 68 }, { 390, 156 }, { 65000, 26000 } };
    GaiaTestFile file;
    for (const auto& [parallax, error] : exactlyFive) {
        GaiaTestStar star = StarAt(file.stars.size() * 10.0, 5);
        star.parallax = parallax;
        star.parallaxError = error;
        star.v = 12000;
        file.stars.push_back(star);
        star.parallaxError = static_cast<uint16_t>(error + 1);
        file.stars.push_back(star);
    }
    GaiaTestStar none = StarAt(300, 5);
    none.parallax = 0;
    none.parallaxError = 0;
    file.stars.push_back(none);
    GaiaTestStar noError = StarAt(310, 5);
    noError.parallaxError = 0;
    file.stars.push_back(noError);

    ImportReport report;
    const std::vector<ImportStar> stars = ReadStars(file, {}, &report);
    EXPECT_EQ(report.read, 12);
    ASSERT_EQ(stars.size(), exactlyFive.size() + 1);
    for (size_t i = 0; i < exactlyFive.size(); i++)
        EXPECT_DOUBLE_EQ(stars[i].parallax, exactlyFive[i].first * 0.02) << i;
    EXPECT_EQ(report.skipped["with a parallax under five times its error"], 5);
    EXPECT_EQ(report.skipped["without a parallax"], 1);
    EXPECT_EQ(report.Skipped(), 6);
}

TEST(GaiaCatalogueTest, NamesAreChosenInOrderAndTheOthersKept)
{
    GaiaLabels labels;
    ReadGaiaIauNames("# IAU names\n 32349|_(\"Sirius\") 2\n", "common_star_names.fab", labels);
    ReadGaiaDesignations("# HIP/Gaia3 |Bayer/Flamsteed\n"
                         "              32349|\xCE\xB1_CMa\n" // α_CMa
                         "              32349|9_CMa\n"
                         "              71683|\xCE\xB1\x31_Cen\n" // α1_Cen
                         "                100|p_Eri\n"
                         "                100|1_Eri\n"
                         "             104214|61_Cyg\n"
                         "                400|R_And\n",
        "name.fab", labels);
    ReadGaiaCrossIds(
        GaiaCrossIdBytes({ { 32349, 1, 151881, 48915, 2491 }, { 71683, 0, 252838, 128620, 5459 },
            { 100, 0, 0, 1000, 0 }, { 104214, 0, 0, 201091, 8085 }, { 200, 0, 0, 1234, 0 },
            { 77, 0, 0, 99, 0 } }),
        "cross-id.cat", labels);

    auto star = [](uint32_t hip, int component, uint64_t sourceId) {
        GaiaTestStar s = StarAt(hip * 1e-3, component);
        s.hip = hip;
        s.component = component;
        s.sourceId = sourceId;
        return s;
    };
    GaiaTestFile file;
    file.stars = {
        star(32349, 1, 2947050466531873024), // IAU name
        star(32349, 2, 0), // its companion: the name with " B"
        star(71683, 0, 5853498713190525696), // Bayer
        star(100, 0, 11), // Latin letter before the Flamsteed number
        star(104214, 0, 12), // Flamsteed
        star(200, 0, 13), // HD
        star(300, 0, 14), // HIP
        star(0, 0, 2509780430229120256), // Gaia
        star(0, 0, 77), // HD through the Gaia id
        star(400, 0, 15), // a variable star's name is only another name
    };
    const std::vector<ImportStar> stars = ReadStars(file, labels);
    ASSERT_EQ(stars.size(), file.stars.size());

    EXPECT_EQ(stars[0].name, "Sirius");
    EXPECT_EQ(stars[0].nameKind, NameKind::Proper);
    for (const char* other : { "Alpha Canis Majoris", "alf CMa", "alp CMa", "9 Canis Majoris",
             "9 CMa", "HD 48915", "HR 2491", "HIP 32349", "Gaia DR3 2947050466531873024" })
        EXPECT_TRUE(HasAlias(stars[0], other)) << other;
    EXPECT_EQ(stars[1].name, "Sirius B");
    EXPECT_TRUE(HasAlias(stars[1], "HIP 32349"));
    EXPECT_TRUE(HasAlias(stars[1], "Alpha Canis Majoris B"));
    EXPECT_EQ(stars[1].component, 'B');

    EXPECT_EQ(stars[2].name, "Alpha1 Centauri");
    EXPECT_EQ(stars[2].nameKind, NameKind::Designation);
    for (const char* other : { "alf1 Cen", "alp1 Cen", "HD 128620", "HR 5459", "HIP 71683",
             "Gaia DR3 5853498713190525696" })
        EXPECT_TRUE(HasAlias(stars[2], other)) << other;

    EXPECT_EQ(stars[3].name, "p Eridani");
    EXPECT_TRUE(HasAlias(stars[3], "1 Eridani"));
    EXPECT_TRUE(HasAlias(stars[3], "HD 1000"));
    EXPECT_EQ(stars[4].name, "61 Cygni");
    EXPECT_TRUE(HasAlias(stars[4], "61 Cyg"));
    EXPECT_TRUE(HasAlias(stars[4], "HR 8085"));
    EXPECT_EQ(stars[5].name, "HD 1234");
    EXPECT_EQ(stars[5].nameKind, NameKind::HenryDraper);
    EXPECT_TRUE(HasAlias(stars[5], "HIP 200"));
    EXPECT_TRUE(HasAlias(stars[5], "Gaia DR3 13"));
    EXPECT_EQ(stars[6].name, "HIP 300");
    EXPECT_TRUE(HasAlias(stars[6], "Gaia DR3 14"));
    EXPECT_EQ(stars[7].name, "Gaia DR3 2509780430229120256");
    EXPECT_EQ(stars[8].name, "HD 99");
    EXPECT_EQ(stars[9].name, "HIP 400");
    EXPECT_TRUE(HasAlias(stars[9], "R And"));

    // No star has a name twice among its other names.
    for (const ImportStar& s : stars) {
        std::vector<std::string> names = AliasesOf(s);
        std::sort(names.begin(), names.end());
        EXPECT_EQ(std::adjacent_find(names.begin(), names.end()), names.end()) << s.name;
    }
}

TEST(GaiaCatalogueTest, FilesThatDoNotFitAreRefusedWithOffsetAndReason)
{
    GaiaTestFile good;
    good.stars = { StarAt(10, 10), StarAt(20, 20) };
    ASSERT_EQ(Refusal(good.Bytes()), "");
    const size_t first = good.FirstRecord();
    auto refusal = [&](auto change) {
        GaiaTestFile file = good;
        change(file);
        return Refusal(file.Bytes());
    };

    EXPECT_EQ(Refusal(good.Bytes().substr(0, 20)),
        "bad.cat: at byte 20: the file ends within its header (28 bytes)");
    EXPECT_EQ(refusal([](GaiaTestFile& f) { f.magic = 0x0A045F83; }),
        "bad.cat: at byte 0: not a Gaia star file (wrong magic number)");
    EXPECT_EQ(refusal([](GaiaTestFile& f) { f.dataType = 1; }),
        "bad.cat: at byte 4: data type 1, only stars (0) are read");
    EXPECT_EQ(refusal([](GaiaTestFile& f) { f.major = 1; }),
        "bad.cat: at byte 8: format version 1, only version 0 is read");
    for (const int32_t level : { -1, kGaiaMaxLevel + 1, 1 << 30 }) {
        GaiaTestFile file = good;
        file.level = level;
        file.counts = std::vector<int32_t>(21, 0);
        EXPECT_EQ(Refusal(file.Bytes()),
            "bad.cat: at byte 16: zone level " + std::to_string(level) + ", not 0 to "
                + std::to_string(kGaiaMaxLevel));
    }
    for (const float epoch : { 2016.0f, 0.0f, NAN, INFINITY })
        EXPECT_EQ(refusal([&](GaiaTestFile& f) { f.epoch = epoch; }),
            "bad.cat: at byte 24: the epoch is no Julian date of 1900 to 2100")
            << epoch;

    // Counts: a table cut short, a negative count, more stars than the file holds.
    EXPECT_EQ(Refusal(good.Bytes().substr(0, 60)),
        "bad.cat: at byte 60: the file ends within its table of 21 zone counts");
    std::vector<int32_t> counts(21, 0);
    counts[3] = -1;
    EXPECT_EQ(refusal([&](GaiaTestFile& f) { f.counts = counts; }),
        "bad.cat: at byte 40: zone 3 holds -1 stars");
    counts[3] = 1;
    counts[7] = 2;
    EXPECT_EQ(refusal([&](GaiaTestFile& f) { f.counts = counts; }),
        "bad.cat: at byte 56: the zone counts name 3 stars, the file holds 2");

    // A record cut short, and bytes after the last record the counts name.
    const std::string bytes = good.Bytes();
    EXPECT_EQ(Refusal(bytes.substr(0, bytes.size() - 10)),
        "bad.cat: at byte " + std::to_string(first + 48)
            + ": the file ends within star 2 of the 2 its zone counts name");
    EXPECT_EQ(Refusal(bytes + std::string(48, '\0')),
        "bad.cat: at byte " + std::to_string(first + 96)
            + ": 48 bytes after the last star the counts name");
    EXPECT_EQ(Refusal(bytes + std::string(5, '\0')),
        "bad.cat: at byte " + std::to_string(first + 96)
            + ": 5 bytes after the last star the counts name (a truncated star)");

    // A direction that is no unit vector, in the second record.
    GaiaTestFile zero = good;
    zero.stars[1].rawDirection = std::array<int32_t, 3> { 0, 0, 0 };
    EXPECT_EQ(Refusal(zero.Bytes()),
        "bad.cat: at byte " + std::to_string(first + 48 + 8)
            + ": the star's direction is no unit vector");
    zero.stars[1].rawDirection = std::array<int32_t, 3> { 2000000000, 2000000000, 0 };
    EXPECT_NE(Refusal(zero.Bytes()).find("no unit vector"), std::string::npos);
}

TEST(GaiaCatalogueTest, LabelFilesThatDoNotFitAreRefusedWithFileAndPlace)
{
    GaiaLabels labels;
    const std::string two = GaiaCrossIdBytes({ { 1, 0, 0, 5, 0 }, { 2, 0, 0, 6, 0 } });
    try {
        ReadGaiaCrossIds(two + "\x01\x02\x03", "cross-id.cat", labels);
        ADD_FAILURE() << "a cross-identification cut short was read";
    } catch (const ImportError& error) {
        EXPECT_STREQ(error.what(),
            "cross-id.cat: at byte 42: a cross-identification cut short (records are 21 bytes)");
    }

    auto refusal = [&](auto read, const std::string& text, const std::string& file) {
        try {
            read(text, file, labels);
        } catch (const ImportError& error) {
            return std::string(error.what());
        }
        return std::string();
    };
    EXPECT_EQ(
        refusal(ReadGaiaDesignations, "# comment\n  32349|x_CMa\n  abc|\xCE\xB1_CMa\n", "name.fab"),
        "name.fab:3: no star number before the '|'");
    EXPECT_EQ(refusal(ReadGaiaDesignations, "\n\n  32349 alpha CMa\n", "name.fab"),
        "name.fab:3: not a line 'number|designation'");
    EXPECT_EQ(refusal(ReadGaiaIauNames, " 32349|_(\"Sirius\") 2\n 70890|Proxima\n",
                  "common_star_names.fab"),
        "common_star_names.fab:2: not a line 'number|_(\"name\")'");
    EXPECT_EQ(
        refusal(ReadGaiaIauNames, " 99999999999999999999|_(\"Big\") 2\n", "common_star_names.fab"),
        "common_star_names.fab:1: no Hipparcos number before the '|'");
}

namespace {

// A folder of the catalogue's files, written by the tests, and the importer run on it.
class GaiaCommandTest : public ImportFolder {
protected:
    // Two star files (the second of level 1) and every label file, in folder "gaia".
    fs::path WriteCatalogue()
    {
        const fs::path dir = fDir / "gaia";
        fs::create_directories(dir);
        GaiaTestFile bright;
        GaiaTestStar sirius = StarAt(101.287155, -16.716116);
        sirius.hip = 32349;
        sirius.component = 1;
        sirius.sourceId = 2947050466531873024;
        sirius.parallax = 18960;
        sirius.v = -1460;
        sirius.bv = 0;
        sirius.spectralLine = 1;
        GaiaTestStar near = StarAt(150, 20); // 5 pc, to be replaced by --add
        near.hip = 300;
        near.parallax = 10000;
        near.v = 9000;
        near.bv = 1500;
        near.sourceId = 14;
        bright.stars = { sirius, near };
        WriteBytes(dir / "stars_0_0v0_21.cat", bright.Bytes());

        GaiaTestFile faint;
        faint.level = 1;
        GaiaTestStar far = StarAt(200, -30); // to be annotated
        far.hip = 400;
        far.parallax = 1000;
        far.v = 6000;
        far.zone = 40;
        GaiaTestStar gaia = StarAt(250, 45);
        gaia.sourceId = 2509780430229120256;
        gaia.v = 10000;
        gaia.parallax = 500;
        gaia.zone = 80;
        GaiaTestStar vague = StarAt(260, 45); // skipped: parallax under five times its error
        vague.parallax = 50;
        vague.parallaxError = 30;
        faint.stars = { far, gaia, vague };
        WriteBytes(dir / "stars_1_0v0_16.cat", faint.Bytes());

        WriteBytes(dir / "stars_hip_sp_0v0_6.cat", "\nA0mA1Va\n");
        WriteBytes(dir / "common_star_names.fab", " 32349|_(\"Sirius\") 2\n");
        WriteBytes(dir / "name.fab", "  32349|\xCE\xB1_CMa\n");
        WriteBytes(dir / "cross-id.cat", GaiaCrossIdBytes({ { 32349, 1, 151881, 48915, 2491 } }));
        return dir;
    }

    static void WriteBytes(const fs::path& path, const std::string& bytes)
    {
        std::ofstream(path, std::ios::binary) << bytes;
    }

    // The catalogue's names, by index (the Sun is 0).
    static std::vector<std::string> NamesIn(const std::string& catalogue)
    {
        std::istringstream in(Read(catalogue));
        std::vector<std::string> names;
        std::string name, data;
        while (std::getline(in, name) && std::getline(in, data))
            names.push_back(name);
        return names;
    }

    // The names file: its header lines, and each star's other names by its index.
    struct NamesFile {
        std::string magic, sizes;
        std::map<size_t, std::vector<std::string>> others;
    };
    static NamesFile ReadNames(const std::string& path)
    {
        NamesFile names;
        std::istringstream in(Read(path));
        std::getline(in, names.magic);
        std::getline(in, names.sizes);
        std::string line;
        while (std::getline(in, line)) {
            std::istringstream fields(line);
            std::string index, name;
            std::getline(fields, index, '\t');
            std::vector<std::string>& others = names.others[std::stoul(index)];
            while (std::getline(fields, name, '\t'))
                others.push_back(name);
        }
        return names;
    }

    static size_t IndexOf(const std::vector<std::string>& names, const std::string& name)
    {
        return static_cast<size_t>(std::find(names.begin(), names.end(), name) - names.begin());
    }

    static bool Holds(const std::vector<std::string>& names, const std::string& name)
    {
        return std::find(names.begin(), names.end(), name) != names.end();
    }

    // Checks the names file beside the catalogue against it, and returns it.
    NamesFile CheckedNames(const std::string& catalogue)
    {
        const std::vector<std::string> stars = NamesIn(catalogue);
        const NamesFile names = ReadNames(fs::path(catalogue).replace_extension(".names"));
        EXPECT_EQ(names.magic, "nightdome names 1");
        EXPECT_EQ(names.sizes,
            std::to_string(stars.size()) + " " + std::to_string(fs::file_size(catalogue)));
        for (const auto& [index, others] : names.others) {
            EXPECT_LT(index, stars.size());
            EXPECT_FALSE(others.empty());
            for (const std::string& name : others) {
                EXPECT_TRUE(!name.empty() && name.size() <= 79
                    && std::all_of(
                        name.begin(), name.end(), [](char c) { return c >= ' ' && c <= '~'; }))
                    << "not 1-79 printable ASCII characters: " << name;
            }
            if (index < stars.size()) {
                EXPECT_FALSE(Holds(others, stars[index])) << stars[index];
            }
        }
        return names;
    }
};

} // namespace

TEST_F(GaiaCommandTest, FolderIsReadWithItsLabels)
{
    const fs::path dir = WriteCatalogue();
    std::string output;
    const std::string catalogue = PathOf("stars.dat");
    ASSERT_EQ(Run("--format=gaia " + dir.string() + " -o " + catalogue, &output), 0) << output;
    EXPECT_NE(output.find("Read 5 stars"), std::string::npos) << output;
    EXPECT_NE(output.find("1 with a parallax under five times its error"), std::string::npos)
        << output;

    const std::vector<std::string> stars = NamesIn(catalogue);
    ASSERT_EQ(stars.size(), 5u);
    EXPECT_EQ(stars[0], "The Sun");
    for (const char* name : { "Sirius", "HIP 300", "HIP 400", "Gaia DR3 2509780430229120256" })
        EXPECT_TRUE(Holds(stars, name)) << name;
    EXPECT_NE(Read(catalogue).find("Sirius\nA0mA1Va 1.434 "), std::string::npos) << Read(catalogue);

    const NamesFile names = CheckedNames(catalogue);
    const std::vector<std::string>& sirius = names.others.at(IndexOf(stars, "Sirius"));
    for (const char* other : { "Alpha Canis Majoris", "alf CMa", "alp CMa", "HD 48915", "HR 2491",
             "HIP 32349", "Gaia DR3 2947050466531873024" })
        EXPECT_TRUE(Holds(sirius, other)) << other;
    EXPECT_EQ(
        names.others.at(IndexOf(stars, "HIP 300")), std::vector<std::string> { "Gaia DR3 14" });

    // Without --format: the folder, and one star file told by its first bytes, read with the
    // labels beside it.
    ASSERT_EQ(Run(dir.string() + " -q -o " + PathOf("guessed.dat"), &output), 0) << output;
    EXPECT_EQ(Read(PathOf("guessed.dat")), Read(catalogue));
    EXPECT_EQ(Read(PathOf("guessed.names")), Read(PathOf("stars.names")));
    ASSERT_EQ(
        Run((dir / "stars_0_0v0_21.cat").string() + " -q -o " + PathOf("one.dat"), &output), 0)
        << output;
    const std::vector<std::string> one = NamesIn(PathOf("one.dat"));
    EXPECT_EQ(one, (std::vector<std::string> { "The Sun", "Sirius", "HIP 300" }));
    EXPECT_TRUE(Holds(CheckedNames(PathOf("one.dat")).others.at(1), "HD 48915"));
}

TEST_F(GaiaCommandTest, ReplacedAndAnnotatedStarsKeepTheirNames)
{
    const fs::path dir = WriteCatalogue();
    // An IAU name of more than ASCII for HIP 400, which the table renames: it cannot go to the
    // names file.
    WriteBytes(
        dir / "common_star_names.fab", " 32349|_(\"Sirius\") 2\n   400|_(\"Cital\xC3\xA1\") 2\n");
    // A star of the 10-parsec census where the catalogue has HIP 300, and a bright star's
    // table naming HIP 400.
    const std::string nearest = Write("Nearest.csv",
        std::string(kSouthernHeader)
            + SouthernRow("10 00 00.00", "+20 00 00.0", "+9.00", "+10.50", "5.000E+00", "M3V",
                "GJ 9999;HIP 300", "Census Star"));
    const std::string brightest = Write("Brightest.csv",
        std::string(kSouthernHeader)
            + SouthernRow("13 20 00.00", "-30 00 00.0", "+6.00", "+6.65", "5.000E+01", "G2V",
                "HR 7777;HD 8888;HIP 400", "Table Star"));
    std::string output;
    const std::string catalogue = PathOf("stars.dat");
    ASSERT_EQ(Run("--format=gaia " + dir.string() + " --annotate=" + brightest + " --add=" + nearest
                      + " -o " + catalogue,
                  &output),
        0)
        << output;
    const std::vector<std::string> stars = NamesIn(catalogue);
    ASSERT_EQ(stars.size(), 5u) << output;
    const NamesFile names = CheckedNames(catalogue);

    const size_t census = IndexOf(stars, "Census Star");
    ASSERT_LT(census, stars.size()) << output;
    EXPECT_FALSE(Holds(stars, "HIP 300"));
    const std::vector<std::string>& replaced = names.others.at(census);
    for (const char* other : { "HIP 300", "Gaia DR3 14", "GJ 9999" })
        EXPECT_TRUE(Holds(replaced, other)) << other;

    const size_t annotated = IndexOf(stars, "Table Star");
    ASSERT_LT(annotated, stars.size()) << output;
    const std::vector<std::string>& relabelled = names.others.at(annotated);
    for (const char* other : { "HIP 400", "HD 8888", "HR 7777" })
        EXPECT_TRUE(Holds(relabelled, other)) << other;
    EXPECT_FALSE(Holds(relabelled, "Cital\xC3\xA1"));
}

TEST_F(GaiaCommandTest, BadFilesAreNamedInTheMessage)
{
    const fs::path dir = WriteCatalogue();
    WriteBytes(dir / "name.fab", "  32349|\xCE\xB1_CMa\nCMa|9\n");
    std::string output;
    EXPECT_EQ(Run("--format=gaia " + dir.string() + " -o " + PathOf("stars.dat"), &output), 1);
    EXPECT_NE(output.find((dir / "name.fab").string() + ":2: no star number before the '|'"),
        std::string::npos)
        << output;
    EXPECT_FALSE(fs::exists(PathOf("stars.dat")));

    WriteBytes(dir / "name.fab", "");
    const std::string bytes = Read((dir / "stars_1_0v0_16.cat").string());
    WriteBytes(dir / "stars_1_0v0_16.cat", bytes.substr(0, bytes.size() - 1));
    EXPECT_EQ(Run("--format=gaia " + dir.string() + " -o " + PathOf("stars.dat"), &output), 1);
    EXPECT_NE(output.find((dir / "stars_1_0v0_16.cat").string() + ": at byte "
                  + std::to_string(bytes.size() - 48) + ": the file ends within star 3 of the 3"),
        std::string::npos)
        << output;
}

TEST_F(GaiaCommandTest, KStarsCatalogueStillReadsThroughAPipe)
{
    const std::string input = std::string(ND_TEST_DATA_DIR) + "/kstars-excerpt.dat";
    std::string output;
    ASSERT_EQ(Run(input + " -q -o " + PathOf("from-file.dat"), &output), 0) << output;
    ASSERT_EQ(
        RunShell("cat " + input + " | " + ND_IMPORTER + " /dev/stdin -o " + PathOf("from-pipe.dat"),
            &output),
        0)
        << output;
    EXPECT_NE(output.find("(kstars)"), std::string::npos) << output;
    EXPECT_EQ(Read(PathOf("from-pipe.dat")), Read(PathOf("from-file.dat")));
    EXPECT_EQ(Read(PathOf("from-pipe.names")), Read(PathOf("from-file.names")));
}
