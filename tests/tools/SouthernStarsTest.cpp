// The Southern Stars tables: reading them, the estimates for rows that lack a value, and
// bringing them into another catalogue by position and brightness.
#include "ImporterFixture.h"
#include "SouthernStarsRows.h"

#include "tools/importer/CatalogueMerge.h"
#include "tools/importer/Designations.h"
#include "tools/importer/Importer.h"
#include "tools/importer/SourceReaders.h"
#include "tools/importer/SpectralEstimates.h"
#include "tools/importer/SystemGrouping.h"

#include "catalog/Star.h"
#include "catalog/Universe.h"

#include <gtest/gtest.h>

#include <cmath>
#include <cstring>
#include <regex>
#include <sstream>

namespace {

const char* const kHeader = kSouthernHeader;
constexpr auto Row = SouthernRow;

std::vector<ImportStar> Read(const std::string& rows, ImportReport* report = nullptr)
{
    std::istringstream in(kHeader + rows);
    std::vector<ImportStar> stars;
    ImportReport own;
    ReadSouthernStars(in, "Nearest.csv", stars, report ? *report : own);
    return stars;
}

std::string ReadError(const std::string& rows)
{
    try {
        Read(rows);
    } catch (const ImportError& error) {
        return error.what();
    }
    return "no error";
}

ImportStar At(double raDegrees, double decDegrees, double parsecs, double apparent)
{
    ImportStar star;
    star.ra = raDegrees / 180 * M_PI;
    star.dec = decDegrees / 180 * M_PI;
    star.parallax = 1000 / parsecs;
    star.absoluteMagnitude = apparent + 5 - 5 * std::log10(parsecs);
    star.spectralClass = "G2V";
    return star;
}

constexpr double kArcsec = 1.0 / 3600;

} // namespace

TEST(SouthernStars, TheHeaderTellsTheFormat)
{
    EXPECT_EQ(
        GuessFormat(std::string(kHeader, std::strlen(kHeader) - 1)), InputFormat::SouthernStars);
    // SSCore's own files head the type column differently; it is the column after RV.
    const std::string original
        = std::regex_replace(std::string(kHeader), std::regex(",SpType,"), ",Sp,");
    EXPECT_EQ(GuessFormat(original.substr(0, original.size() - 1)), InputFormat::SouthernStars);
    std::istringstream in(original
        + Row(
            "14 29 42.95", "-62 40 46.2", "+11.13", "", "1.302", "M5.5V", "", "Proxima Centauri"));
    std::vector<ImportStar> stars;
    ImportReport report;
    ReadSouthernStars(in, "Nearest.csv", stars, report);
    ASSERT_EQ(stars.size(), 1u);
    EXPECT_EQ(stars[0].spectralClass, "M5.5V");
    EXPECT_FALSE(stars[0].classEstimated);
    // HYG and plain CSV headers stay theirs.
    EXPECT_EQ(
        GuessFormat("id,hip,hd,hr,gl,bf,proper,ra,dec,dist,mag,absmag,spect"), InputFormat::Hyg);
    EXPECT_EQ(GuessFormat("name,ra,dec,dist,spect,mag"), InputFormat::Csv);
}

TEST(SouthernStars, ProximaIsReadWithItsFullName)
{
    const auto stars = Read(Row("14 29 42.95", "-62 40 46.2", "+11.13", "+12.95", "1.302E+00",
        "M5.5V", "alpha Cen;V645 Cen;GJ 551;HIP 70890", "Proxima Cen;Proxima Centauri"));
    ASSERT_EQ(stars.size(), 1u);
    const ImportStar& p = stars[0];
    EXPECT_EQ(p.name, "Proxima Centauri");
    EXPECT_EQ(p.nameKind, NameKind::Proper);
    EXPECT_EQ(p.spectralClass, "M5.5V");
    EXPECT_NEAR(p.ra * 12 / M_PI, 14 + 29 / 60.0 + 42.95 / 3600, 1e-9);
    EXPECT_NEAR(p.dec * 180 / M_PI, -(62 + 40 / 60.0 + 46.2 / 3600), 1e-9);
    EXPECT_NEAR(1000 / p.parallax, 1.302, 1e-12);
    EXPECT_NEAR(p.absoluteMagnitude, 11.13 + 5 - 5 * std::log10(1.302), 1e-9);
    EXPECT_TRUE(p.measured);
    EXPECT_FALSE(p.classEstimated);
}

TEST(SouthernStars, ADeclinationOfMinusZeroDegreesIsSouth)
{
    const auto stars = Read(Row("01 00 00", "-00 30 00", "5", "", "10", "G2V", "", "Star"));
    ASSERT_EQ(stars.size(), 1u);
    EXPECT_NEAR(stars[0].dec * 180 / M_PI, -0.5, 1e-12);
}

// The fullest common name, but a primary listed bare and with its letter carries the bare
// name, the one a search by whole name looks for; its companions keep their letters.
TEST(SouthernStars, APrimaryCarriesTheBareCommonName)
{
    const auto stars = Read(Row("06 45 08.92", "-16 42 58.0", "-1.46", "", "2.637", "A1V",
                                "alpha CMa;GJ 244A", "Sirius;Sirius A")
        + Row("06 45 09.30", "-16 43 00.7", "+8.44", "", "2.670", "DA1.9", "alpha CMa;GJ 244B",
            "Sirius;Sirius B")
        + Row("14 29 42.95", "-62 40 46.2", "+11.13", "", "1.302", "M5.5V", "GJ 551",
            "Proxima Cen;Proxima Centauri")
        // the order of the names does not matter
        + Row("07 39 18.12", "+05 13 30.0", "+0.37", "", "3.514", "F5V", "alpha CMi",
            "Procyon A;Procyon")
        // a letter other than A is no primary's
        + Row("22 27 59.80", "+57 41 49.7", "+11.30", "", "4.001", "M4V", "GJ 860B",
            "Kruger 60;Kruger 60 B")
        // a name with the letter A keeps it when the bare name is not among the names ("Ross"
        // only begins like it)
        + Row("21 29 36.81", "+17 38 35.9", "+10.30", "", "6.780", "M3eV", "GJ 829A",
            "Ross;Ross 775 A"));
    ASSERT_EQ(stars.size(), 6u);
    EXPECT_EQ(stars[0].name, "Sirius");
    EXPECT_EQ(stars[0].nameKind, NameKind::Proper);
    EXPECT_EQ(stars[1].name, "Sirius B");
    EXPECT_EQ(stars[2].name, "Proxima Centauri");
    EXPECT_EQ(stars[3].name, "Procyon");
    EXPECT_EQ(stars[4].name, "Kruger 60 B");
    EXPECT_EQ(stars[5].name, "Ross 775 A");
}

TEST(SouthernStars, NamesByKindOfName)
{
    const auto stars = Read(
        // a designation among the common names counts as a designation, written out
        Row("17 20 00", "+21 00 00", "3.4", "", "8.3", "G5V", "mu Her;HR 6623", "mu Her Aa")
        // Bayer before Flamsteed, whatever their order; variable-star names are no Bayer
        + Row("21 06 53.94", "+38 44 57.9", "5.21", "", "3.497", "K5V",
            "V1803 Cyg;61 Cyg;HR 8085;GJ 820A;HD 201091", "")
        + Row("06 45 08.92", "-16 42 58.0", "-1.46", "", "2.637", "A1V",
            "9 CMa;alpha CMa;GJ 244A;HD 48915", "")
        + Row("01 39 01.38", "-17 57 02.6", "12.57", "", "2.72", "M5V", "BL Cet;GJ 65A;L 726-8", "")
        + Row("10 00 00", "+10 00 00", "6.5", "", "50", "K0III", "HR 9999;HD 87", "")
        + Row("10 00 00", "+20 00 00", "12", "", "8.851", "", "", ""));
    ASSERT_EQ(stars.size(), 6u);
    EXPECT_EQ(stars[0].name, "Mu Herculis Aa");
    EXPECT_EQ(stars[0].nameKind, NameKind::Designation);
    EXPECT_EQ(stars[1].name, "61 Cygni");
    EXPECT_EQ(stars[1].nameKind, NameKind::Designation);
    EXPECT_EQ(stars[2].name, "Alpha Canis Majoris");
    EXPECT_EQ(stars[3].name, "GJ 65A");
    EXPECT_EQ(stars[3].nameKind, NameKind::Gliese);
    EXPECT_EQ(stars[4].name, "HD 87");
    EXPECT_EQ(stars[4].nameKind, NameKind::HenryDraper);
    EXPECT_EQ(stars[5].name, "J100000.0+200000");
    EXPECT_EQ(stars[5].nameKind, NameKind::Position);
}

TEST(SouthernStars, WrittenOutDesignations)
{
    EXPECT_EQ(WrittenOutDesignation("alpha1 Cen"), "Alpha1 Centauri");
    EXPECT_EQ(WrittenOutDesignation("61 Cyg"), "61 Cygni");
    EXPECT_EQ(WrittenOutDesignation("p Eri"), "p Eridani");
    EXPECT_EQ(WrittenOutDesignation("xi UMa Bb"), "Xi Ursae Majoris Bb");
    EXPECT_EQ(WrittenOutDesignation("V645 Cen"), "");
    EXPECT_EQ(WrittenOutDesignation("BL Cet"), "");
    EXPECT_EQ(WrittenOutDesignation("R Leo"), ""); // a variable star, not Bayer's
    EXPECT_EQ(WrittenOutDesignation("alpha Xyz"), "");
    EXPECT_EQ(WrittenOutDesignation("GJ 551"), "");
    EXPECT_EQ(WrittenOutDesignation("alpha"), "");
}

TEST(SouthernStars, MissingValuesAreEstimatedAndCounted)
{
    ImportReport report;
    const auto stars = Read(
        // no V: the magnitude of a main-sequence star of its type
        Row("00 00 10", "+00 00 00", "", "+17.21", "3.832", "M6V", "", "Teegarden's Star")
            // a white dwarf without V: fainter than any main-sequence star of class A
            + Row("00 00 20", "+00 00 00", "", "", "8.463", "DAH", "", "")
            // no type: from B-V
            + Row("00 00 30", "+00 00 00", "+10.60", "+11.88", "8.416", "", "", "")
            // no type, no colour: from the absolute magnitude
            + Row("00 00 40", "+00 00 00", "+10.85", "", "7.880", "", "", "")
            // nothing at all: a red dwarf
            + Row("00 00 50", "+00 00 00", "", "", "3.406", "", "", "Luyten 789-6 C"),
        &report);
    ASSERT_EQ(stars.size(), 5u);
    EXPECT_NEAR(stars[0].absoluteMagnitude, 16.4, 1e-9);
    EXPECT_FALSE(stars[0].measured);
    EXPECT_EQ(stars[0].spectralClass, "M6V");
    EXPECT_GT(stars[1].absoluteMagnitude, 10);
    EXPECT_EQ(stars[2].spectralClass, "K");
    EXPECT_TRUE(stars[2].classEstimated);
    EXPECT_EQ(stars[3].spectralClass, TypeOfMagnitude(10.85 + 5 - 5 * std::log10(7.88)));
    EXPECT_EQ(stars[3].spectralClass, "M3V"); // 11.37, between M2 (10.6) and M3 (11.7)
    EXPECT_EQ(stars[4].spectralClass, "M");
    EXPECT_NEAR(stars[4].absoluteMagnitude, 13.1, 1e-9);
    EXPECT_EQ(report.magnitudesFromClass, 2);
    EXPECT_EQ(report.classesFromColour, 1);
    EXPECT_EQ(report.classesFromMagnitude, 1);
    EXPECT_EQ(report.classesAssumed, 1);
}

TEST(SouthernStars, MainSequenceMagnitudes)
{
    EXPECT_NEAR(*MagnitudeOfType("G0V"), 4.4, 1e-12);
    EXPECT_NEAR(*MagnitudeOfType("G2V"), 4.68, 1e-12); // the Sun is 4.83
    EXPECT_NEAR(*MagnitudeOfType("M4.5V"), 13.9, 1e-12);
    EXPECT_NEAR(*MagnitudeOfType("sdM1V"), 9.8, 1e-12);
    EXPECT_NEAR(*MagnitudeOfType("m"), 14.7, 1e-12); // class M, no subclass: M5
    EXPECT_NEAR(*MagnitudeOfType("DA1.9"), 10.95, 1e-12);
    EXPECT_FALSE(MagnitudeOfType("?").has_value());
    EXPECT_FALSE(MagnitudeOfType("").has_value());
    EXPECT_EQ(TypeOfMagnitude(4.68), "G2V");
    EXPECT_EQ(TypeOfMagnitude(-9), "O5V");
    EXPECT_EQ(TypeOfMagnitude(30), "L5V");
    for (const char* type : { "B3V", "A7V", "F2V", "K4V", "M3V", "M8V" })
        EXPECT_EQ(TypeOfMagnitude(*MagnitudeOfType(type)), type);
}

TEST(SouthernStars, LongTypesKeepTheirFirstStarAndLuminosityClass)
{
    EXPECT_EQ(ShortSpectralType("K1V+M3V"), "K1V+M3V");
    EXPECT_EQ(ShortSpectralType("G8III+G1III"), "G8III");
    EXPECT_EQ(ShortSpectralType("K0III-IV"), "K0III");
    EXPECT_EQ(ShortSpectralType("B9.5IIIpHgMnCr"), "B9.5III");
    EXPECT_EQ(ShortSpectralType("F9V ((metal-weak))"), "F9V");
    EXPECT_EQ(ShortSpectralType("sgG6"), "sgG6");
    EXPECT_EQ(ShortSpectralType("S6.5IIIeZr6Ti2"), "S6.5III");
}

TEST(SouthernStars, BadRowsNameTheFileAndTheLine)
{
    EXPECT_EQ(ReadError(Row("14 29", "-62 40 46.2", "11", "", "1.3", "M5V", "", "")),
        "Nearest.csv:2: ra '14 29' is not three numbers separated by blanks");
    EXPECT_EQ(ReadError(Row("14 29 42.95", "-62 40 46.2", "11", "", "1.3", "M5V", "", "")
                  + Row("24 00 00", "+00 00 00", "11", "", "1.3", "M5V", "", "")),
        "Nearest.csv:3: ra 24 out of range 0..23");
    EXPECT_EQ(ReadError(Row("01 00 00", "+91 00 00", "11", "", "1.3", "M5V", "", "")),
        "Nearest.csv:2: dec 91 out of range 0..90");
    EXPECT_EQ(ReadError(Row("01 00 00", "+89 61 00", "11", "", "1.3", "M5V", "", "")),
        "Nearest.csv:2: dec minutes 61 out of range 0..59");
    EXPECT_EQ(ReadError(Row("01 00 00", "+10 00 00", "bright", "", "1.3", "M5V", "", "")),
        "Nearest.csv:2: bad number in V: 'bright'");
    EXPECT_EQ(ReadError(Row("01 00 00", "+10 00 00", "50", "", "1.3", "M5V", "", "")),
        "Nearest.csv:2: V 50 out of range -30..40");
    EXPECT_EQ(ReadError(Row("01 00 00", "+10 00 00", "5", "", "1e-300", "M5V", "", "")),
        "Nearest.csv:2: dist 1e-300 pc places the star nearer than 1 AU");
    std::istringstream noDistance("Type,RA,Dec,V,SpType,IDs,Names\n");
    std::vector<ImportStar> stars;
    ImportReport report;
    try {
        ReadSouthernStars(noDistance, "x.csv", stars, report);
        ADD_FAILURE() << "no error";
    } catch (const ImportError& error) {
        EXPECT_STREQ(error.what(),
            "x.csv:1: missing column for distance (parsecs): the header needs 'dist'");
    }
    // A row without a distance is skipped and counted, as catalogues without a parallax are.
    ImportReport skipped;
    EXPECT_EQ(Read(Row("01 00 00", "+10 00 00", "5", "", "", "A0V", "", "X"), &skipped).size(), 0u);
    EXPECT_EQ(skipped.skipped["without a usable parallax"], 1);
}

TEST(CatalogueMatch, CloseAndAsBrightIsTheSameStar)
{
    const std::vector<ImportStar> base = {
        At(100, 20, 10, 5.0), // 0
        At(100, 20 + 4.5 * kArcsec, 10, 9.0), // 1: close but four magnitudes fainter
        At(200, -30, 20, 7.0), // 2
        At(300, 45, 30, 3.0), // 3
    };
    const std::vector<ImportStar> other = {
        At(100, 20 + 4 * kArcsec, 10, 5.8), // within 5" and 1 mag of 0
        At(200, -30 + 6 * kArcsec, 24, 7.0), // 6": too far for the close rule, 20% too far ...
        At(300, 45 + 30 * kArcsec, 31, 3.1), // ... 30", 0.1 mag and 3% fits the wide rule
        At(300, 45 + 30 * kArcsec, 31, 3.1), // the same again: star 3 is taken
        At(10, 10, 10, 5), // nowhere near any
    };
    const auto pairs = MatchStars(base, other);
    const std::vector<std::pair<size_t, size_t>> expected = { { 0, 0 }, { 2, 3 } };
    EXPECT_EQ(pairs, expected);

    // The wide rule also asks for the same distance and nearly the same brightness.
    // (The copy of the wide one takes star 3 then.)
    const std::vector<std::pair<size_t, size_t>> withoutIt = { { 0, 0 }, { 3, 3 } };
    auto far = other;
    far[2] = At(300, 45 + 30 * kArcsec, 40, 3.1);
    EXPECT_EQ(MatchStars(base, far), withoutIt);
    far[2] = At(300, 45 + 30 * kArcsec, 31, 3.4);
    EXPECT_EQ(MatchStars(base, far), withoutIt);
}

TEST(CatalogueMatch, TheClosestPairWinsAndEstimatesNeverMatch)
{
    const std::vector<ImportStar> base = { At(50, 0, 5, 6.0) };
    std::vector<ImportStar> other
        = { At(50, 3 * kArcsec, 5, 6.0), At(50, 1 * kArcsec, 5, 6.1), At(50, 0, 5, 6.0) };
    other[2].measured = false; // a magnitude estimated from the type
    const auto pairs = MatchStars(base, other);
    ASSERT_EQ(pairs.size(), 1u);
    EXPECT_EQ(pairs[0].first, 1u);
}

TEST(CatalogueMatch, AddedStarsReplaceTheirMatchesInPlace)
{
    std::vector<ImportStar> stars
        = { At(10, 10, 10, 5), At(20, 20, 2.64, -1.44), At(30, 30, 10, 5) };
    stars[1].name = "Sirius";
    stars[1].spectralClass = "A0";
    std::vector<ImportStar> extra = { At(20, 20 + 0.5 * kArcsec, 2.637, -1.46), At(40, 40, 3, 9) };
    extra[0].name = "Sirius A";
    extra[0].spectralClass = "A1V";
    extra[1].name = "Barnard's Star";
    MergeReport report;
    AddStars(stars, extra, report);
    ASSERT_EQ(stars.size(), 4u);
    EXPECT_EQ(stars[1].name, "Sirius A");
    EXPECT_NEAR(1000 / stars[1].parallax, 2.637, 1e-12);
    EXPECT_EQ(stars[3].name, "Barnard's Star");
    EXPECT_EQ(report.matched, 1);
    EXPECT_EQ(report.added, 1);
    EXPECT_EQ(report.typesChanged, 1);
    EXPECT_EQ(report.namesChanged, 1);
}

TEST(CatalogueMatch, AnnotationsGiveTypesAndBetterNames)
{
    std::vector<ImportStar> stars = { At(10, 10, 10, 5), At(20, 20, 10, 5), At(30, 30, 10, 5) };
    stars[0].name = "J004000.0+100000";
    stars[0].nameKind = NameKind::Position;
    stars[0].spectralClass = "M1";
    stars[1].name = "Marfik";
    stars[1].nameKind = NameKind::Proper;
    std::vector<ImportStar> labels
        = { At(10, 10, 10, 5.1), At(20, 20, 10, 5.1), At(35, 35, 10, 5) };
    labels[0].name = "Capella";
    labels[0].nameKind = NameKind::Proper;
    labels[0].spectralClass = "G8III";
    labels[1].name = "Xi Herculis";
    labels[1].nameKind = NameKind::Designation;
    labels[1].spectralClass = "G8III";
    labels[1].classEstimated = true; // an estimate never replaces a type
    labels[2].name = "Elsewhere";
    labels[2].nameKind = NameKind::Proper;
    MergeReport report;
    AnnotateStars(stars, labels, report);
    ASSERT_EQ(stars.size(), 3u);
    EXPECT_EQ(stars[0].name, "Capella");
    EXPECT_EQ(stars[0].spectralClass, "G8III");
    EXPECT_EQ(stars[1].name, "Marfik"); // a common name is kept before a designation
    EXPECT_EQ(stars[1].spectralClass, "G2V");
    EXPECT_EQ(report.matched, 2);
    EXPECT_EQ(report.typesChanged, 1);
    EXPECT_EQ(report.namesChanged, 1);
}

TEST(CatalogueMatch, SharedNamesGetComponentLettersBrightestFirst)
{
    std::vector<ImportStar> stars = {
        At(344.4, -29.6, 7.70, 1.16), // Fomalhaut and its two wide companions
        At(344.1, -31.6, 7.60, 6.48),
        At(342.0, -24.4, 7.68, 12.62),
        At(100, 10, 50, 5), // two far-apart stars that share an old name
        At(200, 10, 80, 4),
        At(316.72, 38.75, 3.497, 5.21), // already lettered
        At(316.73, 38.74, 3.496, 6.03),
    };
    const char* names[]
        = { "Fomalhaut", "Fomalhaut", "Fomalhaut", "Atik", "Atik", "Sirius B", "Sirius B" };
    for (size_t i = 0; i < stars.size(); i++) {
        stars[i].name = names[i];
        stars[i].nameKind = NameKind::Proper;
    }
    std::swap(stars[0], stars[2]);
    EXPECT_EQ(LetterSharedNames(stars), 3);
    EXPECT_EQ(stars[0].name, "Fomalhaut C");
    EXPECT_EQ(stars[1].name, "Fomalhaut B");
    EXPECT_EQ(stars[2].name, "Fomalhaut A");
    EXPECT_EQ(stars[3].name, "Atik");
    EXPECT_EQ(stars[4].name, "Atik");
    EXPECT_EQ(stars[5].name, "Sirius B");

    // A letter another star carries already is passed over: a primary that kept its bare name
    // beside a star of the base catalogue of that name, its companion lettered by the table.
    std::vector<ImportStar> taken = { At(101.29, -16.72, 2.637, -1.46),
        At(101.29, -16.7201, 2.64, -1.44), At(101.2904, -16.7202, 2.670, 8.44) };
    const char* takenNames[] = { "Sirius", "Sirius", "Sirius B" };
    for (size_t i = 0; i < taken.size(); i++) {
        taken[i].name = takenNames[i];
        taken[i].nameKind = NameKind::Proper;
    }
    EXPECT_EQ(LetterSharedNames(taken), 2);
    EXPECT_EQ(taken[0].name, "Sirius A");
    EXPECT_EQ(taken[1].name, "Sirius C");
    EXPECT_EQ(taken[2].name, "Sirius B");

    // A name of 79 characters keeps its letter.
    std::vector<ImportStar> longNames = { At(1, 1, 5, 5), At(1, 1.001, 5, 6) };
    for (ImportStar& star : longNames)
        star.name = std::string(79, 'x');
    LetterSharedNames(longNames);
    EXPECT_EQ(longNames[0].name, std::string(77, 'x') + " A");
    EXPECT_EQ(longNames[1].name, std::string(77, 'x') + " B");
}

using SouthernStarsImport = ImportFolder;

// The command with a base catalogue, annotations and added stars, read back by the program.
TEST_F(SouthernStarsImport, TheCommandMergesAndReports)
{
    const std::string base = Write("base.csv",
        "name,ra,dec,parallax,mag,spect\n"
        "Sirius,101.287155,-16.716116,379.21,-1.46,A0\n"
        "Capella,79.172329,45.997991,77.29,0.08,M1\n"
        "Faraway,10,10,1,8,K0\n");
    const std::string bright = Write("bright.csv",
        std::string(kHeader)
            + Row("05 16 41.36", "+45 59 52.8", "+0.08", "+0.88", "1.294E+01", "G8III+G1III",
                "alpha Aur;13 Aur;HR 1708;GJ 194A;HD 34029", "Capella"));
    const std::string nearest = Write("nearest.csv",
        std::string(kHeader)
            + Row("06 45 08.92", "-16 42 58.0", "-1.46", "-1.46", "2.637E+00", "A1V",
                "alpha CMa;9 CMa;HR 2491;GJ 244A;HD 48915", "Sirius;Sirius A")
            + Row("06 45 09.30", "-16 43 00.7", "+8.44", "+8.41", "2.670E+00", "DA1.9",
                "alpha CMa;GJ 244B;HD 48915", "Sirius;Sirius B")
            + Row("14 29 42.95", "-62 40 46.2", "+11.13", "+12.95", "1.302E+00", "M5.5V",
                "alpha Cen;V645 Cen;GJ 551", "Proxima Cen;Proxima Centauri"));
    std::string output;
    ASSERT_EQ(
        Run(base + " --annotate=" + bright + " --add=" + nearest + " -o " + PathOf("stars.dat"),
            &output),
        0)
        << output;
    EXPECT_NE(output.find("Annotated with " + bright
                  + " (Southern Stars CSV): read 1 stars.\n  1 matched a star already there, 0 "
                    "matched none; changed: 1 spectral types, 0 names.\n"),
        std::string::npos)
        << output;
    EXPECT_NE(output.find("Added " + nearest
                  + " (Southern Stars CSV): read 3 stars.\n  1 matched a star already there and "
                    "replaced it, 2 added; changed: 1 spectral types, 0 names.\n"),
        std::string::npos)
        << output;
    EXPECT_NE(output.find("Names: 4 common names, 1 other catalogue names.\n"), std::string::npos)
        << output;
    EXPECT_NE(output.find("Wrote 5 systems of 6 stars"), std::string::npos) << output;

    const Universe u(PathOf("stars.dat").c_str(), 1000000, 5000);
    ASSERT_EQ(u.CountItems(), 5);
    const StarSystem* sirius = u.SystemAt(1);
    ASSERT_EQ(sirius->CountItems(), 2);
    // Sirius keeps its name: the table's primary carries it bare, its companion the letter.
    EXPECT_STREQ(sirius->GetName(), "Sirius");
    EXPECT_STREQ(sirius->StarAt(0)->GetName(), "Sirius");
    EXPECT_STREQ(sirius->StarAt(1)->GetName(), "Sirius B");
    EXPECT_STREQ(sirius->StarAt(1)->GetSpectralClassString(), "DA1.9");
    EXPECT_STREQ(u.SystemAt(2)->GetName(), "Capella");
    EXPECT_STREQ(u.SystemAt(2)->StarAt(0)->GetSpectralClassString(), "G8III");
    EXPECT_STREQ(u.SystemAt(3)->GetName(), "Faraway");
    EXPECT_STREQ(u.SystemAt(4)->GetName(), "Proxima Centauri");

    // A bad row in an added catalogue is bad input like any other: nothing is written.
    const std::string before = Read(PathOf("stars.dat"));
    const std::string bad = Write("bad.csv",
        std::string(kHeader) + Row("25 00 00", "+10 00 00", "5", "", "3", "G2V", "", "X"));
    EXPECT_EQ(Run(base + " --add=" + bad + " -o " + PathOf("stars.dat"), &output), 1);
    EXPECT_NE(output.find(bad + ":2: ra 25 out of range 0..23"), std::string::npos) << output;
    EXPECT_EQ(Read(PathOf("stars.dat")), before);
    // So is an added catalogue that is the output itself.
    EXPECT_EQ(
        Run(base + " --add=" + PathOf("stars.dat") + " -o " + PathOf("stars.dat"), &output), 1);
    EXPECT_NE(output.find("is the output"), std::string::npos) << output;
    EXPECT_EQ(Read(PathOf("stars.dat")), before);
}
