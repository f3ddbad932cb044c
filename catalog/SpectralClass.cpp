// Parsing and printing spectral class texts.
#include "catalog/SpectralClass.h"

#include "catalog/CNumbers.h"

#include <cstdio>
#include <cstring>

namespace {

// The Harvard letters in the order of their enumerators.
constexpr char kLetters[] = "WOBAFGKMRN";

HarvardClass ClassOfLetter(char c)
{
    const char upper = c >= 'a' && c <= 'z' ? static_cast<char>(c - 'a' + 'A') : c;
    for (int hc = kClassW; hc <= kClassN; hc++) {
        if (kLetters[hc] == upper)
            return static_cast<HarvardClass>(hc);
    }
    return kNoClass;
}

} // namespace

SpectralClass::SpectralClass()
    : harvardClass(kNoClass)
    , decimalClass(0.0)
    , scString {}
    , hcCharacter('G')
{
}

SpectralClass::SpectralClass(const char* text)
    : SpectralClass()
{
    SetSpectralClass(text);
}

SpectralClass::SpectralClass(HarvardClass hc, double decimal)
    : SpectralClass()
{
    SetSpectralClass(hc, decimal);
}

const char* SpectralClass::SetSpectralClass(const char* text)
{
    const char* p = text;
    harvardClass = kNoClass;
    while (*p) {
        const HarvardClass found = ClassOfLetter(*p++);
        if (found != kNoClass) {
            harvardClass = found;
            break;
        }
    }
    hcCharacter = HCToChar(harvardClass);

    if (*p == '+') {
        decimalClass = 9.0;
    } else if (*p == '\0') {
        decimalClass = 5.0;
    } else {
        // A failed read stores nothing and counts as out of range.
        double value = -1.0;
        if (ScanDouble(p, &value) && value >= 0.0 && value < 10.0)
            decimalClass = value;
        else
            decimalClass = 5.0;
    }

    std::strncpy(scString, text, sizeof(scString) - 1);
    scString[sizeof(scString) - 1] = '\0';
    return scString;
}

void SpectralClass::SetSpectralClass(HarvardClass hc, double decimal)
{
    harvardClass = hc;
    decimalClass = decimal;
    hcCharacter = HCToChar(hc);
    std::snprintf(scString, sizeof(scString), "%c%1.1f", hcCharacter, decimal);
}

char SpectralClass::HCToChar(HarvardClass hc)
{
    if (hc == kNoClass)
        return 'G';
    if (hc < kNoClass || hc > kClassN)
        return '\0';
    return kLetters[hc];
}
