// The RFC 4180 record splitter.
#include "query/CsvRecordReader.h"

CsvRecordReader::CsvRecordReader(std::string_view text)
    : fText(text)
{
    if (fText.substr(0, 3) == "\xEF\xBB\xBF")
        fPos = 3;
}

bool CsvRecordReader::Fail(int64_t line, const std::string& reason)
{
    fRecordLine = line;
    fError = "line " + std::to_string(line) + ": " + reason;
    return false;
}

bool CsvRecordReader::SkipLineEnd()
{
    if (fPos >= fText.size())
        return false;
    if (fText[fPos] == '\r') {
        fPos++;
        if (fPos < fText.size() && fText[fPos] == '\n')
            fPos++;
    } else if (fText[fPos] == '\n') {
        fPos++;
    } else {
        return false;
    }
    fLine++;
    return true;
}

bool CsvRecordReader::Next(std::vector<std::string>& fields)
{
    fields.clear();
    if (Failed())
        return false;
    // Empty lines separate nothing.
    while (SkipLineEnd()) { }
    if (fPos >= fText.size())
        return false;
    fRecordLine = fLine;
    const size_t size = fText.size();
    for (;;) {
        if (fields.size() == kMaxFields)
            return Fail(fLine, "over " + std::to_string(kMaxFields) + " fields in a row");
        std::string& field = fields.emplace_back();
        if (fPos < size && fText[fPos] == '"') {
            const int64_t opened = fLine;
            fPos++;
            for (;;) {
                if (fPos >= size)
                    return Fail(opened, "a quoted field is never closed");
                const char c = fText[fPos];
                if (c == '"') {
                    if (fPos + 1 < size && fText[fPos + 1] == '"') {
                        field += '"';
                        fPos += 2;
                        continue;
                    }
                    fPos++;
                    break;
                }
                if (c == '\n' || (c == '\r' && !(fPos + 1 < size && fText[fPos + 1] == '\n')))
                    fLine++;
                field += c;
                fPos++;
                if (field.size() > kMaxFieldBytes)
                    return Fail(opened, "a field longer than 64 KiB");
            }
            if (fPos < size && fText[fPos] != ',' && fText[fPos] != '\r' && fText[fPos] != '\n')
                return Fail(fLine, "text after a closing quote");
        } else {
            const size_t begin = fPos;
            while (fPos < size && fText[fPos] != ',' && fText[fPos] != '\r' && fText[fPos] != '\n')
                fPos++;
            if (fPos - begin > kMaxFieldBytes)
                return Fail(fLine, "a field longer than 64 KiB");
            field.assign(fText.substr(begin, fPos - begin));
        }
        if (fPos < size && fText[fPos] == ',') {
            fPos++;
            continue;
        }
        SkipLineEnd();
        return true;
    }
}
