#include "TempCatalogue.h"

#include "catalog/Star.h"
#include "catalog/Universe.h"
#include "platform/ExecutablePath.h"
#include "render/SpectralTables.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <memory>
#include <string>
#include <vector>

namespace {

// Every test reads with the spectral tables in place, as the program does.
class UniverseTest : public ::testing::Test {
protected:
    ScopedSpectralTables tables;

    static const ColorTable* Table(int n) { return gSpectralCTable + n; }
};

} // namespace

TEST_F(UniverseTest, StarsAtOnePositionInARowFormOneSystem)
{
    const TempCatalogue file("Alpha A\nG2V 4.38 1 2 3\nAlpha B\nK1V 5.71 1 2 3\n");
    const Universe u(file.PathString().c_str(), 1000000, 5000);
    ASSERT_EQ(u.CountItems(), 1);
    const StarSystem* s = u.SystemAt(0);
    EXPECT_STREQ(s->GetName(), "Alpha A");
    ASSERT_EQ(s->CountItems(), 2);
    EXPECT_STREQ(s->StarAt(0)->GetName(), "Alpha A");
    EXPECT_STREQ(s->StarAt(1)->GetName(), "Alpha B");
    EXPECT_DOUBLE_EQ(s->luminosity, std::pow(2.512, 4.7 - 4.38));
}

TEST_F(UniverseTest, TheSameStarsSeparatedByAnotherPositionFormThreeSystems)
{
    const TempCatalogue file(
        "Alpha A\nG2V 4.38 1 2 3\nElsewhere\nM5 15 9 9 9\nAlpha B\nK1V 5.71 1 2 3\n");
    const Universe u(file.PathString().c_str(), 1000000, 5000);
    ASSERT_EQ(u.CountItems(), 3);
    for (int i = 0; i < 3; i++)
        EXPECT_EQ(u.SystemAt(i)->CountItems(), 1);
    EXPECT_STREQ(u.SystemAt(2)->GetName(), "Alpha B");
}

TEST_F(UniverseTest, AFirstRecordAtTheSentinelStillOpensASystem)
{
    const TempCatalogue file("Far\nG2 1 0 0 314000\nFar B\nK2 2 0 0 314000\n");
    const Universe u(file.PathString().c_str(), 1000000, 5000);
    ASSERT_EQ(u.CountItems(), 1);
    EXPECT_EQ(u.SystemAt(0)->CountItems(), 2);
    EXPECT_EQ(u.SystemAt(0)->position.z, 314000);
}

TEST_F(UniverseTest, LuminosityFollowsTheMagnitudeOfThePrimary)
{
    const TempCatalogue file("Sun-like\nG2V 4.7 1 0 0\nBright\nA0 -0.3 2 0 0\n");
    const Universe u(file.PathString().c_str(), 1000000, 5000);
    ASSERT_EQ(u.CountItems(), 2);
    EXPECT_DOUBLE_EQ(u.SystemAt(0)->luminosity, 1.0);
    EXPECT_DOUBLE_EQ(u.SystemAt(1)->luminosity, std::pow(2.512, 5.0));
    EXPECT_NEAR(u.SystemAt(1)->luminosity, 100.0, 0.1);
}

TEST_F(UniverseTest, ColourTableFollowsTheHarvardClass)
{
    const TempCatalogue file("o\nO5 0 1 0 0\nb\nB2 0 2 0 0\na\nA1 0 3 0 0\nf\nF5 0 4 0 0\n"
                             "g\nG2 0 5 0 0\nk\nK0 0 6 0 0\nm\nM4 0 7 0 0\n"
                             "w\nWN7 0 8 0 0\nr\nR3 0 9 0 0\nn\nN0 0 10 0 0\nnone\nIII 0 11 0 0\n");
    const Universe u(file.PathString().c_str(), 1000000, 5000);
    ASSERT_EQ(u.CountItems(), 11);
    for (int i = 0; i < 7; i++)
        EXPECT_EQ(u.SystemAt(i)->colorTable, Table(i)) << u.SystemAt(i)->GetName();
    // W, R, N and no class are drawn with the G table; the star keeps its own class.
    for (int i = 7; i < 11; i++)
        EXPECT_EQ(u.SystemAt(i)->colorTable, Table(4)) << u.SystemAt(i)->GetName();
    EXPECT_EQ(u.SystemAt(7)->StarAt(0)->spectralClass.harvardClass, kClassW);
    EXPECT_EQ(u.SystemAt(8)->StarAt(0)->spectralClass.harvardClass, kClassR);
    EXPECT_EQ(u.SystemAt(9)->StarAt(0)->spectralClass.harvardClass, kClassN);
    EXPECT_EQ(u.SystemAt(10)->StarAt(0)->spectralClass.harvardClass, kNoClass);
    EXPECT_STREQ(u.SystemAt(7)->StarAt(0)->GetSpectralClassString(), "WN7");
}

TEST_F(UniverseTest, WithoutSpectralTablesSystemsHaveNoTable)
{
    ColorTable* saved = gSpectralCTable;
    gSpectralCTable = nullptr;
    const TempCatalogue file("g\nG2 0 5 0 0\n");
    const Universe u(file.PathString().c_str(), 1000000, 5000);
    gSpectralCTable = saved;
    ASSERT_EQ(u.CountItems(), 1);
    EXPECT_EQ(u.SystemAt(0)->colorTable, nullptr);
}

TEST_F(UniverseTest, MaxStarsCountsRecordsNotSystems)
{
    const TempCatalogue file("A\nG2 1 1 1 1\nB\nG2 1 1 1 1\nC\nG2 1 2 2 2\n");
    const Universe one(file.PathString().c_str(), 1, 5000);
    ASSERT_EQ(one.CountItems(), 1);
    EXPECT_EQ(one.SystemAt(0)->CountItems(), 1);
    const Universe two(file.PathString().c_str(), 2, 5000);
    ASSERT_EQ(two.CountItems(), 1);
    EXPECT_EQ(two.SystemAt(0)->CountItems(), 2);
}

TEST_F(UniverseTest, NinetyCharacterNameKeepsItsFirstSeventyNine)
{
    std::string name;
    for (int i = 0; i < 90; i++)
        name += char('a' + i % 26);
    const TempCatalogue file(name + "\nG2 1 1 1 1\n");
    const Universe u(file.PathString().c_str(), 1000000, 5000);
    ASSERT_EQ(u.CountItems(), 1);
    EXPECT_EQ(std::string(u.SystemAt(0)->GetName()), name.substr(0, 79));
    EXPECT_EQ(std::string(u.SystemAt(0)->StarAt(0)->GetName()), name.substr(0, 79));
}

TEST_F(UniverseTest, MissingFieldsKeepThePreviousRecordsValues)
{
    const TempCatalogue file("First\nK3V 6.5 1 2 3\nShort\nM4 11.2 7\nEmpty\n\n");
    const Universe u(file.PathString().c_str(), 1000000, 5000);
    ASSERT_EQ(u.CountItems(), 2);
    const StarSystem* second = u.SystemAt(1);
    EXPECT_EQ(second->position.x, 7);
    EXPECT_EQ(second->position.y, 2);
    EXPECT_EQ(second->position.z, 3);
    ASSERT_EQ(second->CountItems(), 2);
    EXPECT_STREQ(second->StarAt(0)->GetSpectralClassString(), "M4");
    EXPECT_EQ(second->StarAt(0)->magnitude, 11.2);
    // An empty data line reads nothing: the star repeats everything of the one before it.
    EXPECT_STREQ(second->StarAt(1)->GetName(), "Empty");
    EXPECT_STREQ(second->StarAt(1)->GetSpectralClassString(), "M4");
    EXPECT_EQ(second->StarAt(1)->magnitude, 11.2);
}

TEST_F(UniverseTest, AnUnreadableNumberStopsTheLineThere)
{
    const TempCatalogue file("First\nK3V 6.5 1 2 3\nBad\nG0 4.5 x 5 6\n");
    const Universe u(file.PathString().c_str(), 1000000, 5000);
    ASSERT_EQ(u.CountItems(), 1); // x, y and z keep (1, 2, 3)
    ASSERT_EQ(u.SystemAt(0)->CountItems(), 2);
    EXPECT_EQ(u.SystemAt(0)->StarAt(1)->magnitude, 4.5);
    EXPECT_STREQ(u.SystemAt(0)->StarAt(1)->GetSpectralClassString(), "G0");
}

TEST_F(UniverseTest, NumbersInEveryFormTheCLibraryReads)
{
    const TempCatalogue file("Forms\nB1 +1.5e0 0x10 -.25 1E2\n");
    const Universe u(file.PathString().c_str(), 1000000, 5000);
    ASSERT_EQ(u.CountItems(), 1);
    EXPECT_EQ(u.SystemAt(0)->StarAt(0)->magnitude, 1.5);
    EXPECT_EQ(u.SystemAt(0)->position.x, 16);
    EXPECT_EQ(u.SystemAt(0)->position.y, -0.25);
    EXPECT_EQ(u.SystemAt(0)->position.z, 100);
}

TEST_F(UniverseTest, LastRecordWithoutAFinalLineFeed)
{
    const TempCatalogue file("A\nG2 1 1 1 1\nB\nK5 2 2 2 2");
    const Universe u(file.PathString().c_str(), 1000000, 5000);
    ASSERT_EQ(u.CountItems(), 2);
    EXPECT_EQ(u.SystemAt(1)->position.z, 2);
    EXPECT_STREQ(u.SystemAt(1)->StarAt(0)->GetSpectralClassString(), "K5");
}

TEST_F(UniverseTest, MissingOrEmptyFileGivesAnEmptyUniverse)
{
    const Universe missing("/nonexistent/nightdome/stars.dat", 1000000, 5000);
    EXPECT_EQ(missing.CountItems(), 0);
    const TempCatalogue empty("");
    EXPECT_EQ(Universe(empty.PathString().c_str(), 1000000, 5000).CountItems(), 0);
    const Universe none(nullptr, 1000000, 5000);
    EXPECT_EQ(none.CountItems(), 0);
}

TEST_F(UniverseTest, RelativeNamesAreFoundBesideTheExecutable)
{
    const TempCatalogue file("Beside\nF5 3 4 5 6\n", ExecutableDirectory());
    const std::string name = file.Path().filename().string();
    const Universe u(name.c_str(), 1000000, 5000);
    ASSERT_EQ(u.CountItems(), 1);
    EXPECT_STREQ(u.SystemAt(0)->GetName(), "Beside");
}

// A catalogue with every rule at once: multiple stars, a 90-character name, a 600-character
// line, a record with three fields and no final line feed.
TEST_F(UniverseTest, AWholeCatalogueReadsIntoExactlyTheseSystems)
{
    const std::string name90 = "HD 128620 " + std::string(80, 'x');
    // The first 500 characters of the long line are a name line; the 501st ('#') is dropped
    // as if it were a line feed; the remaining 99 are read as that record's data line.
    const std::string head = "Long " + std::string(495, 'L');
    std::string tail = "K5 7.5 3.5 -0.75 2.3";
    tail += std::string(99 - tail.size(), ' ');
    const std::string line600 = head + "#" + tail;
    ASSERT_EQ(line600.size(), 600u);

    const std::string text = "The Sun\nG2V 4.83 0 0 0\n"
                             "Rigil Kentaurus\nG2V 4.38 -0.495 -1.217 -0.414\n"
                             "Toliman\nK1V 5.71 -0.495 -1.217 -0.414\n"
        + name90 + "\nA1V 1.42 -1.6 -0.75 2.3\n" + "Three Fields\nM4 11.2 3.5\n" + line600 + "\n"
        + "Barnard's Star\nM4Ve 13.2 -0.01 1.03 -1.8\n" + "Last Star\nB9.5 -0.3 5 5 5";
    const TempCatalogue file(text);
    const Universe u(file.PathString().c_str(), 1000000, 5000);

    ASSERT_EQ(u.CountItems(), 6);
    auto lum = [](double m) { return std::pow(2.512, 4.7 - m); };

    const StarSystem* sun = u.SystemAt(0);
    EXPECT_STREQ(sun->GetName(), "The Sun");
    EXPECT_EQ(sun->position.x, 0);
    EXPECT_EQ(sun->CountItems(), 1);
    EXPECT_DOUBLE_EQ(sun->luminosity, lum(4.83));
    EXPECT_EQ(sun->colorTable, Table(4));

    const StarSystem* alpha = u.SystemAt(1);
    EXPECT_STREQ(alpha->GetName(), "Rigil Kentaurus");
    ASSERT_EQ(alpha->CountItems(), 2);
    EXPECT_STREQ(alpha->StarAt(1)->GetName(), "Toliman");
    EXPECT_EQ(alpha->StarAt(1)->magnitude, 5.71);
    EXPECT_STREQ(alpha->StarAt(1)->GetSpectralClassString(), "K1V");
    EXPECT_DOUBLE_EQ(alpha->luminosity, lum(4.38)); // the primary's, not the companion's
    EXPECT_EQ(alpha->position.y, -1.217);
    EXPECT_EQ(alpha->colorTable, Table(4));

    const StarSystem* sirius = u.SystemAt(2);
    EXPECT_EQ(std::string(sirius->GetName()), name90.substr(0, 79));
    EXPECT_DOUBLE_EQ(sirius->luminosity, lum(1.42));
    EXPECT_EQ(sirius->colorTable, Table(2));

    // Three fields: y and z carry over from the record before.
    const StarSystem* three = u.SystemAt(3);
    EXPECT_STREQ(three->GetName(), "Three Fields");
    EXPECT_EQ(three->position.x, 3.5);
    EXPECT_EQ(three->position.y, -0.75);
    EXPECT_EQ(three->position.z, 2.3);
    EXPECT_EQ(three->colorTable, Table(6));
    EXPECT_DOUBLE_EQ(three->luminosity, lum(11.2));
    // The split long line lands at the same position and joins it.
    ASSERT_EQ(three->CountItems(), 2);
    EXPECT_EQ(std::string(three->StarAt(1)->GetName()), head.substr(0, 79));
    EXPECT_STREQ(three->StarAt(1)->GetSpectralClassString(), "K5");
    EXPECT_EQ(three->StarAt(1)->magnitude, 7.5);

    const StarSystem* barnard = u.SystemAt(4);
    EXPECT_STREQ(barnard->GetName(), "Barnard's Star");
    EXPECT_EQ(barnard->position.z, -1.8);
    EXPECT_EQ(barnard->colorTable, Table(6));

    const StarSystem* last = u.SystemAt(5);
    EXPECT_STREQ(last->GetName(), "Last Star");
    EXPECT_EQ(last->position.x, 5);
    EXPECT_NEAR(last->luminosity, 100.0, 0.1);
    EXPECT_EQ(last->colorTable, Table(1));
    EXPECT_DOUBLE_EQ(last->StarAt(0)->spectralClass.decimalClass, 9.5);

    int stars = 0;
    for (int i = 0; i < u.CountItems(); i++)
        stars += u.SystemAt(i)->CountItems();
    EXPECT_EQ(stars, 8);
}

TEST_F(UniverseTest, LinesOfExactlyFiveHundredCharactersAreWhole)
{
    const std::string name500 = std::string(500, 'N');
    const TempCatalogue file(name500 + "\nG2 1 1 1 1\nNext\nK2 2 2 2 2\n");
    const Universe u(file.PathString().c_str(), 1000000, 5000);
    ASSERT_EQ(u.CountItems(), 2);
    EXPECT_STREQ(u.SystemAt(1)->GetName(), "Next");
}

TEST_F(UniverseTest, RecordsAcrossTheReadWindowKeepTheirPairing)
{
    // Enough records that the reader's window slides many times, with varied line lengths.
    std::string text;
    const int count = 60000;
    for (int i = 0; i < count; i++) {
        text += "Star " + std::to_string(i) + std::string(i % 37, '.') + "\n";
        text += "G" + std::to_string(i % 10) + "V " + std::to_string(i % 20) + " "
            + std::to_string(i) + ".25 " + std::to_string(-i) + " 0.5\n";
    }
    const TempCatalogue file(text);
    const Universe u(file.PathString().c_str(), 1000000, 5000);
    ASSERT_EQ(u.CountItems(), count);
    for (int i = 0; i < count; i += 1013) {
        const StarSystem* s = u.SystemAt(i);
        EXPECT_EQ(std::string(s->GetName()).substr(0, 5 + std::to_string(i).size()),
            "Star " + std::to_string(i));
        EXPECT_EQ(s->position.x, i + 0.25);
        EXPECT_EQ(s->position.y, -i);
        EXPECT_EQ(s->StarAt(0)->spectralClass.decimalClass, i % 10);
    }
}

TEST_F(UniverseTest, ALineEndingAtTheWindowsLastByteIsReadWithinIt)
{
    // The reading window is filled whole when the file is at least as long as it: a last
    // record whose data line ends in "-" and whose dropped 501st character, "0", is the last
    // byte of the file then ends the window exactly, for files of every length around it.
    const std::string data = "K1V" + std::string(496, ' ') + "-";
    const std::string edge = std::string(500, 'N') + "\n" + data + "0";
    for (size_t size = kCatalogueWindow + 990; size <= kCatalogueWindow + 1010; size++) {
        // Padding records at 1 1 1, the first with a name long enough to make the size exact.
        const size_t padding = size - edge.size();
        const size_t records = (padding - 200) / 14;
        const size_t first = padding - 14 * records - 13;
        std::string text = std::string(first, 'F') + "\nG2V 1 1 1 1\n";
        text.reserve(size);
        for (size_t i = 0; i < records; i++)
            text += "P\nG2V 1 1 1 1\n";
        text += edge;
        ASSERT_EQ(text.size(), size);

        const TempCatalogue file(text);
        const Universe u(file.PathString().c_str(), 1000000, 5000);
        // The edge record's magnitude and position cannot be read: it keeps those of the
        // record before it and joins its system.
        ASSERT_EQ(u.CountItems(), 1) << size;
        const StarSystem* s = u.SystemAt(0);
        ASSERT_EQ(s->CountItems(), int32_t(records + 2));
        EXPECT_EQ(std::string(s->StarAt(int32_t(records) + 1)->GetName()), std::string(79, 'N'));
        EXPECT_EQ(s->StarAt(int32_t(records) + 1)->spectralClass.harvardClass, kClassK);
    }
}

// The same catalogue with line feeds and with carriage return and line feed.
std::string WithCrLf(const std::string& text)
{
    std::string out;
    for (char c : text) {
        if (c == '\n')
            out += '\r';
        out += c;
    }
    return out;
}

TEST_F(UniverseTest, CarriageReturnsBeforeLineFeedsAreLineEnds)
{
    const std::string text = "Sirius\nA1V 1.45 -0.49 2.48 -0.76\n"
                             "Rigil Kentaurus\nG2V 4.38 -0.5 -0.41 -1.18\n"
                             "Toliman\nK1V 5.71 -0.5 -0.41 -1.18\n"
        + std::string(499, 'L') + "\nM5 11 1 1 1\n" + std::string(500, 'W')
        + "\nK0 9 2 2 2\nLast\nG0 4 3 3 3";
    const TempCatalogue lf(text), crlf(WithCrLf(text));
    const Universe a(lf.PathString().c_str(), 1000000, 5000);
    const Universe b(crlf.PathString().c_str(), 1000000, 5000);
    ASSERT_EQ(a.CountItems(), 5);
    ASSERT_EQ(b.CountItems(), a.CountItems());
    EXPECT_STREQ(b.SystemAt(0)->GetName(), "Sirius");
    EXPECT_STREQ(b.SystemAt(1)->StarAt(1)->GetName(), "Toliman");
    EXPECT_STREQ(b.SystemAt(4)->GetName(), "Last");
    for (int32_t i = 0; i < a.CountItems(); i++) {
        const StarSystem* sa = a.SystemAt(i);
        const StarSystem* sb = b.SystemAt(i);
        EXPECT_STREQ(sb->GetName(), sa->GetName()) << i;
        EXPECT_EQ(sb->position.x, sa->position.x) << i;
        EXPECT_EQ(sb->position.y, sa->position.y) << i;
        EXPECT_EQ(sb->position.z, sa->position.z) << i;
        ASSERT_EQ(sb->CountItems(), sa->CountItems()) << i;
        for (int32_t k = 0; k < sa->CountItems(); k++) {
            EXPECT_STREQ(sb->StarAt(k)->GetName(), sa->StarAt(k)->GetName());
            EXPECT_STREQ(
                sb->StarAt(k)->GetSpectralClassString(), sa->StarAt(k)->GetSpectralClassString());
            EXPECT_EQ(sb->StarAt(k)->GetMagnitude(), sa->StarAt(k)->GetMagnitude());
        }
    }
}

TEST_F(UniverseTest, ALoneCarriageReturnIsNoLineEnd)
{
    // Only CR LF is a line end: a carriage return inside a line stays part of it.
    const TempCatalogue file("Odd\rName\r\nG2V 1 1 1 1\r\n");
    const Universe u(file.PathString().c_str(), 1000000, 5000);
    ASSERT_EQ(u.CountItems(), 1);
    EXPECT_STREQ(u.SystemAt(0)->GetName(), "Odd\rName");
}

TEST(GeneratedUniverse, CountAndPositionsFollowTheGenerator)
{
    // pi x 10^3 x 1 x 0.01 = 31.4: 31 systems.
    const Universe u(10.0, kSparseDensity, 50, Random(1, 4096, 150889, 714025));
    ASSERT_EQ(u.CountItems(), 31);
    // Seed 1 draws 154985, 201224, 379543, ...: remainders 14985, 1224, 19543 by 20000.
    const StarSystem* first = u.SystemAt(0);
    EXPECT_NEAR(first->position.x, 14985 * 0.0001 * 10 - 10, 1e-12);
    EXPECT_NEAR(first->position.y, 1224 * 0.0001 * 10 - 10, 1e-12);
    EXPECT_NEAR(first->position.z, 19543 * 0.0001 * 10 - 10, 1e-12);
    for (int i = 0; i < u.CountItems(); i++) {
        const StarSystem* s = u.SystemAt(i);
        EXPECT_STREQ(s->GetName(), "");
        EXPECT_EQ(s->CountItems(), 0);
        EXPECT_EQ(s->luminosity, 1.0);
        EXPECT_EQ(s->colorTable, nullptr);
    }
}

TEST(GeneratedUniverse, NegativeDrawsReachThreeTimesTheRadiusBelow)
{
    const Universe u(20.0, kDenseDensity, 5000, Random(600000, 4096, 150889, 714025));
    ASSERT_EQ(u.CountItems(), int(3.141592653589793 * 8000 * 10 * 0.01));
    double lowest = 0;
    for (int i = 0; i < u.CountItems(); i++) {
        const SVector& p = u.SystemAt(i)->position;
        for (double c : { p.x, p.y, p.z }) {
            EXPECT_GT(c, -3 * 20.0);
            EXPECT_LT(c, 20.0);
            lowest = std::min(lowest, c);
        }
    }
    EXPECT_LT(lowest, -20.0); // the generator went negative somewhere
}

TEST(GeneratedUniverse, GenerateMakesExactlyTheCountAskedFor)
{
    for (int32_t count : { 0, 1, 31, 1000, 12345 }) {
        std::unique_ptr<Universe> u(
            Universe::Generate(count, kSparseDensity, 5000, Random(1, 4096, 150889, 714025)));
        EXPECT_EQ(u->CountItems(), count);
    }
    std::unique_ptr<Universe> none(Universe::Generate(-5, kSparseDensity, 5000));
    EXPECT_EQ(none->CountItems(), 0);
}

TEST(GeneratedUniverse, GenerateKeepsTheDensityAndTheDraws)
{
    // 31 systems at sparse density is the cube of radius 10 (pi x 10^3 x 0.01 = 31.4), give or
    // take the truncation: the radius chosen is cbrt(31 / (pi x 0.01)) = 9.955.
    const double radius = std::cbrt(31 / (3.141592653589793 * 0.01));
    std::unique_ptr<Universe> u(
        Universe::Generate(31, kSparseDensity, 50, Random(1, 4096, 150889, 714025)));
    ASSERT_EQ(u->CountItems(), 31);
    // The same draws as the constructor: 14985, 1224, 19543 for the first system.
    const StarSystem* first = u->SystemAt(0);
    EXPECT_NEAR(first->position.x, 14985 * 0.0001 * radius - radius, 1e-12);
    EXPECT_NEAR(first->position.y, 1224 * 0.0001 * radius - radius, 1e-12);
    EXPECT_NEAR(first->position.z, 19543 * 0.0001 * radius - radius, 1e-12);
    const Universe same(10.0, kSparseDensity, 50, Random(1, 4096, 150889, 714025));
    for (int i = 0; i < 31; i++) {
        const SVector& p = u->SystemAt(i)->position;
        const SVector& q = same.SystemAt(i)->position;
        EXPECT_NEAR(p.x / radius, q.x / 10.0, 1e-12) << i;
        EXPECT_NEAR(p.z / radius, q.z / 10.0, 1e-12) << i;
        EXPECT_STREQ(u->SystemAt(i)->GetName(), "");
        EXPECT_EQ(u->SystemAt(i)->CountItems(), 0);
    }
}

TEST_F(UniverseTest, ReadingSaysWhenItStoppedAtTheLimit)
{
    const TempCatalogue file("A\nG2 1 1 1 1\nB\nG2 1 1 1 1\nC\nG2 1 2 2 2\n");
    const auto read = [&](int32_t maxStars, Universe* universe) {
        std::unique_ptr<std::FILE, int (*)(std::FILE*)> in(
            std::fopen(file.PathString().c_str(), "rb"), &std::fclose);
        return ReadCatalogue(in.get(), maxStars, universe);
    };
    Universe two(5000), three(5000), more(5000);
    EXPECT_TRUE(read(2, &two)); // C is left
    EXPECT_EQ(two.CountItems(), 1);
    EXPECT_FALSE(read(3, &three)); // exactly the file
    EXPECT_EQ(three.CountItems(), 2);
    EXPECT_FALSE(read(1000000, &more));
    EXPECT_EQ(more.CountItems(), 2);
}

namespace {

// Reads text through the reader with a window of window bytes and returns what it reported.
CatalogueReport ReadText(const std::string& text, Universe* universe,
    size_t window = kCatalogueWindow, int32_t maxStars = 1000000)
{
    std::string copy = text;
    std::unique_ptr<std::FILE, int (*)(std::FILE*)> in(
        fmemopen(copy.data(), copy.size(), "rb"), &std::fclose);
    CatalogueReport report;
    report.malformed = -1; // overwritten by every reading
    ReadCatalogue(in.get(), maxStars, universe, window, &report);
    return report;
}

// n records "Star i" at (i, 0, 0).
std::string GoodRecords(int first, int n)
{
    std::string text;
    for (int i = first; i < first + n; i++)
        text += "Star " + std::to_string(i) + "\nG2V 4.8 " + std::to_string(i) + " 0 0\n";
    return text;
}

} // namespace

TEST_F(UniverseTest, AWellMadeCatalogueReportsNothing)
{
    Universe u(5000);
    const CatalogueReport report = ReadText(GoodRecords(1, 20), &u);
    EXPECT_EQ(u.CountItems(), 20);
    EXPECT_TRUE(report.Clean());
    EXPECT_EQ(report, CatalogueReport());
}

TEST_F(UniverseTest, ManySystemsFollowThoseAlreadyThereInFileOrderAndNothingElse)
{
    // More systems than the reader makes room for at once, several times over and not a
    // multiple of it, after systems another reading left: each in its place, no empty one.
    Universe u(5000);
    ReadText(GoodRecords(0, 3), &u);
    ReadText(GoodRecords(3, 10000), &u);
    ASSERT_EQ(u.CountItems(), 10003);
    for (int32_t i = 0; i < u.CountItems(); i++) {
        ASSERT_NE(u.SystemAt(i), nullptr) << i;
        ASSERT_EQ(u.SystemAt(i)->position.x, i) << i;
        ASSERT_EQ(u.SystemAt(i)->CountItems(), 1) << i;
    }

    // A NUL after those runs takes out what this reading added, and only that.
    ReadText(GoodRecords(10003, 9000) + std::string(1, '\0'), &u, 4096);
    EXPECT_EQ(u.CountItems(), 10003);
    EXPECT_EQ(u.SystemAt(10002)->position.x, 10002);
}

TEST_F(UniverseTest, AFileHoldingNulBytesIsNoCatalogue)
{
    // A program's first bytes: without the refusal its first system would be named "\x7f" "ELF".
    std::string elf("\x7f"
                    "ELF\x02\x01\x01",
        7);
    elf += std::string(9, '\0') + "\x03 stuff\nmore\n";
    Universe program(5000);
    CatalogueReport report = ReadText(elf, &program);
    EXPECT_TRUE(program.IsEmpty());
    EXPECT_TRUE(report.notText);
    EXPECT_FALSE(report.Clean());

    // Zeros only: without the refusal every 1002 of them would be a phantom star.
    Universe zeros(5000);
    report = ReadText(std::string(200000, '\0'), &zeros, 4096);
    EXPECT_TRUE(zeros.IsEmpty());
    EXPECT_TRUE(report.notText);

    // Good records first, one NUL far behind them and beyond the first window: still refused,
    // and what was read before it is taken out again.
    Universe late(5000);
    const std::string good = GoodRecords(1, 3000);
    report = ReadText(good + std::string(1, '\0') + "\n", &late, 4096);
    EXPECT_TRUE(late.IsEmpty());
    EXPECT_TRUE(report.notText);

    // Systems already in the universe stay.
    Universe kept(5000);
    ReadText(GoodRecords(1, 2), &kept);
    report = ReadText(std::string("A\nG2 1 1 1 1\0", 13), &kept);
    EXPECT_TRUE(report.notText);
    EXPECT_EQ(kept.CountItems(), 2);

    // The constructor reading a file by its name refuses it the same way.
    const TempCatalogue file(elf);
    const Universe named(file.PathString().c_str(), 1000000, 5000);
    EXPECT_TRUE(named.IsEmpty());
}

TEST_F(UniverseTest, ANameLongerThanALineIsReportedWithTheRecordsItShifts)
{
    // Two good records, a name of 5000 characters on line 5, then three records more.
    const std::string text
        = GoodRecords(1, 2) + std::string(5000, 'N') + "\nG2V 4.8 3 0 0\n" + GoodRecords(4, 3);
    Universe u(5000);
    const CatalogueReport report = ReadText(text, &u);
    EXPECT_EQ(report.malformedLine, 5);
    EXPECT_EQ(report.cause, CatalogueReport::kLongName);
    // Read as ever: the long line gives ten pieces of 500 characters (each followed by a
    // dropped one) read as name, data, name, ..., and then every later line pairs with the one
    // after it, so that no record from line 5 on is whole: 5 from the long line, 4 after it.
    EXPECT_EQ(report.malformed, 9);
    EXPECT_EQ(report.nonFinite, 0);
    ASSERT_GE(u.CountItems(), 2);
    EXPECT_STREQ(u.SystemAt(1)->GetName(), "Star 2");
    EXPECT_EQ(std::string(u.SystemAt(1)->StarAt(1)->GetName()), std::string(79, 'N'));
    // A data line as name: the shift reads "Star 4" as a class.
    const StarSystem* last = u.SystemAt(u.CountItems() - 1);
    EXPECT_STREQ(last->StarAt(last->CountItems() - 1)->GetSpectralClassString(), "Star");
}

TEST_F(UniverseTest, ADataLineLongerThanALineAndMissingFieldsAreReported)
{
    Universe longData(5000);
    CatalogueReport report = ReadText(GoodRecords(1, 1) + "Long\nG2V 1 2 3 4"
            + std::string(600, ' ') + "x\n" + "Next\nK2 1 1 1 1\n",
        &longData);
    EXPECT_EQ(report.cause, CatalogueReport::kLongData);
    EXPECT_EQ(report.malformedLine, 4);
    EXPECT_GE(report.malformed, 1);

    // A data line with three fields on line 4 and an empty one on line 8.
    Universe missing(5000);
    report = ReadText(
        GoodRecords(1, 1) + "Short\nM4 11.2 7\n" + GoodRecords(2, 1) + "Empty\n\n", &missing);
    EXPECT_EQ(report.cause, CatalogueReport::kMissingFields);
    EXPECT_EQ(report.malformedLine, 4);
    EXPECT_EQ(report.malformed, 2);
    // Still read as ever: the missing fields keep the record before's values.
    ASSERT_EQ(missing.CountItems(), 3);
    EXPECT_EQ(missing.SystemAt(1)->position.y, 0);
}

TEST_F(UniverseTest, NumbersThatAreNotFiniteReadAsZero)
{
    const std::string text = GoodRecords(1, 1) + "Nan\nG2V nan 1 2 3\n" + "Inf\nK0 1 inf 5 6\n"
        + "Huge\nM0 2 7 1e400 -INFINITY\n" + GoodRecords(5, 1);
    Universe u(5000);
    const CatalogueReport report = ReadText(text, &u);
    EXPECT_EQ(report.nonFinite, 3);
    EXPECT_EQ(report.nonFiniteLine, 4);
    EXPECT_EQ(report.malformed, 0);
    ASSERT_EQ(u.CountItems(), 5);
    EXPECT_EQ(u.SystemAt(1)->StarAt(0)->magnitude, 0);
    EXPECT_EQ(u.SystemAt(1)->luminosity, SolarLuminosity(0));
    EXPECT_EQ(u.SystemAt(2)->position.x, 0);
    EXPECT_EQ(u.SystemAt(2)->position.y, 5);
    EXPECT_EQ(u.SystemAt(3)->position.x, 7);
    EXPECT_EQ(u.SystemAt(3)->position.y, 0);
    EXPECT_EQ(u.SystemAt(3)->position.z, 0);
    for (int32_t i = 0; i < u.CountItems(); i++) {
        EXPECT_TRUE(std::isfinite(u.SystemAt(i)->luminosity)) << i;
        EXPECT_TRUE(std::isfinite(u.SystemAt(i)->position.Magnitude())) << i;
    }
}

TEST_F(UniverseTest, NumbersFarOutOfRangeAreKeptAndReported)
{
    const std::string text = GoodRecords(1, 2) + "Far\nG2V 4 1e308 0 0\n"
        + "Bright\nO5 -250 1 1 1\n" + "Edge\nG2V 100 1e6 -1e6 1e6\n";
    Universe u(5000);
    const CatalogueReport report = ReadText(text, &u);
    EXPECT_EQ(report.outOfRange, 2);
    EXPECT_EQ(report.outOfRangeLine, 6);
    EXPECT_EQ(report.nonFinite, 0);
    ASSERT_EQ(u.CountItems(), 5);
    EXPECT_EQ(u.SystemAt(2)->position.x, 1e308);
    EXPECT_EQ(u.SystemAt(3)->StarAt(0)->magnitude, -250);
}

TEST_F(UniverseTest, TheReportIsTheSameThroughAnyWindow)
{
    std::string text = GoodRecords(1, 400) + "Nan\nG2V nan 1 2 3\n" + std::string(1200, 'L') + "\n"
        + GoodRecords(500, 300) + "Far\nG2 1 2e7 0 0\n";
    Universe whole(5000);
    const CatalogueReport expected = ReadText(text, &whole, text.size() + 1);
    EXPECT_GT(expected.malformed, 300);
    EXPECT_EQ(expected.nonFinite, 1);
    // The shifted pairing reads "Star 500" to "Star 799" as class "Star" and magnitudes 500 to
    // 799; the last two records, read from "Far" and an empty line, keep magnitude 799.
    EXPECT_EQ(expected.outOfRange, 300 + 2);
    for (size_t window : { size_t(1), size_t(97), size_t(1003), size_t(4096) }) {
        Universe u(5000);
        EXPECT_EQ(ReadText(text, &u, window), expected) << window;
        EXPECT_EQ(u.CountItems(), whole.CountItems()) << window;
    }
}

TEST_F(UniverseTest, ProgressCountsTheBytesReadUpToTheWholeFile)
{
    const std::string text = GoodRecords(1, 5000);
    std::string copy = text;
    std::unique_ptr<std::FILE, int (*)(std::FILE*)> in(
        fmemopen(copy.data(), copy.size(), "rb"), &std::fclose);
    std::vector<uint64_t> told;
    Universe u(5000);
    ReadCatalogue(
        in.get(), 1000000, &u, 8192, nullptr, [&told](uint64_t bytes) { told.push_back(bytes); });
    ASSERT_GT(told.size(), text.size() / 8192);
    EXPECT_TRUE(std::is_sorted(told.begin(), told.end()));
    EXPECT_EQ(told.back(), text.size());
    EXPECT_EQ(u.CountItems(), 5000);
}
