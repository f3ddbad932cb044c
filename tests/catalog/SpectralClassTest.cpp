#include "catalog/SpectralClass.h"

#include <gtest/gtest.h>

#include <string>

TEST(SpectralClass, LettersOfEveryEnumerator)
{
    const std::string letters = "WOBAFGKMRN";
    for (int hc = kClassW; hc <= kClassN; hc++)
        EXPECT_EQ(SpectralClass::HCToChar(HarvardClass(hc)), letters[hc]);
    EXPECT_EQ(SpectralClass::HCToChar(kNoClass), 'G');
    EXPECT_EQ(SpectralClass::HCToChar(HarvardClass(10)), '\0');
    EXPECT_EQ(SpectralClass::HCToChar(HarvardClass(-2)), '\0');
}

TEST(SpectralClass, DefaultIsNoClass)
{
    const SpectralClass sc;
    EXPECT_EQ(sc.harvardClass, kNoClass);
    EXPECT_EQ(sc.decimalClass, 0.0);
    EXPECT_STREQ(sc.scString, "");
    EXPECT_EQ(sc.hcCharacter, 'G');
}

TEST(SpectralClass, BareLetterIsTheMiddleOfItsClass)
{
    SpectralClass sc;
    sc.SetSpectralClass("M");
    EXPECT_EQ(sc.harvardClass, kClassM);
    EXPECT_EQ(sc.decimalClass, 5.0);
    EXPECT_DOUBLE_EQ(sc.SCToDouble(), 7.5);
}

TEST(SpectralClass, PlusIsTheEndOfTheClass)
{
    const SpectralClass sc("O+");
    EXPECT_EQ(sc.harvardClass, kClassO);
    EXPECT_EQ(sc.decimalClass, 9.0);
    EXPECT_DOUBLE_EQ(sc.SCToDouble(), 1.9);
    EXPECT_EQ(SpectralClass("B+").decimalClass, 9.0);
}

TEST(SpectralClass, LowerCaseWolfRayetWithNoNumberAfterIt)
{
    const SpectralClass sc("wn7");
    EXPECT_EQ(sc.harvardClass, kClassW);
    EXPECT_EQ(sc.hcCharacter, 'W');
    EXPECT_EQ(sc.decimalClass, 5.0); // "n7" is no number
    EXPECT_STREQ(sc.scString, "wn7");
}

TEST(SpectralClass, CaseDoesNotMatter)
{
    const SpectralClass sc("g2");
    EXPECT_EQ(sc.harvardClass, kClassG);
    EXPECT_EQ(sc.decimalClass, 2.0);
    EXPECT_EQ(sc.hcCharacter, 'G');
}

TEST(SpectralClass, LuminosityClassAloneIsNoClass)
{
    const SpectralClass sc("III");
    EXPECT_EQ(sc.harvardClass, kNoClass);
    EXPECT_EQ(sc.hcCharacter, 'G');
    EXPECT_EQ(sc.decimalClass, 5.0);
    EXPECT_DOUBLE_EQ(sc.SCToDouble(), -0.5);
}

TEST(SpectralClass, ExamplesOfTheParsingRule)
{
    struct Case {
        const char* text;
        HarvardClass hc;
        double decimal;
    };
    const Case cases[] = {
        { "G2V", kClassG, 2.0 },
        { "K1.5III", kClassK, 1.5 },
        { "dM4", kClassM, 4.0 },
        { "A", kClassA, 5.0 },
        { "G12", kClassG, 5.0 },
        { "sdB", kClassB, 5.0 },
        { "XYZ", kNoClass, 5.0 },
        { "Gx", kClassG, 5.0 },
        { "G 3", kClassG, 3.0 }, // a blank before the digit is accepted
        { "B9.5", kClassB, 9.5 },
        { "A0p", kClassA, 0.0 },
        { "B1e", kClassB, 1.0 },
        { "F-1", kClassF, 5.0 },
        { "F10", kClassF, 5.0 },
        { "M9.99", kClassM, 9.99 },
        { "Mnan", kClassM, 5.0 },
        { "", kNoClass, 5.0 },
    };
    for (const Case& c : cases) {
        const SpectralClass sc(c.text);
        EXPECT_EQ(sc.harvardClass, c.hc) << c.text;
        EXPECT_DOUBLE_EQ(sc.decimalClass, c.decimal) << c.text;
        EXPECT_STREQ(sc.scString, c.text) << c.text;
    }
}

TEST(SpectralClass, LongTextIsCutToSevenCharacters)
{
    SpectralClass sc;
    EXPECT_STREQ(sc.SetSpectralClass("K0III-IVe+var"), "K0III-I");
    EXPECT_EQ(sc.harvardClass, kClassK);
    EXPECT_EQ(sc.decimalClass, 0.0);
}

TEST(SpectralClass, PrintedFromLetterAndDecimal)
{
    const SpectralClass sc(kClassK, 5.0);
    EXPECT_STREQ(sc.scString, "K5.0");
    EXPECT_EQ(sc.hcCharacter, 'K');
    EXPECT_DOUBLE_EQ(sc.SCToDouble(), 6.5);
    EXPECT_STREQ(SpectralClass(kClassB, 9.5).scString, "B9.5");
    EXPECT_DOUBLE_EQ(SpectralClass("B9.5").SCToDouble(), 2.95);
}

TEST(SpectralClass, ScaleOrdersHotToCool)
{
    EXPECT_LT(SpectralClass("O5").SCToDouble(), SpectralClass("B0").SCToDouble());
    EXPECT_LT(SpectralClass("G2V").SCToDouble(), SpectralClass("G8III").SCToDouble());
    EXPECT_LT(SpectralClass("K7").SCToDouble(), SpectralClass("M0").SCToDouble());
}
