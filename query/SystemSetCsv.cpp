// Writing a set as CSV and reading CSV back into a set.
#include "query/SystemSetCsv.h"

#include "catalog/Star.h"
#include "core/Constants.h"
#include "query/CsvRecordReader.h"

#include <array>
#include <charconv>
#include <cmath>
#include <optional>

namespace {

// Shortest text that reads back as the same double.
void AppendShortest(std::string& out, double value)
{
    std::array<char, 32> buffer {};
    const auto end = std::to_chars(buffer.data(), buffer.data() + buffer.size(), value).ptr;
    out.append(buffer.data(), end);
}

void AppendFixed(std::string& out, double value, int decimals)
{
    std::array<char, 400> buffer {};
    const auto end = std::to_chars(
        buffer.data(), buffer.data() + buffer.size(), value, std::chars_format::fixed, decimals)
                         .ptr;
    out.append(buffer.data(), end);
}

// A field, quoted with its quotes doubled when it holds a comma, a quote or a line break.
void AppendField(std::string& out, std::string_view field)
{
    if (field.find_first_of(",\"\r\n") == std::string_view::npos) {
        out += field;
        return;
    }
    out += '"';
    for (const char c : field) {
        if (c == '"')
            out += '"';
        out += c;
    }
    out += '"';
}

// The position's columns: distance (pc), right ascension (hours, 0 up to 24), declination
// (degrees), then x, y, z; x points to 0 h, z to 6 h, y to the north pole.
void AppendPlace(std::string& out, const SVector& p)
{
    const double distance = std::sqrt(p.x * p.x + p.y * p.y + p.z * p.z);
    double ra = std::atan2(p.z, p.x);
    if (ra < 0)
        ra += kPI + kPI;
    const double dec = std::atan2(p.y, std::sqrt(p.x * p.x + p.z * p.z));
    AppendFixed(out, distance, 6);
    out += ',';
    AppendFixed(out, ra * 12 / kPI, 6);
    out += ',';
    AppendFixed(out, dec * 180 / kPI, 6);
    out += ',';
    AppendShortest(out, p.x);
    out += ',';
    AppendShortest(out, p.y);
    out += ',';
    AppendShortest(out, p.z);
    out += "\r\n";
}

std::string_view Trimmed(std::string_view s)
{
    while (!s.empty() && (s.front() == ' ' || s.front() == '\t'))
        s.remove_prefix(1);
    while (!s.empty() && (s.back() == ' ' || s.back() == '\t'))
        s.remove_suffix(1);
    return s;
}

// A header name lower-cased, without its unit when that is parsecs: "X (pc)" -> "x". A unit
// of anything else stays, so the column is not taken for one in parsecs.
std::string ColumnKey(std::string_view header)
{
    std::string key(Trimmed(header));
    for (char& c : key)
        c = char(c >= 'A' && c <= 'Z' ? c - 'A' + 'a' : c);
    for (const std::string_view unit : { "(pc)", "[pc]", "(parsecs)", "[parsecs]", "_pc" }) {
        if (key.size() > unit.size() && key.ends_with(unit)) {
            key.resize(key.size() - unit.size());
            key = std::string(Trimmed(key));
            break;
        }
    }
    return key;
}

struct Columns {
    std::optional<size_t> name, x, y, z;

    bool HasPosition() const { return x && y && z; }
    bool Usable() const { return name || HasPosition(); }
};

Columns FindColumns(const std::vector<std::string>& header)
{
    Columns columns;
    for (size_t i = 0; i < header.size(); i++) {
        const std::string key = ColumnKey(header[i]);
        std::optional<size_t>* slot = nullptr;
        if (key == "name" || key == "star name" || key == "star" || key == "designation")
            slot = &columns.name;
        else if (key == "x")
            slot = &columns.x;
        else if (key == "y")
            slot = &columns.y;
        else if (key == "z")
            slot = &columns.z;
        // The first of two columns of one meaning is the one read.
        if (slot && !*slot)
            *slot = i;
    }
    return columns;
}

std::optional<double> Number(const std::vector<std::string>& row, std::optional<size_t> column)
{
    if (!column || *column >= row.size())
        return std::nullopt;
    std::string_view text = Trimmed(row[*column]);
    if (!text.empty() && text.front() == '+')
        text.remove_prefix(1);
    double value = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), value);
    if (error != std::errc() || end != text.data() + text.size() || text.empty())
        return std::nullopt;
    return value;
}

std::string WithThousands(int64_t n)
{
    const std::string digits = std::to_string(n);
    std::string grouped;
    for (size_t i = 0; i < digits.size(); i++) {
        const size_t left = digits.size() - i;
        if (i > 0 && digits[i - 1] != '-' && left % 3 == 0)
            grouped += ',';
        grouped += digits[i];
    }
    return grouped;
}

} // namespace

std::string SystemSetCsv::Write(const Universe& universe, const StarSysMask& set)
{
    std::string out(kHeader);
    out += "\r\n";
    const int32_t count = std::min(universe.CountItems(), set.GetSystemCount());
    for (int32_t i = 0; i < count; i++) {
        if (!set.states[i])
            continue;
        const StarSystem* system = universe.SystemAt(i);
        const int32_t stars = system->CountItems();
        if (stars == 0) {
            AppendField(out, system->GetName());
            out += ",,,";
            AppendPlace(out, system->position);
            continue;
        }
        for (int32_t s = 0; s < stars; s++) {
            const Star* star = system->StarAt(s);
            AppendField(out, star->GetName());
            out += ',';
            AppendField(out, star->GetSpectralClassString());
            out += ',';
            AppendShortest(out, star->GetMagnitude());
            out += ',';
            AppendPlace(out, system->position);
        }
    }
    return out;
}

SystemSetCsvResult SystemSetCsv::Read(
    std::string_view text, const SystemMatcher& matcher, StarSysMask* found)
{
    SystemSetCsvResult result;
    found->SetAll(false);
    CsvRecordReader reader(text);
    std::vector<std::string> row;
    if (!reader.Next(row)) {
        result.error = reader.Failed() ? reader.Error() : "line 1: empty, no header row";
        return result;
    }
    const Columns columns = FindColumns(row);
    if (!columns.Usable()) {
        result.error = "line " + std::to_string(reader.Line()) + ": no Name or x, y, z column";
        return result;
    }
    while (reader.Next(row)) {
        if (++result.rows > kMaxRows) {
            found->SetAll(false);
            result = SystemSetCsvResult();
            result.error = "line " + std::to_string(reader.Line()) + ": more than "
                + WithThousands(kMaxRows) + " rows";
            return result;
        }
        std::optional<SVector> position;
        if (columns.HasPosition()) {
            const auto x = Number(row, columns.x), y = Number(row, columns.y),
                       z = Number(row, columns.z);
            if (x && y && z)
                position = SVector(*x, *y, *z);
        }
        int32_t index = -1;
        if (columns.name && *columns.name < row.size()) {
            const std::string_view name = row[*columns.name];
            index = matcher.ByName(name, position);
            if (index < 0 && Trimmed(name).size() != name.size())
                index = matcher.ByName(Trimmed(name), position);
        }
        if (index < 0 && position)
            index = matcher.ByPosition(*position);
        if (index < 0 || index >= found->GetSystemCount()) {
            result.unmatchedLines.push_back(reader.Line());
            continue;
        }
        result.matchedRows++;
        if (!found->states[index]) {
            found->states[index] = 1;
            result.systems++;
        }
    }
    if (reader.Failed()) {
        found->SetAll(false);
        const std::string error = reader.Error();
        result = SystemSetCsvResult();
        result.error = error;
        return result;
    }
    result.ok = true;
    return result;
}

bool SystemSetCsv::HasUsableHeader(std::string_view text)
{
    CsvRecordReader reader(text);
    std::vector<std::string> header;
    return reader.Next(header) && FindColumns(header).Usable();
}

std::string SystemSetCsv::Describe(const SystemSetCsvResult& result, std::string_view label)
{
    if (!result.ok)
        return std::string(label) + ", " + result.error;
    std::string text = std::string(label) + ": " + WithThousands(result.systems)
        + (result.systems == 1 ? " system from " : " systems from ") + WithThousands(result.rows)
        + (result.rows == 1 ? " row" : " rows");
    const size_t unmatched = result.unmatchedLines.size();
    if (unmatched == 0)
        return text;
    text += "; " + WithThousands(int64_t(unmatched))
        + (unmatched == 1 ? " row matched nothing (line " : " rows matched nothing (lines ");
    // The first few lines only: the help line is one short line.
    constexpr size_t kShown = 5;
    for (size_t i = 0; i < unmatched && i < kShown; i++)
        text += (i ? ", " : "") + std::to_string(result.unmatchedLines[i]);
    text += unmatched > kShown ? ", ...)" : ")";
    return text;
}
