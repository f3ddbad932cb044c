// Text for the bitmap font, which has glyphs for printable ASCII only: names written in UTF-8 (or,
// where a byte is no UTF-8, in Latin-1) become their nearest ASCII letters, so that an accented
// letter shows as its base letter instead of a gap ("Bélénos" as "Belenos", "Mönch" as "Monch",
// "ß" as "ss").
#pragma once

#include <string>
#include <string_view>

// text with every character outside ASCII replaced by its nearest ASCII spelling: Latin letters
// lose their accents and ligatures are spelled out, Greek letters are written in Latin, quotes
// and dashes become their ASCII forms, combining accents are dropped, and anything else is '?'.
// ASCII passes through unchanged.
std::string AsciiTransliteration(std::string_view text);
