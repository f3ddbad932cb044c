// Whole-field number parsing for the importer.
#include "tools/importer/StrictNumbers.h"

#include "tools/importer/ImportStar.h"

#include <charconv>
#include <cmath>

bool ParseNumber(const std::string& text, double* value)
{
    size_t begin = 0, end = text.size();
    while (begin < end && (text[begin] == ' ' || text[begin] == '\t'))
        begin++;
    while (end > begin && (text[end - 1] == ' ' || text[end - 1] == '\t'))
        end--;
    if (begin < end && text[begin] == '+')
        begin++;
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
