// Reading numbers from catalogue text exactly as the C library's "%lf" conversion does, in
// the "C" locale whatever locale the program runs in, with a fast path for plain decimals; and
// writing them back the same way.
#pragma once

#include <cstddef>

// Whitespace as the "C" locale's isspace sees it.
inline bool IsCSpace(char c)
{
    return c == ' ' || (c >= '\t' && c <= '\r');
}

// Reads one number at text (a NUL-terminated string) like sscanf(text, "%lf"): leading
// blanks are skipped, signs, exponents, hexadecimal, "inf" and "nan" are accepted. Returns
// false when no number is there, leaving *value untouched; otherwise stores it and, when
// next is given, where the number ended.
bool ScanDouble(const char* text, double* value, const char** next = nullptr);

// snprintf(buffer, size, format, value) in the "C" locale: a decimal point, never a comma,
// whatever the user's locale, so that what is written reads back with ScanDouble. format holds
// one conversion of a double.
int FormatDouble(char* buffer, size_t size, const char* format, double value);

// snprintf(buffer, size, format, ...) in the "C" locale: for texts of several numbers shown to
// the user, which read the same whatever the user's locale.
int FormatCLocale(char* buffer, size_t size, const char* format, ...)
    __attribute__((format(printf, 3, 4)));

// A plain decimal as catalogues are written ("%.3f", "%.6f": an optional minus, digits, a
// point, digits) read from [p, end), giving bit for bit what strtod gives, at a fraction of
// its cost. Returns where the number ends, or null when the text there is anything else (a
// sign other than minus, an exponent, hexadecimal, inf, nan, no digit at all, a number that
// does not end at end, a blank or a NUL) or holds more digits than this exact path takes: the
// general readers handle those.
const char* ScanPlainDecimal(const char* p, const char* end, double* value);

// The fields of a catalogue data line, as sscanf(line, "%s %lf %lf %lf %lf") would fill them.
// classText must hold 501 bytes; line is NUL-terminated or ends at end, whichever comes first,
// and is at most 500 characters long. Fields that are not read keep their values. Returns
// the number of fields read, or -1 for a line with nothing but blanks.
int ScanCatalogueData(const char* line, const char* end, char* classText, double* magnitude,
    double* x, double* y, double* z);
// The same, from a buffer that may be loaded up to readable (at or past end): the class word
// and the numbers are then read sixteen characters at a time, or eight, up to the line's end
// too. Nothing at or past end counts.
int ScanCatalogueData(const char* line, const char* end, const char* readable, char* classText,
    double* magnitude, double* x, double* y, double* z);
