#include "tools/importer/Designations.h"
#include "tools/importer/Importer.h"
#include "tools/importer/SourceReaders.h"

#include <gtest/gtest.h>

#include <cmath>
#include <string>

TEST(Designations, BayerAndFlamsteedWrittenOut)
{
    EXPECT_EQ(ReadableDesignation("alp CMa"), "Alpha Canis Majoris");
    EXPECT_EQ(ReadableDesignation("alp1Cen"), "Alpha1 Centauri");
    EXPECT_EQ(ReadableDesignation("Alp2Cen"), "Alpha2 Centauri");
    EXPECT_EQ(ReadableDesignation("pi 2Col"), "Pi2 Columbae");
    EXPECT_EQ(ReadableDesignation("xi  UMa"), "Xi Ursae Majoris");
    EXPECT_EQ(ReadableDesignation("the TrA"), "Theta Trianguli Australis");
    EXPECT_EQ(ReadableDesignation("61    Cyg"), "61 Cygni");
    EXPECT_EQ(ReadableDesignation("9Alp CMa"), "Alpha Canis Majoris");
    EXPECT_EQ(ReadableDesignation("mu  Cep"), "Mu Cephei");
    EXPECT_EQ(ReadableDesignation("Gl 559A"), "");
    EXPECT_EQ(ReadableDesignation(""), "");
    EXPECT_EQ(ReadableDesignation("alp Xyz"), "");
}

TEST(Designations, ConstellationsByAbbreviation)
{
    EXPECT_EQ(ConstellationGenitive("CrA"), "Coronae Australis");
    EXPECT_EQ(ConstellationGenitive("Crt"), "Crateris");
    EXPECT_EQ(ConstellationGenitive("CMA"), "Canis Majoris");
    EXPECT_EQ(ConstellationGenitive("Sun"), "");
}

TEST(Designations, PositionDesignationRoundsWithoutReachingSixty)
{
    const double kPi = 3.141592653589793;
    // 6 h 45 m 8.92 s, -16 deg 42 min 58.0 s: Sirius.
    const double ra = (6 + 45 / 60.0 + 8.92 / 3600) / 24 * 2 * kPi;
    const double dec = -(16 + 42 / 60.0 + 58.0 / 3600) / 180 * kPi;
    EXPECT_EQ(PositionDesignation(ra, dec), "J064508.9-164258");
    // 59.96 seconds round up into the next minute, not to "60.0".
    const double late = (0 + 32 / 60.0 + 59.96 / 3600) / 24 * 2 * kPi;
    EXPECT_EQ(PositionDesignation(late, 0.0), "J003300.0+000000");
    EXPECT_EQ(PositionDesignation(-0.0001, 0.0).substr(0, 5), "J2359");
}

TEST(Designations, PositionDesignationOfAnyValue)
{
    // Declinations past a pole, infinite ones too, stop at it; a right ascension that is not
    // finite and a declination that is no number are taken as 0. None of them may overflow
    // the integer conversions.
    EXPECT_EQ(PositionDesignation(0.0, 1e20), "J000000.0+900000");
    EXPECT_EQ(PositionDesignation(0.0, -1e20), "J000000.0-900000");
    EXPECT_EQ(PositionDesignation(NAN, NAN), "J000000.0+000000");
    EXPECT_EQ(PositionDesignation(INFINITY, -INFINITY), "J000000.0-900000");
    EXPECT_EQ(PositionDesignation(1e300, 0.0).size(), 16u);
}

TEST(Designations, EveryNameSourceIsCleaned)
{
    EXPECT_EQ(ChooseName({ "", " \t", "Gl 559A" }, 0, 0), "Gl 559A");
    EXPECT_EQ(ChooseName({ "HIP 12\x0b" + std::string(100, '3') }, 0, 0),
        ("HIP 12 " + std::string(100, '3')).substr(0, 79));
    EXPECT_EQ(ChooseName({ "", "\r\n" }, 0, 0), "J000000.0+000000");
}

TEST(Designations, CleanNamesFitTheCatalogue)
{
    EXPECT_EQ(CleanName("  Rigel \t Kentaurus \r\n"), "Rigel Kentaurus");
    const std::string long90(90, 'x');
    EXPECT_EQ(CleanName(long90).size(), 79u);
    // A two-byte character across the limit is left out whole.
    const std::string accented = std::string(78, 'a') + "\xc3\xa9" + "b";
    EXPECT_EQ(CleanName(accented), std::string(78, 'a'));
    EXPECT_EQ(CleanName("line\nfeed"), "line feed");
}

TEST(Designations, SpectralLetterFromColour)
{
    EXPECT_STREQ(ClassFromColour(-0.33), "O");
    EXPECT_STREQ(ClassFromColour(-0.2), "B");
    EXPECT_STREQ(ClassFromColour(0.0), "A");
    EXPECT_STREQ(ClassFromColour(0.42), "F");
    EXPECT_STREQ(ClassFromColour(0.65), "G"); // the Sun
    EXPECT_STREQ(ClassFromColour(1.0), "K");
    EXPECT_STREQ(ClassFromColour(1.8), "M");
}

TEST(Designations, FormatFromTheFirstLine)
{
    EXPECT_EQ(GuessFormat("# Star catalog derived from the Hipparcos"), InputFormat::KStars);
    EXPECT_EQ(GuessFormat("064508.92 -164258.0 -000546.0-001223.100379.2 -1.4400.01A0 1"),
        InputFormat::KStars);
    EXPECT_EQ(
        GuessFormat("id,hip,hd,hr,gl,bf,proper,ra,dec,dist,pmra,pmdec,rv,mag,absmag,spect,ci"),
        InputFormat::Hyg);
    EXPECT_EQ(GuessFormat("name,ra,dec,parallax,mag,spect"), InputFormat::Csv);
    EXPECT_EQ(GuessFormat("hello world"), InputFormat::Guess);
}

TEST(Designations, CsvFieldsWithQuotes)
{
    const auto fields = SplitCsvLine("a,\"b, c\",\"say \"\"hi\"\"\",,end");
    ASSERT_EQ(fields.size(), 5u);
    EXPECT_EQ(fields[1], "b, c");
    EXPECT_EQ(fields[2], "say \"hi\"");
    EXPECT_EQ(fields[3], "");
    EXPECT_EQ(fields[4], "end");
}
