// Transliteration to ASCII for the bitmap font: accented letters to their base letters, the
// ligatures and sharp s spelled out, Greek in Latin, stray Latin-1 bytes read as letters too.
#include "render/AsciiText.h"

#include <cctype>
#include <gtest/gtest.h>
#include <string>

namespace {

// Each character from first to last (two-byte UTF-8) gives ASCII letters only, at least one.
void ExpectLettersForEach(char32_t first, char32_t last)
{
    for (char32_t c = first; c <= last; c++) {
        const std::string utf8 { char(0xC0 | (c >> 6)), char(0x80 | (c & 0x3F)) };
        const std::string ascii = AsciiTransliteration(utf8);
        ASSERT_FALSE(ascii.empty()) << std::hex << uint32_t(c);
        for (char letter : ascii)
            EXPECT_TRUE(std::isalpha(static_cast<unsigned char>(letter)))
                << std::hex << uint32_t(c);
    }
}

} // namespace

TEST(AsciiTransliteration, AsciiPassesThroughUnchanged)
{
    std::string all;
    for (int c = 1; c < 128; c++)
        all += char(c);
    EXPECT_EQ(AsciiTransliteration(all), all);
    EXPECT_EQ(AsciiTransliteration(""), "");
}

TEST(AsciiTransliteration, AccentedLettersBecomeTheirBaseLetters)
{
    EXPECT_EQ(AsciiTransliteration("B\xc3\xa9l\xc3\xa9nos"), "Belenos"); // Bélénos
    EXPECT_EQ(AsciiTransliteration("M\xc3\xb6nch"), "Monch"); // Mönch
    EXPECT_EQ(AsciiTransliteration("A\xc3\xb1"
                                   "a\xc3\xb1uca"),
        "Ananuca"); // Añañuca
    EXPECT_EQ(AsciiTransliteration("Cital\xc3\xa1"), "Citala"); // Citalá
    EXPECT_EQ(AsciiTransliteration("\xc3\x85ngstr\xc3\xb6m"), "Angstrom"); // Ångström
    EXPECT_EQ(AsciiTransliteration("\xc5\x81\xc3\xb3"
                                   "d\xc5\xba"),
        "Lodz"); // Łódź
    EXPECT_EQ(AsciiTransliteration("\xc5\xa0"
                                   "a\xc5\xa1"
                                   "a"),
        "Sasa"); // Šaša
    EXPECT_EQ(AsciiTransliteration("\xc5\x9e"
                                   "aula"),
        "Saula"); // Şaula
}

TEST(AsciiTransliteration, LigaturesAndSharpSAreSpelledOut)
{
    EXPECT_EQ(AsciiTransliteration("Gro\xc3\x9f"), "Gross"); // Groß
    EXPECT_EQ(AsciiTransliteration("\xc3\x86gir"), "AEgir"); // Ægir
    EXPECT_EQ(AsciiTransliteration("\xc5\x93il"), "oeil"); // œil
    EXPECT_EQ(AsciiTransliteration("\xc4\xb2ssel"), "IJssel"); // Ĳssel
    EXPECT_EQ(AsciiTransliteration("\xc3\x9e\xc3\xb3r"), "Thor"); // Þór
}

TEST(AsciiTransliteration, GreekIsWrittenInLatin)
{
    EXPECT_EQ(AsciiTransliteration("\xce\xb1 Cen"), "a Cen"); // α Cen
    EXPECT_EQ(AsciiTransliteration("\xce\xb8\xcf\x86\xcf\x89"), "thpho"); // θφω
    EXPECT_EQ(AsciiTransliteration("\xce\xa9"), "O"); // Ω
    // Every Greek letter gives a letter or more, never a gap or a question mark.
    ExpectLettersForEach(0x3B1, 0x3C9);
}

TEST(AsciiTransliteration, EveryLatinLetterHasAnAsciiLetter)
{
    // From U+00C0 on, but for the multiplication and division signs.
    ExpectLettersForEach(0xC0, 0xD6);
    ExpectLettersForEach(0xD8, 0xF6);
    ExpectLettersForEach(0xF8, 0x17F);
}

TEST(AsciiTransliteration, CombiningAccentsAreDroppedAndQuotesAndDashesKept)
{
    EXPECT_EQ(AsciiTransliteration("Be\xcc\x81le\xcc\x81nos"), "Belenos"); // e + U+0301
    EXPECT_EQ(AsciiTransliteration("Barnard\xe2\x80\x99s Star"), "Barnard's Star");
    EXPECT_EQ(AsciiTransliteration("\xe2\x80\x9c"
                                   "A\xe2\x80\x9d \xe2\x80\x93 B"),
        "\"A\" - B");
    EXPECT_EQ(AsciiTransliteration("Ha\xca\xbb"
                                   "amea"),
        "Ha'amea"); // ʻokina
}

TEST(AsciiTransliteration, BytesThatAreNoUtf8AreReadAsLatin1)
{
    EXPECT_EQ(AsciiTransliteration("B\xe9l\xe9nos"), "Belenos"); // Latin-1 é
    EXPECT_EQ(AsciiTransliteration("M\xf6nch"), "Monch");
    // A sequence cut short, and an overlong form.
    EXPECT_EQ(AsciiTransliteration("x\xc3"), "xA");
    EXPECT_EQ(AsciiTransliteration("\xc0\xaf"), "A-");
}

TEST(AsciiTransliteration, OtherCharactersShowAsAQuestionMarkNeverAsAGap)
{
    EXPECT_EQ(AsciiTransliteration("\xe2\x98\x85"), "?"); // ★
    EXPECT_EQ(AsciiTransliteration("\xf0\x9f\x8c\x9f"), "?"); // 🌟
    EXPECT_EQ(AsciiTransliteration("\xe5\x8c\x97\xe6\xa5\xb5\xe6\x98\x9f"), "???"); // 北極星
}
