// Whole-field number parsing and the ranges of a star's values.
#include "tools/importer/StrictNumbers.h"

#include "tools/importer/ImportStar.h"

#include <charconv>
#include <cmath>
#include <cstdio>

namespace {

// A value for a message: short, and exactly what was read when it was a plain figure.
std::string Shown(double value)
{
    char text[32];
    std::snprintf(text, sizeof text, "%.6g", value);
    return text;
}

} // namespace

bool ParseNumber(const std::string& text, double* value)
{
    size_t begin = 0, end = text.size();
    while (begin < end && (text[begin] == ' ' || text[begin] == '\t'))
        begin++;
    while (end > begin && (text[end - 1] == ' ' || text[end - 1] == '\t'))
        end--;
    // from_chars takes a minus but no plus; a plus is stepped over here, and must not be
    // followed by a second sign ("+-5").
    if (begin < end && text[begin] == '+') {
        begin++;
        if (begin < end && (text[begin] == '-' || text[begin] == '+'))
            return false;
    }
    if (begin == end)
        return false;
    double result = 0;
    const auto [stop, error] = std::from_chars(text.data() + begin, text.data() + end, result);
    if (error != std::errc() || stop != text.data() + end || !std::isfinite(result))
        return false;
    *value = result;
    return true;
}

double StrictNumber(
    const std::string& text, const std::string& file, int64_t line, const std::string& what)
{
    double value = 0;
    if (!ParseNumber(text, &value))
        throw ImportError(file, line, "bad number in " + what + ": '" + text + "'");
    return value;
}

double InRange(double value, double low, double high, const std::string& file, int64_t line,
    const std::string& what)
{
    if (!(value >= low && value <= high))
        throw ImportError(file, line,
            what + " " + Shown(value) + " out of range " + Shown(low) + ".." + Shown(high));
    return value;
}

double CheckedMagnitude(
    double magnitude, const std::string& file, int64_t line, const std::string& what)
{
    return InRange(magnitude, kMinMagnitude, kMaxMagnitude, file, line, what);
}

double CheckedParsecs(
    double parsecs, const std::string& file, int64_t line, const std::string& shown)
{
    if (!(parsecs <= kMaxParsecs))
        throw ImportError(file, line, shown + " places the star beyond 1,000,000 pc");
    if (!(parsecs >= kMinParsecs))
        throw ImportError(file, line, shown + " places the star nearer than 1 AU");
    return parsecs;
}
