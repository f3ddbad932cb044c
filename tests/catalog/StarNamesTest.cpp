// The names arena and the names file reader: every name filed under its star's system, a stale
// or foreign file kept out whole, bad lines and names passed over and counted, and the same
// result whatever the size of the reading window.
#include "catalog/StarNames.h"
#include "catalog/Star.h"
#include "catalog/Universe.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <memory>
#include <string>
#include <vector>

namespace {

// The catalogue the names are for: the Sun, then alpha Centauri A and B in one system, Proxima,
// Barnard's Star and two more single stars: seven stars in six systems.
constexpr char kCatalogue[] = "The Sun\nG2V 4.83 0 0 0\n"
                              "Rigil Kentaurus\nG2V 4.38 -0.5 -1.1 -0.9\n"
                              "Toliman\nK1V 5.71 -0.5 -1.1 -0.9\n"
                              "Proxima Centauri\nM5.5Ve 15.5 -0.47 -1.1 -0.9\n"
                              "Barnard's Star\nM4Ve 13.2 -0.01 0.16 -1.8\n"
                              "Star 5\nK0V 6 5 5 5\n"
                              "Star 6\nK0V 6 6 6 6\n";

using File = std::unique_ptr<std::FILE, int (*)(std::FILE*)>;

File Memory(std::string& text)
{
    return File(fmemopen(text.data(), text.size(), "rb"), &std::fclose);
}

class StarNamesTest : public ::testing::Test {
protected:
    void SetUp() override
    {
        std::string text = kCatalogue;
        const File in = Memory(text);
        ReadCatalogue(in.get(), 1000000, &universe);
        ASSERT_EQ(universe.CountItems(), 6);
    }

    // Reads names as the names file beside the catalogue, through a window of window bytes.
    StarNamesReport Read(const std::string& names, size_t window = size_t(1) << 20,
        uint64_t bytes = sizeof kCatalogue - 1, bool cut = false)
    {
        std::string text = names;
        const File in = Memory(text);
        StarNamesReport report;
        report.badLines = -1; // overwritten by every reading
        ReadStarNames(in.get(), bytes, cut, &universe, &report, window);
        return report;
    }

    // The other names of system, in order.
    std::vector<std::string> Of(int32_t system) const
    {
        std::vector<std::string> names;
        const StarNames::Range range = universe.otherNames.Of(system);
        for (const char* name = range.begin; name < range.end; name += names.back().size() + 1)
            names.emplace_back(name);
        return names;
    }

    static std::string Header(uint64_t stars = 7, uint64_t bytes = sizeof kCatalogue - 1)
    {
        return std::string(kStarNamesMagic) + "\n" + std::to_string(stars) + " "
            + std::to_string(bytes) + "\n";
    }

    Universe universe { 5000 };
};

const std::string kNames = "1\talf Cen A\tAlpha Centauri A\tHIP 71683\tHD 128620\tGJ 559 A\n"
                           "2\talf Cen B\tHIP 71681\tHD 128621\n"
                           "3\tGJ 551\tHIP 70890\tGaia DR3 5853498713190525696\n"
                           "6\tHD 6\n";

} // namespace

TEST_F(StarNamesTest, EveryNameIsFiledUnderItsStarsSystem)
{
    const StarNamesReport report = Read(Header() + kNames);
    EXPECT_TRUE(report.Clean());
    EXPECT_EQ(report.badLines, 0);
    EXPECT_EQ(report.stars, 7u);
    EXPECT_EQ(Of(0), std::vector<std::string>());
    EXPECT_EQ(Of(1),
        std::vector<std::string>({ "alf Cen A", "Alpha Centauri A", "HIP 71683", "HD 128620",
            "GJ 559 A", "alf Cen B", "HIP 71681", "HD 128621" }));
    EXPECT_EQ(
        Of(2), std::vector<std::string>({ "GJ 551", "HIP 70890", "Gaia DR3 5853498713190525696" }));
    EXPECT_EQ(Of(3), std::vector<std::string>());
    EXPECT_EQ(Of(4), std::vector<std::string>());
    EXPECT_EQ(Of(5), std::vector<std::string>({ "HD 6" }));
    EXPECT_EQ(Of(6), std::vector<std::string>());
    EXPECT_EQ(universe.otherNames.Count(), 12);
    // The stars keep their own names.
    EXPECT_STREQ(universe.SystemAt(1)->GetName(), "Rigil Kentaurus");
    EXPECT_STREQ(universe.SystemAt(1)->StarAt(1)->GetName(), "Toliman");
    EXPECT_STREQ(universe.SystemAt(2)->GetName(), "Proxima Centauri");
}

TEST_F(StarNamesTest, TheNamesTakeOneArenaAndAnOffsetASystem)
{
    Read(Header() + kNames);
    size_t text = 0;
    for (int32_t s = 0; s < universe.CountItems(); s++) {
        for (const std::string& name : Of(s))
            text += name.size() + 1;
    }
    EXPECT_EQ(universe.otherNames.TextBytes(), text);
    // Six systems' end offsets at most, and no room kept beyond what is held.
    EXPECT_LE(universe.otherNames.Bytes(), text + 6 * sizeof(uint32_t));
}

TEST_F(StarNamesTest, CarriageReturnsAndTheLastLineFeedAreLineEnds)
{
    std::string crlf = Header() + kNames;
    for (size_t at = crlf.find('\n'); at != std::string::npos; at = crlf.find('\n', at + 2))
        crlf.insert(at, "\r");
    crlf.pop_back(); // no line end after the last line
    crlf.pop_back();
    EXPECT_TRUE(Read(crlf).Clean());
    EXPECT_EQ(Of(5), std::vector<std::string>({ "HD 6" }));
    EXPECT_EQ(Of(2).back(), "Gaia DR3 5853498713190525696");
}

TEST_F(StarNamesTest, AFileForAnotherCatalogueIsStaleAndKeptOutWhole)
{
    StarNamesReport report = Read(Header(8) + kNames);
    EXPECT_TRUE(report.stale);
    EXPECT_EQ(report.namedStars, 8u);
    EXPECT_EQ(report.stars, 7u);
    EXPECT_TRUE(universe.otherNames.Empty());

    report = Read(Header(7, sizeof kCatalogue) + kNames);
    EXPECT_TRUE(report.stale);
    EXPECT_EQ(report.namedBytes, sizeof kCatalogue);
    EXPECT_EQ(report.bytes, sizeof kCatalogue - 1);
    EXPECT_TRUE(universe.otherNames.Empty());

    // Names read before are gone too: a reading replaces them.
    ASSERT_TRUE(Read(Header() + kNames).Clean());
    EXPECT_TRUE(Read(Header(6) + kNames).stale);
    EXPECT_TRUE(universe.otherNames.Empty());
}

TEST_F(StarNamesTest, AFileThatIsNoNamesFileIsKeptOutWhole)
{
    for (const std::string& text :
        { std::string("nightdome names 2\n7 171\n1\tX\n"), std::string("7 171\n1\tX\n"),
            std::string(kNames), std::string(), std::string(kStarNamesMagic) + "\n7\n1\tX\n",
            std::string(kStarNamesMagic) + "\nseven 171\n1\tX\n",
            Header() + kNames + std::string("4\tHD\0 4\n", 8) }) {
        const StarNamesReport report = Read(text);
        EXPECT_TRUE(report.notNames) << text;
        EXPECT_FALSE(report.stale) << text;
        EXPECT_EQ(report.badLines, 0) << text;
        EXPECT_TRUE(universe.otherNames.Empty()) << text;
    }
}

TEST_F(StarNamesTest, BadLinesArePassedOverAndTheGoodOnesKept)
{
    struct Case {
        std::string line;
        StarNamesReport::Cause cause;
    };
    const Case cases[] = {
        { "x1\tA\n", StarNamesReport::kBadIndex },
        { "\tA\n", StarNamesReport::kBadIndex },
        { "-1\tA\n", StarNamesReport::kBadIndex },
        { "1 \tA\n", StarNamesReport::kBadIndex },
        { "99999999999999999999999\tA\n", StarNamesReport::kBadIndex },
        { "\n", StarNamesReport::kBadIndex },
        { "7\tA\n", StarNamesReport::kNoSuchStar },
        { "1\tA\n", StarNamesReport::kOutOfOrder }, // after line 3's star 2
        { "4\n", StarNamesReport::kNoNames },
        { "4\t" + std::string(kMaxNamesLine, 'A') + "\n", StarNamesReport::kLongLine },
    };
    for (const Case& c : cases) {
        // Line 3 names star 2, line 4 is the bad one, line 5 names star 5.
        const StarNamesReport report = Read(Header() + "2\tHIP 71681\n" + c.line + "5\tHD 5\n");
        EXPECT_FALSE(report.notNames || report.stale) << c.line;
        EXPECT_EQ(report.badLines, 1) << c.line;
        EXPECT_EQ(report.badLinesLine, 4) << c.line;
        EXPECT_EQ(report.cause, c.cause) << c.line;
        EXPECT_EQ(report.badNames, 0) << c.line;
        EXPECT_EQ(Of(1), std::vector<std::string>({ "HIP 71681" })) << c.line;
        EXPECT_EQ(Of(4), std::vector<std::string>({ "HD 5" })) << c.line;
        EXPECT_EQ(Of(3), std::vector<std::string>()) << c.line;
    }
}

TEST_F(StarNamesTest, BadNamesArePassedOverAndTheirLinesKept)
{
    const StarNamesReport report
        = Read(Header() + "1\tGood\t\tHIP 1\n" + "3\t" + std::string(80, 'L') + "\t"
            + std::string(79, 'K') + "\n" + "4\tTab\x01\tCaf\xc3\xa9\tDel\x7f\tBarnard\n");
    EXPECT_EQ(report.badLines, 0);
    EXPECT_EQ(report.badNames, 5);
    EXPECT_EQ(report.badNamesLine, 3);
    EXPECT_EQ(Of(1), std::vector<std::string>({ "Good", "HIP 1" }));
    EXPECT_EQ(Of(2), std::vector<std::string>({ std::string(79, 'K') }));
    EXPECT_EQ(Of(3), std::vector<std::string>({ "Barnard" }));
}

TEST_F(StarNamesTest, TheWindowChangesNothing)
{
    const std::string text = Header() + kNames + "x\tA\n";
    const StarNamesReport whole = Read(text);
    const std::vector<std::string> wholeNames = Of(1);
    ASSERT_EQ(whole.badLines, 1);
    for (size_t window = 1; window < 40; window++) {
        EXPECT_EQ(Read(text, window), whole) << window;
        EXPECT_EQ(Of(1), wholeNames) << window;
        EXPECT_EQ(Of(2).size(), 3u) << window;
    }
    // A NUL byte far behind the names a small window has read.
    const std::string binary = text + std::string(100, 'x') + '\0';
    for (const size_t window : { size_t(3), size_t(1) << 20 }) {
        EXPECT_TRUE(Read(binary, window).notNames) << window;
        EXPECT_TRUE(universe.otherNames.Empty()) << window;
    }
}

TEST_F(StarNamesTest, ACatalogueReadOnlyInPartKeepsTheNamesOfTheStarsRead)
{
    std::string text = kCatalogue;
    Universe part(5000);
    const File in = Memory(text);
    ASSERT_TRUE(ReadCatalogue(in.get(), 3, &part));
    std::string names = Header() + kNames;
    const File namesIn = Memory(names);
    StarNamesReport report;
    ReadStarNames(namesIn.get(), sizeof kCatalogue - 1, true, &part, &report);
    EXPECT_TRUE(report.Clean());
    EXPECT_EQ(report.stars, 3u);
    EXPECT_EQ(part.otherNames.Count(), 8); // alpha Centauri A and B only
    // Fewer stars than were read is still stale.
    std::string fewer = Header(2) + kNames;
    const File fewerIn = Memory(fewer);
    ReadStarNames(fewerIn.get(), sizeof kCatalogue - 1, true, &part, &report);
    EXPECT_TRUE(report.stale);
}

TEST(StarNames, SystemsAreFilledInOrder)
{
    StarNames names;
    EXPECT_TRUE(names.Empty());
    EXPECT_EQ(names.Of(0).begin, names.Of(0).end);
    EXPECT_TRUE(names.Add(2, "HD 1", 4));
    EXPECT_TRUE(names.Add(2, "HD 2", 4));
    EXPECT_TRUE(names.Add(5, "X", 1));
    EXPECT_FALSE(names.Add(4, "Y", 1));
    EXPECT_FALSE(names.Add(-1, "Y", 1));
    EXPECT_FALSE(names.Add(5, "", 0));
    EXPECT_EQ(names.Count(), 3);
    EXPECT_EQ(names.Of(0).begin, names.Of(0).end);
    EXPECT_EQ(names.Of(3).begin, names.Of(3).end);
    EXPECT_EQ(std::string(names.Of(2).begin, names.Of(2).end), std::string("HD 1\0HD 2\0", 10));
    EXPECT_EQ(std::string(names.Of(5).begin, names.Of(5).end), std::string("X\0", 2));
    EXPECT_EQ(names.Of(6).begin, nullptr);
    EXPECT_EQ(names.ByteCount('H'), 2u);
    EXPECT_EQ(names.ByteCount('X'), 1u);
    EXPECT_EQ(names.ByteCount('Y'), 0u); // refused
    EXPECT_EQ(names.ByteCount(0), 0u);
    names.Clear();
    EXPECT_EQ(names.ByteCount('H'), 0u);
    EXPECT_TRUE(names.Empty());
    EXPECT_EQ(names.Count(), 0);
    EXPECT_EQ(names.Of(2).begin, nullptr);
}
