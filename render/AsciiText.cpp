// Transliteration to ASCII for the bitmap font: a UTF-8 decoder that falls back to Latin-1 for
// stray bytes, and tables of the nearest ASCII spelling of the Latin and Greek letters.
#include "render/AsciiText.h"

#include <cstdint>

namespace {

// U+00A0 to U+00FF, one entry each.
constexpr const char* kLatin1[96] = {
    " ", "!", "c", "L", "?", "Y", "|", "S", "\"", "(c)", "a", "<<", "-", "-", "(R)", "-", //
    "o", "+-", "2", "3", "'", "u", "P", ".", ",", "1", "o", ">>", "1/4", "1/2", "3/4", "?", //
    "A", "A", "A", "A", "A", "A", "AE", "C", "E", "E", "E", "E", "I", "I", "I", "I", //
    "D", "N", "O", "O", "O", "O", "O", "x", "O", "U", "U", "U", "U", "Y", "Th", "ss", //
    "a", "a", "a", "a", "a", "a", "ae", "c", "e", "e", "e", "e", "i", "i", "i", "i", //
    "d", "n", "o", "o", "o", "o", "o", "/", "o", "u", "u", "u", "u", "y", "th", "y", //
};

// U+0100 to U+017F, one letter each; the four ligatures (U+0132, U+0133, U+0152, U+0153) are
// spelled out separately.
constexpr char kLatinExtendedA[] = "AaAaAaCcCcCcCcDdDdEeEeEeEeEeGgGgGgGgHhHhIiIiIiIiIi"
                                   "IJ" // U+0132, U+0133: placeholders
                                   "JjKkkLlLlLlLlLlNnNnNnnNnOoOoOo"
                                   "OE" // U+0152, U+0153: placeholders
                                   "RrRrRrSsSsSsSsTtTtTtUuUuUuUuUuUuWwYyYZzZzZzs";
static_assert(sizeof kLatinExtendedA - 1 == 0x80);

// U+0391 to U+03C9: the Greek capitals, then the small letters, written in Latin ("" where the
// code point is not a letter).
constexpr const char* kGreek[57] = {
    "A", "B", "G", "D", "E", "Z", "E", "Th", "I", "K", "L", "M", "N", "X", "O", "P", "R", "", "S",
    "T", "Y", "Ph", "Ch", "Ps", "O", //
    "I", "Y", "a", "e", "e", "i", "y", // U+03AA to U+03B0: with diaeresis and tonos
    "a", "b", "g", "d", "e", "z", "e", "th", "i", "k", "l", "m", "n", "x", "o", "p", "r", "s", "s",
    "t", "y", "ph", "ch", "ps", "o", //
};

void Append(std::string& out, char32_t c)
{
    if (c < 0x80) {
        out += char(c);
    } else if (c >= 0xA0 && c <= 0xFF) {
        out += kLatin1[c - 0xA0];
    } else if (c == 0x132 || c == 0x152) {
        out += c == 0x132 ? "IJ" : "OE";
    } else if (c == 0x133 || c == 0x153) {
        out += c == 0x133 ? "ij" : "oe";
    } else if (c >= 0x100 && c <= 0x17F) {
        out += kLatinExtendedA[c - 0x100];
    } else if (c >= 0x300 && c <= 0x36F) {
        // A combining accent: the letter before it is already written.
    } else if (c >= 0x391 && c <= 0x3C9) {
        out += kGreek[c - 0x391];
    } else if (c == 0x2018 || c == 0x2019 || c == 0x2BB || c == 0x2BC || c == 0x2032) {
        out += '\'';
    } else if (c == 0x201C || c == 0x201D || c == 0x2033) {
        out += '"';
    } else if (c >= 0x2010 && c <= 0x2015) {
        out += '-';
    } else {
        out += '?';
    }
}

// The length of the UTF-8 sequence text[i] starts, and its code point; 0 when the bytes there
// are no well-formed sequence.
int DecodeUtf8(std::string_view text, size_t i, char32_t* c)
{
    const auto lead = uint8_t(text[i]);
    int length;
    char32_t value;
    if (lead >= 0xC2 && lead <= 0xDF) {
        length = 2;
        value = lead & 0x1F;
    } else if (lead >= 0xE0 && lead <= 0xEF) {
        length = 3;
        value = lead & 0x0F;
    } else if (lead >= 0xF0 && lead <= 0xF4) {
        length = 4;
        value = lead & 0x07;
    } else {
        return 0;
    }
    if (i + size_t(length) > text.size())
        return 0;
    for (int k = 1; k < length; k++) {
        const auto next = uint8_t(text[i + size_t(k)]);
        if ((next & 0xC0) != 0x80)
            return 0;
        value = (value << 6) | (next & 0x3F);
    }
    // Overlong forms, surrogates and values past U+10FFFF are no characters.
    static constexpr char32_t kSmallest[] = { 0, 0, 0x80, 0x800, 0x10000 };
    if (value < kSmallest[length] || (value >= 0xD800 && value <= 0xDFFF) || value > 0x10FFFF)
        return 0;
    *c = value;
    return length;
}

} // namespace

std::string AsciiTransliteration(std::string_view text)
{
    std::string out;
    out.reserve(text.size());
    for (size_t i = 0; i < text.size();) {
        const auto byte = uint8_t(text[i]);
        if (byte < 0x80) {
            out += char(byte);
            i++;
            continue;
        }
        char32_t c;
        const int length = DecodeUtf8(text, i, &c);
        if (length > 0) {
            Append(out, c);
            i += size_t(length);
        } else {
            // Not UTF-8: read the byte as Latin-1, as older catalogues are written.
            Append(out, byte);
            i++;
        }
    }
    return out;
}
