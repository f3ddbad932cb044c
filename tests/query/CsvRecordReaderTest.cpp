// The RFC 4180 record splitter: every quoting case, line ends, the byte-order mark, a missing
// last line end, and each malformed case with its line and reason.
#include "query/CsvRecordReader.h"

#include <gtest/gtest.h>
#include <string>
#include <vector>

namespace {

using Records = std::vector<std::vector<std::string>>;

// Every record of text, with the line each starts on; fails the test if the text is malformed.
Records ReadAll(std::string_view text, std::vector<int64_t>* lines = nullptr)
{
    CsvRecordReader reader(text);
    Records records;
    std::vector<std::string> fields;
    while (reader.Next(fields)) {
        records.push_back(fields);
        if (lines)
            lines->push_back(reader.Line());
    }
    EXPECT_FALSE(reader.Failed()) << reader.Error();
    return records;
}

// The error reading text gives.
std::string ErrorOf(std::string_view text)
{
    CsvRecordReader reader(text);
    std::vector<std::string> fields;
    while (reader.Next(fields)) { }
    EXPECT_TRUE(reader.Failed());
    return reader.Error();
}

TEST(CsvRecordReader, PlainFieldsWithCrlfLfAndNoFinalLineEnd)
{
    const Records expected = { { "a", "b", "c" }, { "1", "2", "3" } };
    EXPECT_EQ(ReadAll("a,b,c\r\n1,2,3\r\n"), expected);
    EXPECT_EQ(ReadAll("a,b,c\n1,2,3\n"), expected);
    EXPECT_EQ(ReadAll("a,b,c\r\n1,2,3"), expected);
    EXPECT_EQ(ReadAll("a,b,c\n1,2,3"), expected);
}

TEST(CsvRecordReader, EmptyFieldsAreKept)
{
    EXPECT_EQ(ReadAll(",,\r\na,,b\r\n"), (Records { { "", "", "" }, { "a", "", "b" } }));
    EXPECT_EQ(ReadAll("a,\r\n"), (Records { { "a", "" } }));
}

TEST(CsvRecordReader, QuotedFieldsHoldCommasQuotesAndLineBreaks)
{
    std::vector<int64_t> lines;
    const Records records = ReadAll("\"a,b\",\"say \"\"hi\"\"\",\"two\r\nlines\"\r\n"
                                    "\"\",\"\"\"\",\"lf\nonly\"\r\nlast,row\r\n",
        &lines);
    const Records expected
        = { { "a,b", "say \"hi\"", "two\r\nlines" }, { "", "\"", "lf\nonly" }, { "last", "row" } };
    EXPECT_EQ(records, expected);
    // A line break inside quotes starts a new line of the file, not a new record.
    EXPECT_EQ(lines, (std::vector<int64_t> { 1, 3, 5 }));
}

TEST(CsvRecordReader, QuotedLastFieldWithoutLineEnd)
{
    EXPECT_EQ(ReadAll("a,\"b\""), (Records { { "a", "b" } }));
    EXPECT_EQ(ReadAll("\"a\",\"\""), (Records { { "a", "" } }));
}

TEST(CsvRecordReader, ByteOrderMarkIsSkipped)
{
    EXPECT_EQ(
        ReadAll("\xEF\xBB\xBFName,x\r\nSol,0\r\n"), (Records { { "Name", "x" }, { "Sol", "0" } }));
    // Only at the very start: elsewhere it is part of the field.
    EXPECT_EQ(ReadAll("a\r\n\xEF\xBB\xBF"
                      "b\r\n"),
        (Records { { "a" },
            { "\xEF\xBB\xBF"
              "b" } }));
}

TEST(CsvRecordReader, EmptyLinesAreNoRecordsButAreCounted)
{
    std::vector<int64_t> lines;
    EXPECT_EQ(ReadAll("\r\n\r\na\r\n\n\r\nb\n", &lines), (Records { { "a" }, { "b" } }));
    EXPECT_EQ(lines, (std::vector<int64_t> { 3, 6 }));
    EXPECT_TRUE(ReadAll("").empty());
    EXPECT_TRUE(ReadAll("\xEF\xBB\xBF").empty());
}

TEST(CsvRecordReader, UnterminatedQuoteNamesTheLineItOpensOn)
{
    EXPECT_EQ(
        ErrorOf("a,b\r\n1,\"open\r\nstill open\r\n"), "line 2: a quoted field is never closed");
}

TEST(CsvRecordReader, TextAfterClosingQuote)
{
    EXPECT_EQ(ErrorOf("a,b\r\nc,\"d\"e\r\n"), "line 2: text after a closing quote");
}

TEST(CsvRecordReader, TooManyFields)
{
    const std::string row(CsvRecordReader::kMaxFields, ',');
    EXPECT_EQ(ErrorOf("a\r\n" + row + "\r\n"), "line 2: over 1000 fields in a row");
    // Exactly the limit is fine.
    const std::string fits(CsvRecordReader::kMaxFields - 1, ',');
    EXPECT_EQ(ReadAll(fits).at(0).size(), CsvRecordReader::kMaxFields);
}

TEST(CsvRecordReader, FieldTooLong)
{
    const std::string longField(CsvRecordReader::kMaxFieldBytes + 1, 'x');
    EXPECT_EQ(ErrorOf("a\r\n" + longField + "\r\n"), "line 2: a field longer than 64 KiB");
    EXPECT_EQ(ErrorOf("a\r\n\"" + longField + "\"\r\n"), "line 2: a field longer than 64 KiB");
}

TEST(CsvRecordReader, StopsAtTheFirstError)
{
    CsvRecordReader reader("a\r\n\"b\r\n");
    std::vector<std::string> fields;
    ASSERT_TRUE(reader.Next(fields));
    EXPECT_EQ(fields, std::vector<std::string> { "a" });
    EXPECT_FALSE(reader.Next(fields));
    EXPECT_TRUE(reader.Failed());
    EXPECT_EQ(reader.Line(), 2);
    EXPECT_FALSE(reader.Next(fields));
}

} // namespace
