// Number reading with a from_chars fast path and the C library behind it for everything else.
#include "catalog/CNumbers.h"

#include <algorithm>
#include <charconv>
#include <clocale>
#include <cstdarg>
#include <cstdio>
#include <cstring>
#include <locale.h>

namespace {

bool IsDigit(char c)
{
    return c >= '0' && c <= '9';
}

// A plain decimal in [p, end), one from_chars reads the way strtod does: an optional minus,
// then digits or a point. Hexadecimal, which from_chars does not know, is left to the slow
// path. Nothing at or past end is looked at.
bool LooksDecimal(const char* p, const char* end)
{
    if (p < end && *p == '-')
        p++;
    if (p == end || (!IsDigit(*p) && *p != '.'))
        return false;
    return !(p[0] == '0' && end - p > 1 && (p[1] == 'x' || p[1] == 'X'));
}

// The "C" locale, so that a decimal point is a point whatever the user's locale says.
class CLocaleScope {
public:
    CLocaleScope()
        : fPrevious(uselocale(CLocale()))
    {
    }
    ~CLocaleScope() { uselocale(fPrevious); }

private:
    static locale_t CLocale()
    {
        static const locale_t c = newlocale(LC_ALL_MASK, "C", static_cast<locale_t>(nullptr));
        return c;
    }
    locale_t fPrevious;
};

} // namespace

bool ScanDouble(const char* text, double* value, const char** next)
{
    const char* textEnd = text + std::strlen(text);
    if (LooksDecimal(text, textEnd)) {
        double result;
        const auto [end, error] = std::from_chars(text, textEnd, result);
        if (error == std::errc()) {
            *value = result;
            if (next)
                *next = end;
            return true;
        }
    }
    CLocaleScope locale;
    double result;
    int consumed = 0;
    if (std::sscanf(text, "%lf%n", &result, &consumed) != 1)
        return false;
    *value = result;
    if (next)
        *next = text + consumed;
    return true;
}

int FormatDouble(char* buffer, size_t size, const char* format, double value)
{
    CLocaleScope locale;
    return std::snprintf(buffer, size, format, value);
}

int FormatCLocale(char* buffer, size_t size, const char* format, ...)
{
    CLocaleScope locale;
    va_list arguments;
    va_start(arguments, format);
    const int written = std::vsnprintf(buffer, size, format, arguments);
    va_end(arguments);
    return written;
}

int ScanCatalogueData(const char* line, const char* end, char* classText, double* magnitude,
    double* x, double* y, double* z)
{
    // Fast path: a class word and four plain decimals, each followed by a blank or the end.
    // Anything else, a line cut short included, goes to sscanf itself.
    const char* p = line;
    while (p < end && IsCSpace(*p))
        p++;
    const char* word = p;
    while (p < end && *p && !IsCSpace(*p))
        p++;
    const char* wordEnd = p;
    double values[4];
    bool fast = wordEnd > word;
    for (int i = 0; fast && i < 4; i++) {
        while (p < end && IsCSpace(*p))
            p++;
        if (!LooksDecimal(p, end))
            break;
        const auto [after, error] = std::from_chars(p, end, values[i]);
        fast = error == std::errc() && (after == end || IsCSpace(*after));
        p = after;
        if (fast && i == 3) {
            std::memcpy(classText, word, wordEnd - word);
            classText[wordEnd - word] = '\0';
            *magnitude = values[0];
            *x = values[1];
            *y = values[2];
            *z = values[3];
            return 5;
        }
    }

    char copy[501];
    const size_t length = std::min<size_t>(end - line, 500);
    std::memcpy(copy, line, length);
    copy[length] = '\0';
    CLocaleScope locale;
    return std::sscanf(copy, "%500s %lf %lf %lf %lf", classText, magnitude, x, y, z);
}
