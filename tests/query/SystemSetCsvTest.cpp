// Sets as CSV: the table written (header, one row per star, quoting, CRLF, numbers that read
// back exactly), and tables read back into sets by name and by position, with other tools'
// column orders, rows that match nothing and malformed text.
#include "query/SystemSetCsv.h"

#include "UniverseBuilder.h"
#include "core/Constants.h"
#include "query/CsvRecordReader.h"

#include <charconv>
#include <gtest/gtest.h>
#include <memory>
#include <string>
#include <vector>

namespace {

class SystemSetCsvTest : public ::testing::Test {
protected:
    void SetUp() override
    {
        AddTestSystem(universe, 0, 0, 0, { { "Sol", "G2V", 4.83 } }); // 0
        AddTestSystem(universe, 1.25, -0.5, 2,
            { { "Alpha A", "G2V", 4.38 }, // 1
                { "Alpha B", "K1V", 5.71 } });
        AddTestSystem(universe, 0, 0, 5, { { "Smith, J.", "M4.5Ve", 15.53 } }); // 2
        AddTestSystem(universe, 0, 5, 0, { { "The \"Eye\"", "B8", -1.5 } }); // 3
        AddTestSystem(universe, -1, 0, 0, { { "Two\nLines", "A0V", 0.58 } }); // 4
        AddTestSystem(universe, 0, 0, -2, { { "Twin", "K5V", 7 } }); // 5
        AddTestSystem(universe, 10, 0, -2, { { "Twin", "K6V", 7.5 } }); // 6
        AddTestSystem(universe, 0.1 + 0.2, 1.0 / 3, -1e-300, { { "Odd", "F5", 3.3 } }); // 7
        // A starless system, as a generated universe has them.
        universe.AddItem(new StarSystem("Empty", SVector(3, 4, 12), 1, nullptr, 2)); // 8
    }

    std::unique_ptr<StarSysMask> Set(std::initializer_list<int32_t> indices) const
    {
        auto set = std::make_unique<StarSysMask>(universe.CountItems(), false, 0);
        for (const int32_t i : indices)
            set->SetStateSafe(i, true);
        return set;
    }

    static std::vector<int32_t> Members(const StarSysMask& set)
    {
        std::vector<int32_t> members;
        for (int32_t i = 0; i < set.GetSystemCount(); i++) {
            if (set.GetStateSafe(i))
                members.push_back(i);
        }
        return members;
    }

    SystemSetCsvResult Read(std::string_view text, StarSysMask* found) const
    {
        const SystemMatcher matcher(&universe);
        return SystemSetCsv::Read(text, matcher, found);
    }

    // The systems text names, failing the test when it is not read.
    std::vector<int32_t> ReadMembers(std::string_view text) const
    {
        auto found = Set({});
        const SystemSetCsvResult result = Read(text, found.get());
        EXPECT_TRUE(result.ok) << result.error;
        return Members(*found);
    }

    static std::vector<std::vector<std::string>> Records(std::string_view text)
    {
        CsvRecordReader reader(text);
        std::vector<std::vector<std::string>> records;
        std::vector<std::string> fields;
        while (reader.Next(fields))
            records.push_back(fields);
        EXPECT_FALSE(reader.Failed()) << reader.Error();
        return records;
    }

    Universe universe { 20 };
};

TEST_F(SystemSetCsvTest, HeaderAndOneRowPerStarInIndexOrder)
{
    const std::string text = SystemSetCsv::Write(universe, *Set({ 2, 1, 0 }));
    EXPECT_EQ(text,
        "Name,Spectral class,Absolute magnitude,Distance (pc),Right ascension (h),"
        "Declination (deg),x (pc),y (pc),z (pc)\r\n"
        "Sol,G2V,4.83,0.000000,0.000000,0.000000,0,0,0\r\n"
        "Alpha A,G2V,4.38,2.410913,3.866308,-11.969463,1.25,-0.5,2\r\n"
        "Alpha B,K1V,5.71,2.410913,3.866308,-11.969463,1.25,-0.5,2\r\n"
        "\"Smith, J.\",M4.5Ve,15.53,5.000000,6.000000,0.000000,0,0,5\r\n");
}

TEST_F(SystemSetCsvTest, EmptySetIsTheHeaderAlone)
{
    EXPECT_EQ(SystemSetCsv::Write(universe, *Set({})), std::string(SystemSetCsv::kHeader) + "\r\n");
}

TEST_F(SystemSetCsvTest, NamesWithCommasQuotesAndLineBreaksAreQuoted)
{
    const std::string text = SystemSetCsv::Write(universe, *Set({ 2, 3, 4 }));
    EXPECT_NE(text.find("\r\n\"Smith, J.\",M4.5Ve,"), std::string::npos);
    EXPECT_NE(text.find("\r\n\"The \"\"Eye\"\"\",B8,-1.5,"), std::string::npos);
    EXPECT_NE(text.find("\r\n\"Two\nLines\",A0V,"), std::string::npos);
    const auto records = Records(text);
    ASSERT_EQ(records.size(), 4u);
    EXPECT_EQ(records[1][0], "Smith, J.");
    EXPECT_EQ(records[2][0], "The \"Eye\"");
    EXPECT_EQ(records[3][0], "Two\nLines");
}

TEST_F(SystemSetCsvTest, EveryRowEndsInCrlf)
{
    const std::string text = SystemSetCsv::Write(universe, *Set({ 0, 1, 2, 3, 5, 6, 7, 8 }));
    ASSERT_FALSE(text.empty());
    EXPECT_TRUE(text.ends_with("\r\n"));
    for (size_t i = 0; i < text.size(); i++) {
        if (text[i] == '\n') {
            EXPECT_EQ(text[i - 1], '\r') << "at byte " << i;
        }
    }
    EXPECT_EQ(Records(text).size(), 10u); // the header, nine stars and the starless system
}

TEST_F(SystemSetCsvTest, DirectionsAndDistance)
{
    const auto records = Records(SystemSetCsv::Write(universe, *Set({ 2, 3, 4, 5, 8 })));
    ASSERT_EQ(records.size(), 6u);
    // z points to 6 h, y to the north pole, -x to 12 h, -z to 18 h.
    EXPECT_EQ(records[1][4], "6.000000");
    EXPECT_EQ(records[2][5], "90.000000");
    EXPECT_EQ(records[3][4], "12.000000");
    EXPECT_EQ(records[4][4], "18.000000");
    EXPECT_EQ(records[4][3], "2.000000");
    // The starless system: its own name, no class or magnitude, its place.
    EXPECT_EQ(records[5],
        (std::vector<std::string> {
            "Empty", "", "", "13.000000", "5.064250", "17.920213", "3", "4", "12" }));
}

TEST_F(SystemSetCsvTest, PositionsAndMagnitudesReadBackExactly)
{
    const auto records = Records(SystemSetCsv::Write(universe, *Set({ 7 })));
    ASSERT_EQ(records.size(), 2u);
    auto number = [](const std::string& text) {
        double value = 0;
        const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), value);
        EXPECT_EQ(error, std::errc());
        EXPECT_EQ(end, text.data() + text.size());
        return value;
    };
    const SVector& p = universe.SystemAt(7)->position;
    EXPECT_EQ(number(records[1][6]), p.x);
    EXPECT_EQ(number(records[1][7]), p.y);
    EXPECT_EQ(number(records[1][8]), p.z);
    EXPECT_EQ(number(records[1][2]), universe.SystemAt(7)->StarAt(0)->GetMagnitude());
    EXPECT_EQ(records[1][6], "0.30000000000000004");
}

TEST_F(SystemSetCsvTest, WrittenSetReadsBackTheSame)
{
    const auto set = Set({ 0, 1, 2, 3, 4, 6, 7, 8 });
    const std::string text = SystemSetCsv::Write(universe, *set);
    auto found = Set({ 5 });
    const SystemSetCsvResult result = Read(text, found.get());
    ASSERT_TRUE(result.ok) << result.error;
    EXPECT_EQ(Members(*found), Members(*set));
    EXPECT_EQ(result.rows, 9);
    EXPECT_EQ(result.matchedRows, 9);
    EXPECT_EQ(result.systems, 8);
    EXPECT_TRUE(result.unmatchedLines.empty());
}

TEST_F(SystemSetCsvTest, NameOnlyFile)
{
    // A quote inside a field that does not start with one is text.
    EXPECT_EQ(
        ReadMembers("name\r\nAlpha B\r\nThe \"Eye\"\r\nSol"), (std::vector<int32_t> { 0, 1, 3 }));
    EXPECT_EQ(ReadMembers("Name\nAlpha B\n\"The \"\"Eye\"\"\"\nSol\n"),
        (std::vector<int32_t> { 0, 1, 3 }));
}

TEST_F(SystemSetCsvTest, NamesAreSystemsOrStarsAndTrimmedWhenNeeded)
{
    AddTestSystem(universe, 7, 7, 7, { { "Wide", "G0", 4 } });
    universe.SystemAt(9)->SetName("Wide Pair");
    EXPECT_EQ(ReadMembers("Name\r\nWide Pair\r\n  Sol  \r\n"), (std::vector<int32_t> { 0, 9 }));
    EXPECT_EQ(ReadMembers("Name\r\nWide\r\n"), (std::vector<int32_t> { 9 }));
}

TEST_F(SystemSetCsvTest, PositionOnlyFileWithinTolerance)
{
    EXPECT_EQ(ReadMembers("x,y,z\r\n1.25,-0.5,2\r\n0,0,5.0000001\r\n+10,0,-2\r\n"),
        (std::vector<int32_t> { 1, 2, 6 }));
    auto found = Set({});
    const auto result = Read("x,y,z\r\n0,0,5.001\r\n1.25,-0.5,2\r\n", found.get());
    ASSERT_TRUE(result.ok);
    EXPECT_EQ(Members(*found), (std::vector<int32_t> { 1 }));
    EXPECT_EQ(result.unmatchedLines, (std::vector<int64_t> { 2 }));
}

TEST_F(SystemSetCsvTest, NearestOfSeveralAtOnePlaceWins)
{
    AddTestSystem(universe, 1.25, -0.5, 2.0000004, { { "Close", "M0", 9 } }); // 9
    EXPECT_EQ(ReadMembers("x,y,z\r\n1.25,-0.5,2.0000003\r\n"), (std::vector<int32_t> { 9 }));
    EXPECT_EQ(ReadMembers("x,y,z\r\n1.25,-0.5,2.0000001\r\n"), (std::vector<int32_t> { 1 }));
}

TEST_F(SystemSetCsvTest, ReorderedCaseInsensitiveAndExtraColumns)
{
    EXPECT_EQ(ReadMembers("Comment,Z,NAME,magnitude,X (PC),y [pc]\r\n"
                          "\"far, away\",5,\"Smith, J.\",15.53,0,0\r\n"
                          "none,2,Nobody,1,1.25,-0.5\r\n"),
        (std::vector<int32_t> { 1, 2 }));
    // A column in other units is not taken for parsecs.
    auto found = Set({});
    EXPECT_FALSE(Read("x (ly),y (ly),z (ly)\r\n0,0,0\r\n", found.get()).ok);
}

TEST_F(SystemSetCsvTest, DuplicateNamesResolvedByPosition)
{
    EXPECT_EQ(ReadMembers("Name,x,y,z\r\nTwin,10,0,-2\r\n"), (std::vector<int32_t> { 6 }));
    EXPECT_EQ(ReadMembers("Name,x,y,z\r\nTwin,0.5,0,-2\r\n"), (std::vector<int32_t> { 5 }));
    // No position: the first in the universe.
    EXPECT_EQ(ReadMembers("Name\r\nTwin\r\n"), (std::vector<int32_t> { 5 }));
    EXPECT_EQ(ReadMembers("Name,x,y,z\r\nTwin,,,\r\n"), (std::vector<int32_t> { 5 }));
}

TEST_F(SystemSetCsvTest, NameFirstThenPosition)
{
    // A known name wins over the row's position; an unknown one falls back on it.
    EXPECT_EQ(ReadMembers("Name,x,y,z\r\nSol,1.25,-0.5,2\r\n"), (std::vector<int32_t> { 0 }));
    EXPECT_EQ(ReadMembers("Name,x,y,z\r\nRenamed,1.25,-0.5,2\r\n"), (std::vector<int32_t> { 1 }));
}

TEST_F(SystemSetCsvTest, UnmatchedRowsAreCountedWithTheirLines)
{
    auto found = Set({});
    const auto result = Read("Name,x,y,z\r\n"
                             "Sol,0,0,0\r\n"
                             "Nobody,99,99,99\r\n"
                             "\"Multi\r\nline\",,,\r\n"
                             "Alpha A,1.25,-0.5,2\r\n"
                             "Alpha B,1.25,-0.5,2\r\n"
                             "Nowhere,x,y,z\r\n"
                             "\r\n"
                             "Short\r\n",
        found.get());
    ASSERT_TRUE(result.ok) << result.error;
    EXPECT_EQ(Members(*found), (std::vector<int32_t> { 0, 1 }));
    EXPECT_EQ(result.rows, 7);
    EXPECT_EQ(result.matchedRows, 3);
    EXPECT_EQ(result.systems, 2);
    EXPECT_EQ(result.unmatchedLines, (std::vector<int64_t> { 3, 4, 8, 10 }));
    EXPECT_EQ(SystemSetCsv::Describe(result),
        "CSV: 2 systems from 7 rows; 4 rows matched nothing (lines 3, 4, 8, 10)");
}

TEST_F(SystemSetCsvTest, DescribeIsShort)
{
    SystemSetCsvResult result;
    result.ok = true;
    result.rows = 1000;
    result.matchedRows = 998;
    result.systems = 998;
    result.unmatchedLines = { 5, 9 };
    EXPECT_EQ(SystemSetCsv::Describe(result),
        "CSV: 998 systems from 1,000 rows; 2 rows matched nothing (lines 5, 9)");
    result.rows = 1234567;
    result.systems = 1;
    result.unmatchedLines = { 2, 3, 4, 5, 6, 7, 8 };
    EXPECT_EQ(SystemSetCsv::Describe(result),
        "CSV: 1 system from 1,234,567 rows; 7 rows matched nothing (lines 2, 3, 4, 5, 6, ...)");
    result.unmatchedLines = { 12 };
    EXPECT_EQ(SystemSetCsv::Describe(result),
        "CSV: 1 system from 1,234,567 rows; 1 row matched nothing (line 12)");
    result.unmatchedLines.clear();
    EXPECT_EQ(SystemSetCsv::Describe(result), "CSV: 1 system from 1,234,567 rows");
    EXPECT_EQ(SystemSetCsv::Describe(result, "near.csv"), "near.csv: 1 system from 1,234,567 rows");
}

TEST_F(SystemSetCsvTest, MalformedTextReadsNothing)
{
    const struct {
        const char* text;
        const char* error;
    } cases[] = {
        { "", "line 1: empty, no header row" },
        { "\r\n\r\n", "line 1: empty, no header row" },
        { "Class,Magnitude\r\nG2V,4.8\r\n", "line 1: no Name or x, y, z column" },
        { "x,y\r\n1,2\r\n", "line 1: no Name or x, y, z column" },
        { "Name\r\nSol\r\n\"Alpha A\r\n", "line 3: a quoted field is never closed" },
        { "Name\r\nSol\r\n\"Alpha\" A\r\n", "line 3: text after a closing quote" },
        { "\"Name\r\n", "line 1: a quoted field is never closed" },
    };
    for (const auto& c : cases) {
        auto found = Set({ 3 });
        const auto result = Read(c.text, found.get());
        EXPECT_FALSE(result.ok) << c.text;
        EXPECT_EQ(result.error, c.error) << c.text;
        EXPECT_TRUE(Members(*found).empty()) << c.text;
        EXPECT_EQ(
            SystemSetCsv::Describe(result, "stars.csv"), std::string("stars.csv, ") + c.error);
    }
}

TEST_F(SystemSetCsvTest, TooManyRows)
{
    std::string text = "Name\r\n";
    for (int64_t i = 0; i <= SystemSetCsv::kMaxRows; i++)
        text += "Sol\n";
    auto found = Set({});
    const auto result = Read(text, found.get());
    EXPECT_FALSE(result.ok);
    EXPECT_EQ(result.error, "line 4000002: more than 4,000,000 rows");
    EXPECT_TRUE(Members(*found).empty());
}

TEST_F(SystemSetCsvTest, UsableHeader)
{
    EXPECT_TRUE(SystemSetCsv::HasUsableHeader(SystemSetCsv::kHeader));
    EXPECT_TRUE(SystemSetCsv::HasUsableHeader("\xEF\xBB\xBF"
                                              "star name,mag\r\n"));
    EXPECT_TRUE(SystemSetCsv::HasUsableHeader("Z,Y,X\n1,2,3"));
    EXPECT_FALSE(SystemSetCsv::HasUsableHeader("Sirius"));
    EXPECT_FALSE(SystemSetCsv::HasUsableHeader("Hello, world\nhow are you"));
    EXPECT_FALSE(SystemSetCsv::HasUsableHeader(""));
    EXPECT_FALSE(SystemSetCsv::HasUsableHeader("\"name"));
}

TEST_F(SystemSetCsvTest, OneMatcherPerUniverseWhileHeld)
{
    std::shared_ptr<const SystemMatcher> first = SystemMatcher::Shared(&universe);
    EXPECT_EQ(SystemMatcher::Shared(&universe), first);
    EXPECT_EQ(first->GetUniverse(), &universe);
    EXPECT_EQ(first->ByName("Smith, J.", std::nullopt), 2);
    Universe other(20);
    AddTestSystem(other, 0, 0, 0, { { "Smith, J.", "G2V", 4.8 } });
    const auto second = SystemMatcher::Shared(&other);
    EXPECT_NE(second, first);
    EXPECT_EQ(second->ByName("Smith, J.", std::nullopt), 0);
    // A universe that has grown is indexed again.
    AddTestSystem(universe, 40, 40, 40, { { "Late", "G2V", 4.8 } });
    const auto grown = SystemMatcher::Shared(&universe);
    EXPECT_NE(grown, first);
    EXPECT_EQ(grown->ByName("Late", std::nullopt), 9);
    EXPECT_EQ(first->ByName("Late", std::nullopt), -1);
}

} // namespace
