// Component letters of stars that share a name: the letter a Southern Stars row gives its own
// star, and the letters given brightest first when a row gives none or its letter is taken.
#include "ImporterFixture.h"
#include "SouthernStarsRows.h"

#include "tools/importer/CatalogueMerge.h"
#include "tools/importer/SourceReaders.h"

#include "catalog/Star.h"
#include "catalog/Universe.h"

#include <gtest/gtest.h>

#include <map>
#include <sstream>

namespace {

std::vector<ImportStar> Read(const std::string& rows)
{
    std::istringstream in(kSouthernHeader + rows);
    std::vector<ImportStar> stars;
    ImportReport report;
    ReadSouthernStars(in, "Nearest.csv", stars, report);
    return stars;
}

// The three rows of 40 Eridani (omicron2 Eridani) in the nearest-stars table: the primary with
// its common name, then the white dwarf B and the red dwarf C, which list the pair BC, each
// its own letter first.
const std::string kKeid = SouthernComponentRow("", "04 15 16.32", "-07 39 10.3", "+4.43", "+5.25",
    "5.010E+00", "K0.5V", "omicron2 Eri;40 Eri;HR 1325;GJ 166A;HD 26965", "Keid");
const std::string kFortyEridaniB = SouthernComponentRow("BC", "04 15 21.80", "-07 39 29.2", "+9.53",
    "+9.83", "5.008E+00", "DA2.9", "omicron2 Eri;GJ 166B;HD 26976;WDS 04153-0739", "");
const std::string kFortyEridaniC = SouthernComponentRow("CB", "04 15 21.54", "-07 39 20.7",
    "+11.17", "+12.85", "5.014E+00", "M4.5V", "omicron2 Eri;DY Eri;GJ 166C;WDS 04153-0739", "");

const ImportStar* Named(const std::vector<ImportStar>& stars, const std::string& name)
{
    for (const ImportStar& star : stars) {
        if (star.name == name)
            return &star;
    }
    return nullptr;
}

} // namespace

TEST(ComponentLetters, TheFirstLetterOfThePairIsTheRowsOwn)
{
    const std::vector<ImportStar> stars = Read(kKeid + kFortyEridaniB + kFortyEridaniC);
    ASSERT_EQ(stars.size(), 3u);
    EXPECT_EQ(stars[0].component, 0);
    EXPECT_EQ(stars[1].component, 'B');
    EXPECT_EQ(stars[2].component, 'C');
    EXPECT_EQ(stars[1].spectralClass, "DA2.9"); // the columns after Comp are where they were
    EXPECT_EQ(stars[1].name, "Omicron2 Eridani");
    EXPECT_EQ(stars[2].name, "Omicron2 Eridani");
}

TEST(ComponentLetters, AGlieseNumberTellsWhichLetterOfThePairIsTheRowsOwn)
{
    // Lalande 21258 B gives the pair as its primary does; its Gliese number ends in B. A row
    // whose Gliese number names neither letter of the pair keeps the first, and a pair of
    // parts of one component ("Aa") is that component.
    const std::vector<ImportStar> stars
        = Read(SouthernComponentRow("AB", "11 05 28.58", "+43 31 36.4", "+8.74", "+10.25", "4.8",
                   "M1V", "GJ 412A;BD +44 2051", "Lalande 21258 A")
            + SouthernComponentRow("AB", "11 05 30.31", "+43 31 17.8", "+14.45", "+16.3", "4.8",
                "M5.5V", "WX UMa;GJ 412B;BD +44 2051", "Lalande 21258 B")
            + SouthernComponentRow("AC", "02 36 04.89", "+06 53 12.7", "+5.82", "+6.79", "7.2",
                "K3V", "HR 753;GJ 105A;HD 16160", "")
            + SouthernComponentRow("Aa", "17 46 27.53", "+27 43 14.4", "+3.42", "+4.17", "8.3",
                "G5IV", "mu Her;86 Her;HR 6623", "")
            + SouthernComponentRow("b", "17 46 27.53", "+27 43 14.4", "+3.42", "+4.17", "8.3",
                "G5IV", "mu Her;86 Her;HR 6623", ""));
    ASSERT_EQ(stars.size(), 5u);
    EXPECT_EQ(stars[0].component, 'A');
    EXPECT_EQ(stars[1].component, 'B');
    EXPECT_EQ(stars[2].component, 'A');
    EXPECT_EQ(stars[3].component, 'A');
    EXPECT_EQ(stars[4].component, 0);
}

TEST(ComponentLetters, FortyEridaniBAndCTakeTheirOwnLetters)
{
    std::vector<ImportStar> stars = Read(kKeid + kFortyEridaniB + kFortyEridaniC);
    EXPECT_EQ(LetterSharedNames(stars), 2);
    EXPECT_EQ(stars[0].name, "Keid");
    const ImportStar* b = Named(stars, "Omicron2 Eridani B");
    ASSERT_NE(b, nullptr);
    EXPECT_EQ(b->spectralClass, "DA2.9");
    const ImportStar* c = Named(stars, "Omicron2 Eridani C");
    ASSERT_NE(c, nullptr);
    EXPECT_EQ(c->spectralClass, "M4.5V");
    EXPECT_EQ(Named(stars, "Omicron2 Eridani A"), nullptr);
}

TEST(ComponentLetters, RowsWithoutALetterAreLetteredBrightestFirst)
{
    // Without Comp the pair is lettered as before, the brighter A.
    std::vector<ImportStar> pair = Read(SouthernRow("04 15 21.80", "-07 39 29.2", "+11.17", "",
                                            "5.008", "M4.5V", "omicron2 Eri", "")
        + SouthernRow(
            "04 15 21.54", "-07 39 20.7", "+9.53", "", "5.014", "DA2.9", "omicron2 Eri", ""));
    EXPECT_EQ(LetterSharedNames(pair), 2);
    EXPECT_EQ(pair[0].name, "Omicron2 Eridani B");
    EXPECT_EQ(pair[1].name, "Omicron2 Eridani A");

    // A star without a letter beside one with its own takes the first letter left free: 36
    // Ophiuchi's third star beside B, its primary under a common name.
    std::vector<ImportStar> mixed
        = Read(SouthernComponentRow("BA", "17 15 20.98", "-26 36 10.2", "+5.03", "+5.89", "5.952",
                   "K1V", "36 Oph;HR 6401;GJ 663B", "")
            + SouthernRow("17 16 13.36", "-26 32 46.1", "+6.34", "+7.37", "5.954", "K5V",
                "36 Oph;V2215 Oph;GJ 664", ""));
    EXPECT_EQ(LetterSharedNames(mixed), 2);
    EXPECT_EQ(mixed[0].name, "36 Ophiuchi B");
    EXPECT_EQ(mixed[1].name, "36 Ophiuchi A");
}

TEST(ComponentLetters, ALetterAlreadyTakenFallsBack)
{
    // Another star carries "Omicron2 Eridani B" already: the white dwarf takes the first free
    // letter instead, the red dwarf keeps its own.
    std::vector<ImportStar> stars = Read(kFortyEridaniB + kFortyEridaniC
        + SouthernRow("04 15 25", "-07 39 00", "+12", "", "5.01", "M5V", "", "Omicron2 Eridani B"));
    EXPECT_EQ(LetterSharedNames(stars), 2);
    EXPECT_EQ(stars[0].name, "Omicron2 Eridani A");
    EXPECT_EQ(stars[1].name, "Omicron2 Eridani C");
    EXPECT_EQ(stars[2].name, "Omicron2 Eridani B");

    // Two stars with the same letter: the brighter keeps it, the fainter takes the first free
    // letter, passing over the one just given.
    std::vector<ImportStar> twice = Read(SouthernComponentRow("BA", "04 15 21.54", "-07 39 20.7",
                                             "+11.17", "", "5.014", "M4.5V", "omicron2 Eri", "")
        + SouthernComponentRow(
            "BC", "04 15 21.80", "-07 39 29.2", "+9.53", "", "5.008", "DA2.9", "omicron2 Eri", "")
        + SouthernRow("04 15 21", "-07 39 20", "+13", "", "5.01", "M6V", "omicron2 Eri", ""));
    EXPECT_EQ(LetterSharedNames(twice), 3);
    EXPECT_EQ(twice[1].name, "Omicron2 Eridani B");
    EXPECT_EQ(twice[0].name, "Omicron2 Eridani A");
    EXPECT_EQ(twice[2].name, "Omicron2 Eridani C");

    // Letters run out: 26 stars share the name, one wants Z, and another star carries Q. The
    // name is left as it is.
    std::string many;
    for (int i = 0; i < 26; i++)
        many += SouthernComponentRow(i == 0 ? "ZA" : "", "04 15 21", "-07 39 20",
            std::to_string(5 + i), "", "5.01", "M4V", "omicron2 Eri", "");
    many
        += SouthernRow("04 15 22", "-07 39 20", "+12", "", "5.01", "M5V", "", "Omicron2 Eridani Q");
    std::vector<ImportStar> crowded = Read(many);
    EXPECT_EQ(LetterSharedNames(crowded), 0);
    EXPECT_EQ(crowded[0].name, "Omicron2 Eridani");
}

using ComponentLettersImport = ImportFolder;

// The letters travel with the stars through --annotate and --add: a base catalogue's stars
// take the bright stars' names and letters, or are replaced by the nearest stars' rows.
TEST_F(ComponentLettersImport, LettersTravelWithMatchedStars)
{
    const std::string base = Write("base.csv",
        "name,ra,dec,parallax,mag,spect\n"
        "40 Eri,63.818000,-7.652872,199.6,4.43,K1\n"
        "omi2 Eri B,63.840833,-7.658111,199.7,9.53,DA\n"
        "Theta1 Ori C,83.818667,-5.389694,2.5,5.13,O7\n"
        "Theta1 Ori D,83.822083,-5.387944,2.5,6.69,B0\n");
    const std::string bright = Write("bright.csv",
        std::string(kSouthernHeader)
            + SouthernComponentRow("C", "05 35 16.48", "-05 23 22.9", "+5.13", "+4.89", "400",
                "O6.5V", "theta1 Ori;41 Ori;HR 1895", "")
            + SouthernComponentRow("D", "05 35 17.30", "-05 23 16.6", "+6.69", "+6.61", "400",
                "B0.5Vp", "theta1 Ori;41 Ori;HR 1896", ""));
    const std::string nearest = Write(
        "nearest.csv", std::string(kSouthernHeader) + kKeid + kFortyEridaniB + kFortyEridaniC);
    std::string output;
    ASSERT_EQ(
        Run(base + " --annotate=" + bright + " --add=" + nearest + " -o " + PathOf("stars.dat"),
            &output),
        0)
        << output;
    EXPECT_NE(
        output.find("Component letters given to 4 stars that shared a name.\n"), std::string::npos)
        << output;

    const Universe u(PathOf("stars.dat").c_str(), 1000000, 5000);
    std::map<std::string, std::string> types;
    for (int32_t i = 0; i < u.CountItems(); i++) {
        const StarSystem* s = u.SystemAt(i);
        for (int32_t j = 0; j < s->CountItems(); j++)
            types[s->StarAt(j)->GetName()] = s->StarAt(j)->GetSpectralClassString();
    }
    EXPECT_EQ(types["Keid"], "K0.5V");
    EXPECT_EQ(types["Omicron2 Eridani B"], "DA2.9");
    EXPECT_EQ(types["Omicron2 Eridani C"], "M4.5V");
    EXPECT_EQ(types["Theta1 Orionis C"], "O6.5V");
    EXPECT_EQ(types["Theta1 Orionis D"], "B0.5Vp");
    EXPECT_EQ(types.size(), 6u); // the Sun and the five stars, no name twice
}
