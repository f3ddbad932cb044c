// Number reading with a from_chars fast path and the C library behind it for everything else.
#include "catalog/CNumbers.h"

#include <algorithm>
#include <array>
#include <bit>
#include <charconv>
#include <clocale>
#include <cstdarg>
#include <cstdint>
#include <cstdio>
#include <cstring>
#include <locale.h>
#ifdef __SSE2__
#include <emmintrin.h>
#endif

namespace {

bool IsDigit(char c)
{
    return static_cast<unsigned char>(c - '0') < 10;
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

// The powers of ten that a double holds exactly.
constexpr double kExactPowersOfTen[] = { 1e0, 1e1, 1e2, 1e3, 1e4, 1e5, 1e6, 1e7, 1e8, 1e9, 1e10,
    1e11, 1e12, 1e13, 1e14, 1e15, 1e16, 1e17, 1e18, 1e19, 1e20, 1e21, 1e22 };
constexpr size_t kMaxExactScale = 22;
// Integers up to 2^53 are exact in a double.
constexpr uint64_t kMaxExactMantissa = uint64_t(1) << 53;
constexpr size_t kMaxDigits = 19;

// Appends the run of digits at *p, moving *p past it, to *mantissa (wrapping when there are
// more than nineteen, which the caller then refuses); returns how many there were. The text
// ends at end; the bytes up to readable may be loaded, and are ignored past end. Eight
// characters at a time while eight can be loaded: a digit's high nibble is 3 and adding 6
// keeps it 3, so a byte that fails either test ends the run; the digits found are then
// combined pairwise, as two-, four- and eight-digit numbers.
[[gnu::always_inline]] inline size_t TakeDigits(
    const char** p, const char* end, const char* readable, uint64_t* mantissa)
{
    constexpr uint64_t kHigh = 0xF0F0F0F0F0F0F0F0u, kThrees = 0x3030303030303030u;
    static constexpr uint64_t kPowers[]
        = { 1, 10, 100, 1000, 10000, 100000, 1000000, 10000000, 100000000 };
    const char* q = *p;
    while (readable - q >= 8) {
        uint64_t word;
        std::memcpy(&word, q, sizeof word);
        const uint64_t other
            = ((word & kHigh) ^ kThrees) | (((word + 0x0606060606060606u) & kHigh) ^ kThrees);
        const ptrdiff_t found = other ? std::countr_zero(other) / 8 : 8;
        const ptrdiff_t run = std::min(found, end - q);
        if (run > 0) {
            uint64_t digits = (word & 0x0F0F0F0F0F0F0F0Fu) << (8 * (8 - run));
            digits = (digits * 10 + (digits >> 8)) & 0x00FF00FF00FF00FFu;
            digits = (digits * 100 + (digits >> 16)) & 0x0000FFFF0000FFFFu;
            digits = (digits * 10000 + (digits >> 32)) & 0xFFFFFFFFu;
            *mantissa = *mantissa * kPowers[run] + digits;
            q += run;
        }
        if (run < 8) {
            const size_t taken = q - *p;
            *p = q;
            return taken;
        }
    }
    while (q < end && IsDigit(*q))
        *mantissa = *mantissa * 10 + static_cast<uint64_t>(*q++ - '0');
    const size_t taken = q - *p;
    *p = q;
    return taken;
}

// ScanPlainDecimal, allowed to load the bytes up to readable.
[[gnu::always_inline]] inline const char* ScanPlainDecimalWithin(
    const char* p, const char* end, const char* readable, double* value)
{
    const bool negative = p < end && *p == '-';
    p += negative;
    // Leading zeros count as digits, which only sends a few more numbers to the general
    // readers.
    uint64_t mantissa = 0;
    const char* q = p;
    const size_t integerDigits = TakeDigits(&q, end, readable, &mantissa);
    size_t scale = 0; // digits after the point
    if (q < end && *q == '.') {
        q++;
        scale = TakeDigits(&q, end, readable, &mantissa);
    }
    const size_t digits = integerDigits + scale;
    if (digits == 0 || digits > kMaxDigits || scale > kMaxExactScale
        || mantissa > kMaxExactMantissa)
        return nullptr;
    if (q < end && *q != '\0' && !IsCSpace(*q))
        return nullptr;
    // Both operands are exact, so the one rounding of the division is the correctly rounded
    // value of the decimal, which is what strtod returns.
    const double magnitude = static_cast<double>(mantissa) / kExactPowersOfTen[scale];
    // The sign set without a branch: catalogue coordinates are as often negative as not, and a
    // branch on it is mispredicted every other time.
    *value = std::bit_cast<double>(
        std::bit_cast<uint64_t>(magnitude) | (static_cast<uint64_t>(negative) << 63));
    return q;
}

#ifdef __SSE2__
// The inverses of 5^k modulo 2^64: a multiple of 5^k times the inverse gives the quotient
// exactly, with one multiplication instead of a division.
constexpr uint64_t InverseModulo64(uint64_t odd)
{
    uint64_t inverse = odd; // right to three bits, as odd * odd is 1 modulo 8
    for (int i = 0; i < 5; i++)
        inverse *= 2 - odd * inverse; // each step doubles the bits that are right
    return inverse;
}
constexpr auto kInverseFivePowers = [] {
    std::array<uint64_t, 16> inverses {};
    uint64_t power = 1;
    for (uint64_t& inverse : inverses) {
        inverse = InverseModulo64(power);
        power *= 5;
    }
    return inverses;
}();
static_assert(kInverseFivePowers[15] * 30517578125u == 1);

// ScanPlainDecimalWithin for a number whose sixteen characters from p, past its minus, may
// all be loaded: the whole number at once, in the sixteen bytes of one vector. The characters
// that are digits or points give the number's length; the point is taken out by moving the
// digits after it one place left, the places past the last digit are zeroed, and the sixteen
// digits (as many as the number has, then zeros) are combined pairwise into two eight-digit
// halves. Their sum is the number's digits times 10^(16 - digits), which is divided exactly by
// that power: shifted right to divide by 2^k, then multiplied by the inverse of 5^k. Gives
// exactly what ScanPlainDecimalWithin gives, or null, and then the caller asks it: for longer
// numbers, two points or no digit at all.
[[gnu::always_inline]] inline const char* ScanShortDecimal(
    const char* p, const char* end, double* value)
{
    const bool negative = *p == '-';
    p += negative;
    const __m128i text = _mm_loadu_si128(reinterpret_cast<const __m128i*>(p));
    const __m128i digits = _mm_sub_epi8(text, _mm_set1_epi8('0'));
    const __m128i isDigit = _mm_cmpeq_epi8(_mm_min_epu8(digits, _mm_set1_epi8(9)), digits);
    const __m128i isPoint = _mm_cmpeq_epi8(text, _mm_set1_epi8('.'));
    const auto number = static_cast<uint32_t>(_mm_movemask_epi8(_mm_or_si128(isDigit, isPoint)));
    // Characters of the number: up to the first other byte, at most sixteen, and none at or
    // past end (where p may already stand, after a minus at the line's end). A number that
    // goes on past sixteen is refused below, as what follows them is no blank.
    const ptrdiff_t length = std::min<ptrdiff_t>(std::countr_zero(~number), end - p);
    if (length <= 0)
        return nullptr;
    const uint32_t points
        = static_cast<uint32_t>(_mm_movemask_epi8(isPoint)) & ((uint32_t(1) << length) - 1);
    if ((points & (points - 1)) != 0)
        return nullptr; // a second point ends the number there
    const int hasPoint = points != 0;
    const int point = std::countr_zero(points | 0x10000u); // 16 when there is none
    const int count = static_cast<int>(length) - hasPoint; // digits
    if (count == 0)
        return nullptr;
    const __m128i places = _mm_setr_epi8(0, 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14, 15);
    const __m128i afterPoint = _mm_cmpgt_epi8(places, _mm_set1_epi8(static_cast<char>(point - 1)));
    __m128i packed = _mm_or_si128(
        _mm_and_si128(afterPoint, _mm_srli_si128(digits, 1)), _mm_andnot_si128(afterPoint, digits));
    packed = _mm_and_si128(packed, _mm_cmpgt_epi8(_mm_set1_epi8(static_cast<char>(count)), places));
    const __m128i zero = _mm_setzero_si128();
    const __m128i pairs = _mm_packs_epi32(
        _mm_madd_epi16(_mm_unpacklo_epi8(packed, zero), _mm_set1_epi32((1 << 16) | 10)),
        _mm_madd_epi16(_mm_unpackhi_epi8(packed, zero), _mm_set1_epi32((1 << 16) | 10)));
    const __m128i fours = _mm_madd_epi16(pairs, _mm_set1_epi32((1 << 16) | 100));
    const __m128i eights
        = _mm_madd_epi16(_mm_packs_epi32(fours, fours), _mm_set1_epi32((1 << 16) | 10000));
    const auto high = static_cast<uint32_t>(_mm_cvtsi128_si32(eights));
    const auto low = static_cast<uint32_t>(_mm_cvtsi128_si32(_mm_srli_si128(eights, 4)));
    const int zeros = 16 - count;
    const uint64_t mantissa
        = ((uint64_t(high) * 100000000 + low) >> zeros) * kInverseFivePowers[zeros];
    if (mantissa > kMaxExactMantissa)
        return nullptr;
    const char* q = p + length;
    if (q < end && *q != '\0' && !IsCSpace(*q))
        return nullptr;
    const int scale = hasPoint ? static_cast<int>(length) - 1 - point : 0;
    const double magnitude = static_cast<double>(mantissa) / kExactPowersOfTen[scale];
    *value = std::bit_cast<double>(
        std::bit_cast<uint64_t>(magnitude) | (static_cast<uint64_t>(negative) << 63));
    return q;
}
#endif

// Where the word at p ends: at the first blank or NUL, or at end. With sixteen bytes loadable,
// the bytes up to the blank are looked at all at once, and one by one only when a control
// character comes first.
[[gnu::always_inline]] inline const char* FindWordEnd(
    const char* p, const char* end, const char* readable)
{
#ifdef __SSE2__
    if (readable - p >= 16) {
        const __m128i text = _mm_loadu_si128(reinterpret_cast<const __m128i*>(p));
        const __m128i low = _mm_cmpeq_epi8(_mm_min_epu8(text, _mm_set1_epi8(' ')), text);
        const ptrdiff_t first
            = std::countr_zero(static_cast<uint32_t>(_mm_movemask_epi8(low)) | 0x10000u);
        if (first >= end - p)
            return end;
        if (first < 16 && (p[first] == '\0' || IsCSpace(p[first])))
            return p + first;
    }
#endif
    while (p < end && *p && !IsCSpace(*p))
        p++;
    return p;
}

// Stores the five fields of a line read whole: the class word [word, wordEnd) and the four
// numbers. Returns 5, the count of fields.
[[gnu::always_inline]] inline int TakeFields(const char* word, const char* wordEnd,
    const char* readable, const double* values, char* classText, double* magnitude, double* x,
    double* y, double* z)
{
    // A short class in one step of sixteen bytes: classText holds 501.
    if (wordEnd - word < 16 && readable - word >= 16)
        std::memcpy(classText, word, 16);
    else
        std::memcpy(classText, word, wordEnd - word);
    classText[wordEnd - word] = '\0';
    *magnitude = values[0];
    *x = values[1];
    *y = values[2];
    *z = values[3];
    return 5;
}

} // namespace

const char* ScanPlainDecimal(const char* p, const char* end, double* value)
{
    return ScanPlainDecimalWithin(p, end, end, value);
}

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
    return ScanCatalogueData(line, end, end, classText, magnitude, x, y, z);
}

int ScanCatalogueData(const char* line, const char* end, const char* readable, char* classText,
    double* magnitude, double* x, double* y, double* z)
{
    // Fast path: a class word and four plain decimals, each followed by a blank or the end.
    // Anything else, a line cut short included, goes to sscanf itself.
    const char* p = line;
    while (p < end && IsCSpace(*p))
        p++;
    const char* word = p;
    const char* wordEnd = FindWordEnd(word, end, readable);
    p = wordEnd;
    double values[4];
#ifdef __SSE2__
    // As catalogues are written: four numbers after the class, each after one blank and
    // taken whole at once, the bytes past end loadable for every one of them. A number ends at
    // a blank, a NUL or end; a NUL ends the line, so a number after it is not met.
    if (wordEnd > word && readable - end >= 17) {
        const char* q = wordEnd;
        int i = 0;
        for (; i < 4 && q < end && *q == ' '; i++) {
            q = ScanShortDecimal(q + 1, end, &values[i]);
            if (!q)
                break;
        }
        if (i == 4)
            return TakeFields(word, wordEnd, readable, values, classText, magnitude, x, y, z);
    }
#endif
    bool fast = wordEnd > word;
    for (int i = 0; fast && i < 4; i++) {
        while (p < end && IsCSpace(*p))
            p++;
        const char* after = nullptr;
#ifdef __SSE2__
        if (readable - p >= 17)
            after = ScanShortDecimal(p, end, &values[i]);
#endif
        if (!after)
            after = ScanPlainDecimalWithin(p, end, readable, &values[i]);
        if (after && (after == end || IsCSpace(*after))) {
            p = after;
        } else {
            if (!LooksDecimal(p, end))
                break;
            const auto [next, error] = std::from_chars(p, end, values[i]);
            fast = error == std::errc() && (next == end || IsCSpace(*next));
            p = next;
        }
        if (fast && i == 3)
            return TakeFields(word, wordEnd, readable, values, classText, magnitude, x, y, z);
    }

    char copy[501];
    const size_t length = std::min<size_t>(end - line, 500);
    std::memcpy(copy, line, length);
    copy[length] = '\0';
    CLocaleScope locale;
    return std::sscanf(copy, "%500s %lf %lf %lf %lf", classText, magnitude, x, y, z);
}
