// Spectral classes: parsing catalogue texts such as "G2V" and ordering classes from hot to
// cool on one numeric scale.
#pragma once

#include <cstdint>

// The Harvard letters in order of falling temperature; the numeric value is the order used by
// menus, comparisons and the H-R diagram's axis.
enum HarvardClass : int32_t {
    kNoClass = -1,
    kClassW = 0,
    kClassO,
    kClassB,
    kClassA,
    kClassF,
    kClassG,
    kClassK,
    kClassM,
    kClassR,
    kClassN,
};

class SpectralClass {
public:
    SpectralClass(); // no letter, decimal 0, empty text, letter character 'G'
    explicit SpectralClass(const char* text);
    SpectralClass(HarvardClass hc, double decimal);

    // Finds the first Harvard letter (either case; everything before it is skipped) and reads
    // the subclass right after it: "+" means 9, the end of the text means 5, a number from
    // 0 up to 10 is taken as it is, anything else means 5. Keeps the text, cut to 7
    // characters. Returns the kept text.
    const char* SetSpectralClass(const char* text);
    // Stores both and prints the text as letter and one decimal ("K5.0").
    void SetSpectralClass(HarvardClass hc, double decimal);

    // The class on one scale, hot to cool: letter value + 0.1 x subclass (G2 is 5.2).
    double SCToDouble() const { return static_cast<int32_t>(harvardClass) + 0.1 * decimalClass; }
    // The letter of a class; no class gives 'G', a value outside -1..9 gives NUL.
    static char HCToChar(HarvardClass hc);

    const char* GetSCString() const { return scString; }
    double GetDecimalClass() const { return decimalClass; }
    char GetHCCharacter() const { return hcCharacter; }
    HarvardClass GetHarvardClass() const { return harvardClass; }

    HarvardClass harvardClass;
    double decimalClass; // 0 up to 10
    char scString[8];
    char hcCharacter; // upper case
};
