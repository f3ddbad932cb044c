// Splitting CSV text (RFC 4180) into records of fields: quoted fields with commas, doubled
// quotes and line breaks, CRLF or LF line ends, a leading UTF-8 byte-order mark, a last line
// without its line end. Plain C++: the text is already in memory.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

class CsvRecordReader {
public:
    // A record of more fields, or a field of more bytes, is taken for a file that is not CSV.
    static constexpr size_t kMaxFields = 1000;
    static constexpr size_t kMaxFieldBytes = 64 * 1024;

    // Reads text, which must outlive the reader.
    explicit CsvRecordReader(std::string_view text);

    // The next record into fields (an empty line is no record and is passed over). False at the
    // end of the text, and false with Failed() set at the first malformed record.
    bool Next(std::vector<std::string>& fields);

    // The line (counting from 1) the record last read starts on, or the malformed one starts on.
    int64_t Line() const { return fRecordLine; }
    bool Failed() const { return !fError.empty(); }
    // Why the text is not CSV, naming the line where that shows; empty while it is.
    const std::string& Error() const { return fError; }

private:
    bool Fail(int64_t line, const std::string& reason);
    // Consumes a line end at fPos (CRLF, LF or a lone CR) and counts it; false when none.
    bool SkipLineEnd();

    std::string_view fText;
    size_t fPos = 0;
    int64_t fLine = 1; // the line fPos is on
    int64_t fRecordLine = 0;
    std::string fError;
};
