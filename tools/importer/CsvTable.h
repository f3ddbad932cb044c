// A CSV file read row by row, its columns found by name in its header: what the CSV readers
// share.
#pragma once

#include "tools/importer/ImportStar.h"
#include "tools/importer/SourceReaders.h"
#include "tools/importer/StrictNumbers.h"

#include <cctype>
#include <cmath>
#include <initializer_list>
#include <istream>
#include <map>
#include <optional>
#include <string>
#include <vector>

inline std::string Lower(std::string s)
{
    for (char& c : s)
        c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
    return s;
}

inline std::string Trimmed(const std::string& s)
{
    size_t begin = 0, end = s.size();
    while (begin < end && std::isspace(static_cast<unsigned char>(s[begin])))
        begin++;
    while (end > begin && std::isspace(static_cast<unsigned char>(s[end - 1])))
        end--;
    return s.substr(begin, end - begin);
}

// A CSV file read row by row, its columns found by name in the header.
class CsvTable {
public:
    CsvTable(std::istream& in, const std::string& file)
        : fIn(in)
        , fFile(file)
    {
        std::string header;
        if (!std::getline(fIn, header) || Trimmed(header).empty())
            throw ImportError(fFile, 1, "no header row naming the columns");
        fLine = 1;
        const auto names = SplitCsvLine(StripCr(header));
        for (size_t i = 0; i < names.size(); i++)
            fColumns.emplace(Lower(Trimmed(names[i])), i);
    }

    // The first of the names the header has, or nothing.
    std::optional<size_t> Find(std::initializer_list<const char*> names) const
    {
        for (const char* name : names) {
            const auto found = fColumns.find(name);
            if (found != fColumns.end())
                return found->second;
        }
        return std::nullopt;
    }

    size_t Require(std::initializer_list<const char*> names, const char* what) const
    {
        if (const auto column = Find(names))
            return *column;
        std::string list;
        for (const char* name : names)
            list += std::string(list.empty() ? "" : " or ") + "'" + name + "'";
        throw ImportError(
            fFile, 1, "missing column for " + std::string(what) + ": the header needs " + list);
    }

    // The next non-blank row; false at the end.
    bool Next()
    {
        std::string line;
        while (std::getline(fIn, line)) {
            fLine++;
            line = StripCr(line);
            if (Trimmed(line).empty())
                continue;
            fRow = SplitCsvLine(line);
            return true;
        }
        if (fIn.bad())
            throw ImportError(fFile, fLine, "read error");
        return false;
    }

    std::string Text(std::optional<size_t> column) const
    {
        return column && *column < fRow.size() ? Trimmed(fRow[*column]) : std::string();
    }

    double Number(size_t column, const char* what) const
    {
        if (column >= fRow.size())
            throw ImportError(fFile, fLine,
                "row has " + std::to_string(fRow.size()) + " fields, the " + what
                    + " column is field " + std::to_string(column + 1));
        return StrictNumber(fRow[column], fFile, fLine, what);
    }

    // A number, or nothing when the field is empty or absent.
    std::optional<double> OptionalNumber(std::optional<size_t> column, const char* what) const
    {
        if (Text(column).empty())
            return std::nullopt;
        return Number(*column, what);
    }

    // The absolute magnitude: the absmag column's when the row has one, else one from the
    // apparent mag and the distance in parsecs; either within the range the program holds.
    double AbsoluteMagnitude(
        std::optional<size_t> absmag, std::optional<size_t> mag, double parsecs) const
    {
        if (const auto m = OptionalNumber(absmag, "absmag"))
            return CheckedMagnitude(*m, fFile, fLine, "absmag");
        if (const auto v = OptionalNumber(mag, "mag"))
            return CheckedMagnitude(
                CheckedMagnitude(*v, fFile, fLine, "mag") + 5 - 5 * std::log10(parsecs), fFile,
                fLine, "absolute magnitude");
        throw ImportError(fFile, fLine, "no magnitude (both absmag and mag are empty)");
    }

    int64_t Line() const { return fLine; }

private:
    static std::string StripCr(std::string s)
    {
        if (!s.empty() && s.back() == '\r')
            s.pop_back();
        return s;
    }

    std::istream& fIn;
    std::string fFile;
    std::map<std::string, size_t> fColumns;
    std::vector<std::string> fRow;
    int64_t fLine = 0;
};
