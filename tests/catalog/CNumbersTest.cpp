#include "catalog/CNumbers.h"

#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <memory>
#include <random>
#include <string>

namespace {

struct Fields {
    int count;
    char word[501];
    double m, x, y, z;
};

Fields Reference(const std::string& line)
{
    Fields f {};
    std::strcpy(f.word, "unset");
    f.m = f.x = f.y = f.z = -777;
    f.count = std::sscanf(line.c_str(), "%s %lf %lf %lf %lf", f.word, &f.m, &f.x, &f.y, &f.z);
    return f;
}

Fields Ours(const std::string& line)
{
    Fields f {};
    std::strcpy(f.word, "unset");
    f.m = f.x = f.y = f.z = -777;
    f.count
        = ScanCatalogueData(line.data(), line.data() + line.size(), f.word, &f.m, &f.x, &f.y, &f.z);
    return f;
}

// Ours, from a buffer where after follows the line and may be loaded.
Fields OursFollowedBy(const std::string& line, const std::string& after)
{
    const std::string buffer = line + after;
    Fields f {};
    std::strcpy(f.word, "unset");
    f.m = f.x = f.y = f.z = -777;
    f.count = ScanCatalogueData(buffer.data(), buffer.data() + line.size(),
        buffer.data() + buffer.size(), f.word, &f.m, &f.x, &f.y, &f.z);
    return f;
}

// Every field as sscanf gives it, bit for bit.
void ExpectFields(const Fields& a, const Fields& b, const std::string& line)
{
    EXPECT_EQ(a.count, b.count) << '"' << line << '"';
    EXPECT_STREQ(a.word, b.word) << '"' << line << '"';
    for (auto [u, v] : { std::pair { a.m, b.m }, { a.x, b.x }, { a.y, b.y }, { a.z, b.z } }) {
        if (std::isnan(u)) {
            EXPECT_TRUE(std::isnan(v)) << '"' << line << '"';
        } else {
            EXPECT_EQ(u, v) << '"' << line << '"';
            EXPECT_EQ(std::signbit(u), std::signbit(v)) << '"' << line << '"';
        }
    }
}

void ExpectSame(const std::string& line)
{
    ExpectFields(Reference(line), Ours(line), line);
}

} // namespace

TEST(CNumbers, CatalogueLinesReadExactlyAsTheCLibraryReadsThem)
{
    const char* lines[] = {
        "G2V 4.83 0 0 0",
        "  A1V   1.42\t-0.494323 -0.758719 2.5",
        "K5 7.5 3.5 -0.75 2.3          ",
        "M4 11.2 3.5",
        "M4 11.2",
        "M4",
        "",
        "     ",
        "G0 4.5 x 5 6",
        "B1 +1.5e0 0x10 -.25 1E2",
        "B1 1.5 2.5-3.5 4",
        "B1 1e 2 3 4",
        "B1 1e+ 2 3 4",
        "B1 inf -inf nan 4",
        "B1 infinity 1e400 1e-400 4",
        "B1 4.9406564584124654e-324 2.2250738585072014e-308 1.7976931348623157e308 -0",
        "B1 .5 -.5 5. -5.",
        "B1 - 2 3 4",
        "B1 . 2 3 4",
        "B1 00012.50000 -0000.0 1 2",
        "B1 1 2 3 4 5 6 extra words",
        "B1 0.1000000000000000055511151231257827021181583404541015625 2 3 4",
        "B1 1 2 3 4\r",
    };
    for (const char* line : lines)
        ExpectSame(line);
}

TEST(CNumbers, RandomDecimalsMatchTheCLibraryBitForBit)
{
    std::mt19937_64 random(12345);
    std::uniform_real_distribution<double> spread(-400, 400);
    char line[200];
    for (int i = 0; i < 20000; i++) {
        const int digits = int(random() % 18);
        std::snprintf(line, sizeof line, "G%dV %.*f %.*g %.*e %.*f", int(random() % 10), digits,
            spread(random), digits + 1, spread(random), digits, spread(random) * 1e-3, digits,
            spread(random));
        ExpectSame(line);
    }
}

TEST(CNumbers, LineEndsAtItsEndPointerOrAtANul)
{
    const std::string line = "G2 1 2 3 4 99";
    Fields f {};
    f.z = -1;
    // Only "G2 1 2 3" is inside the line: z keeps its value.
    EXPECT_EQ(ScanCatalogueData(line.data(), line.data() + 8, f.word, &f.m, &f.x, &f.y, &f.z), 4);
    EXPECT_EQ(f.y, 3);
    EXPECT_EQ(f.z, -1);

    const std::string withNul("G2 1 2\0 3 4", 11);
    f.y = f.z = -1;
    EXPECT_EQ(ScanCatalogueData(
                  withNul.data(), withNul.data() + withNul.size(), f.word, &f.m, &f.x, &f.y, &f.z),
        3);
    EXPECT_EQ(f.x, 2);
    EXPECT_EQ(f.y, -1);
}

TEST(CNumbers, NothingPastTheLineIsLookedAt)
{
    // A line whose last character starts a number, in a buffer that ends one byte after it:
    // a "0" there must not lead the scanner on to look for an "x" beyond the buffer.
    for (const char* tail : { "-", "", "." }) {
        std::string text = "K1V" + std::string(496, ' ') + tail;
        text.resize(500, ' ');
        const auto buffer = std::make_unique<char[]>(501);
        std::memcpy(buffer.get(), text.data(), 500);
        buffer[500] = '0';
        Fields f {};
        f.m = 7;
        EXPECT_EQ(
            ScanCatalogueData(buffer.get(), buffer.get() + 500, f.word, &f.m, &f.x, &f.y, &f.z), 1)
            << "tail '" << tail << "'";
        EXPECT_STREQ(f.word, "K1V");
        EXPECT_EQ(f.m, 7);
    }
    // The same for a number on its own that ends its buffer.
    const auto minus = std::make_unique<char[]>(1);
    minus[0] = '-';
    Fields f {};
    EXPECT_EQ(ScanCatalogueData(minus.get(), minus.get() + 1, f.word, &f.m, &f.x, &f.y, &f.z), 1);
    EXPECT_STREQ(f.word, "-");
}

TEST(CNumbers, ScanDoubleLikePercentLf)
{
    double v = -1;
    const char* next = nullptr;
    EXPECT_TRUE(ScanDouble("2V", &v, &next));
    EXPECT_EQ(v, 2);
    EXPECT_STREQ(next, "V");
    EXPECT_TRUE(ScanDouble(" 3.5III", &v, &next));
    EXPECT_EQ(v, 3.5);
    EXPECT_STREQ(next, "III");
    EXPECT_TRUE(ScanDouble("+7", &v));
    EXPECT_EQ(v, 7);
    EXPECT_TRUE(ScanDouble("0x1p3", &v));
    EXPECT_EQ(v, 8);
    v = -1;
    EXPECT_FALSE(ScanDouble("x", &v));
    EXPECT_FALSE(ScanDouble("", &v));
    EXPECT_FALSE(ScanDouble("+", &v));
    EXPECT_EQ(v, -1);
}

TEST(CNumbers, FormatDoubleWritesWhatScanDoubleReadsBack)
{
    char text[32];
    EXPECT_EQ(FormatDouble(text, sizeof text, "%.1f", 4.83), 3);
    EXPECT_STREQ(text, "4.8");
    FormatDouble(text, sizeof text, "%+.0f", -0.0);
    EXPECT_STREQ(text, "-0");
    FormatDouble(text, sizeof text, "%+.0f", 9.0);
    EXPECT_STREQ(text, "+9");
    for (const double value : { -16.716, 0.05, 1234.5678, -1e-7 }) {
        FormatDouble(text, sizeof text, "%.17g", value);
        double back = 0;
        ASSERT_TRUE(ScanDouble(text, &back)) << text;
        EXPECT_EQ(back, value) << text;
    }
    // Cut to the buffer, as snprintf does, and the whole length told.
    char small[4];
    EXPECT_EQ(FormatDouble(small, sizeof small, "%.3f", 12.5), 6);
    EXPECT_STREQ(small, "12.");
}

namespace {

// What strtod makes of text: its bits and where it stopped.
struct Strtod {
    uint64_t bits;
    size_t length;
};

Strtod ByStrtod(const std::string& text)
{
    char* end = nullptr;
    const double value = std::strtod(text.c_str(), &end);
    uint64_t bits;
    std::memcpy(&bits, &value, sizeof bits);
    return { bits, size_t(end - text.c_str()) };
}

// Reads text with the plain-decimal path; when it takes the text, the value must be strtod's
// to the bit, and the end the same. Returns whether it took it.
bool TakenAsStrtodReadsIt(const std::string& text)
{
    double value = -777;
    const char* end = ScanPlainDecimal(text.data(), text.data() + text.size(), &value);
    if (!end) {
        EXPECT_EQ(value, -777) << '"' << text << '"';
        return false;
    }
    const Strtod expected = ByStrtod(text);
    uint64_t bits;
    std::memcpy(&bits, &value, sizeof bits);
    EXPECT_EQ(bits, expected.bits) << '"' << text << "\" read as " << value;
    EXPECT_EQ(size_t(end - text.data()), expected.length) << '"' << text << '"';
    return true;
}

} // namespace

TEST(CNumbers, CatalogueDecimalsReadBitForBitAsStrtod)
{
    // Magnitudes and positions as the importer and the benchmarks write them, over every
    // scale a catalogue of the neighbourhood holds: every one takes the plain path.
    std::mt19937_64 random(20261124);
    char text[64];
    for (int i = 0; i < 200000; i++) {
        const double scale = std::pow(10.0, double(random() % 12) - 5);
        const double value = std::uniform_real_distribution<double>(-1, 1)(random) * scale;
        std::snprintf(text, sizeof text, "%.*f", int(random() % 10), value);
        ASSERT_TRUE(TakenAsStrtodReadsIt(text)) << text;
        std::snprintf(text, sizeof text, "%.3f", value);
        ASSERT_TRUE(TakenAsStrtodReadsIt(text)) << text;
        std::snprintf(text, sizeof text, "%.6f", value);
        ASSERT_TRUE(TakenAsStrtodReadsIt(text)) << text;
    }
}

TEST(CNumbers, RandomDigitStringsReadBitForBitAsStrtodOrNotAtAll)
{
    // Up to 25 digits with the point anywhere, or nowhere: long ones must be left to the
    // general reader, every other exactly as strtod reads it.
    std::mt19937_64 random(7);
    int taken = 0;
    for (int i = 0; i < 300000; i++) {
        std::string text = random() % 2 ? "-" : "";
        const int digits = 1 + int(random() % 25);
        const int point = int(random() % (digits + 2)) - 1; // -1: no point
        for (int d = 0; d < digits; d++) {
            if (d == point)
                text += '.';
            text += char('0' + random() % 10);
        }
        if (point == digits)
            text += '.';
        taken += TakenAsStrtodReadsIt(text);
    }
    EXPECT_GT(taken, 100000);
}

TEST(CNumbers, PlainDecimalEdgeCases)
{
    for (const char* text :
        { "0", "-0", "0.000", "-0.000", "1.", ".5", "-.5", "5.", "0.1", "0.2", "0.3",
            "9007199254740992", "900719925473.0992", "0.1234567890123456", "123456.1234567890",
            "-1797693.134862315", "0.000000000000000001", "1 2", "1\t", "12.5\n", "7\r" }) {
        EXPECT_TRUE(TakenAsStrtodReadsIt(text)) << text;
    }
    double value = 0;
    const std::string negativeZero = "-0.000";
    ScanPlainDecimal(negativeZero.data(), negativeZero.data() + negativeZero.size(), &value);
    EXPECT_TRUE(std::signbit(value));
    EXPECT_EQ(value, 0);

    // Everything else is the general readers' to read: nothing is stored.
    for (const char* text : { "", "-", ".", "-.", "+1", "1e5", "1E5", "0x10", "1,5", "1.5.2", "nan",
             "inf", "-inf", "1-", "9007199254740993", "4503599627370497.5", "2.2250738585072014",
             "123456789012345678901", "0.00000000000000000000001", "00000000000000000001.5", "--1",
             " 1", "1a" }) {
        EXPECT_FALSE(TakenAsStrtodReadsIt(text)) << '"' << text << '"';
    }
    // The end bounds the text: "12" of "123", the digits before a NUL.
    const char digits[] = "123";
    EXPECT_EQ(ScanPlainDecimal(digits, digits + 2, &value), digits + 2);
    EXPECT_EQ(value, 12);
    const std::string withNul("4.5\0"
                              "6",
        5);
    EXPECT_EQ(ScanPlainDecimal(withNul.data(), withNul.data() + withNul.size(), &value),
        withNul.data() + 3);
    EXPECT_EQ(value, 4.5);
}

TEST(CNumbers, PlainDecimalsNeverLookPastTheirEnd)
{
    // Digits to the very end of buffers of every length, each allocated to its size, so that
    // a read past the end is caught by the address sanitizer.
    for (size_t length = 1; length <= 24; length++) {
        const auto buffer = std::make_unique<char[]>(length);
        for (size_t i = 0; i < length; i++)
            buffer[i] = char('1' + i % 9);
        if (length > 2)
            buffer[1] = '.';
        double value = 0;
        const char* end = ScanPlainDecimal(buffer.get(), buffer.get() + length, &value);
        const std::string text(buffer.get(), length);
        if (end) {
            EXPECT_EQ(end, buffer.get() + length) << text;
            EXPECT_EQ(value, std::strtod(text.c_str(), nullptr)) << text;
        } else {
            EXPECT_GT(length, 17u) << text;
        }
    }
}

TEST(CNumbers, DigitsPastTheLineThatMayBeLoadedAreNotRead)
{
    // Lines cut at every length, each followed in its buffer by more digits: the reader may
    // load them eight at a time, and must read only the line, as sscanf reads it alone.
    std::mt19937_64 random(99);
    std::uniform_real_distribution<double> spread(-500, 500);
    char text[200];
    for (int i = 0; i < 2000; i++) {
        std::snprintf(text, sizeof text, "K%dV %.2f %.6f %.6f %.6f", int(random() % 10),
            spread(random) / 40, spread(random), spread(random), spread(random));
        const std::string whole = text;
        const size_t length = random() % (whole.size() + 1);
        const std::string line = whole.substr(0, length);
        const Fields f = OursFollowedBy(line, "123456789012345678");
        const Fields expected = Reference(line);
        ASSERT_EQ(f.count, expected.count) << '"' << line << '"';
        ASSERT_STREQ(f.word, expected.word) << '"' << line << '"';
        ASSERT_EQ(f.m, expected.m) << '"' << line << '"';
        ASSERT_EQ(f.x, expected.x) << '"' << line << '"';
        ASSERT_EQ(f.y, expected.y) << '"' << line << '"';
        ASSERT_EQ(f.z, expected.z) << '"' << line << '"';
    }
}

TEST(CNumbers, NumbersOfEveryShapeReadSixteenCharactersAtATimeMatchTheCLibrary)
{
    // Numbers of up to twenty digits with the point anywhere or nowhere, leading zeros, signs
    // and stray points, ended by blanks, NUL, letters or the line's end, after class words of
    // every length with control characters in them; each line followed in its buffer by more
    // text the reader may load and must not read.
    std::mt19937_64 random(2718);
    const auto pick = [&](const std::string& from) { return from[random() % from.size()]; };
    const auto number = [&] {
        std::string text;
        if (random() % 2 == 0)
            text += pick("-+-");
        const size_t digits = random() % 21;
        const size_t point = random() % (digits + 2); // digits + 1: no point
        for (size_t i = 0; i < digits; i++) {
            if (i == point)
                text += '.';
            text += random() % 4 == 0 ? '0' : char('0' + random() % 10);
        }
        if (point == digits)
            text += '.';
        if (random() % 30 == 0)
            text += pick(".e5x");
        return text;
    };
    for (int i = 0; i < 40000; i++) {
        std::string line(random() % 20, 'K');
        for (char& c : line)
            c = pick("OBAFGKMVI0123456789.\x01\x1f\x7f\xff");
        for (int field = 0; field < 4; field++)
            line += std::string(1 + random() % 2, pick("    \t")) + number();
        line.resize(random() % 8 == 0 ? random() % (line.size() + 1) : line.size());
        if (!line.empty() && random() % 40 == 0)
            line[random() % line.size()] = '\0';
        std::string after(random() % 24, ' ');
        for (char& c : after)
            c = pick("0123456789. -e");
        ExpectFields(Reference(line), OursFollowedBy(line, after), line);
        if (HasFailure())
            return;
    }
}
