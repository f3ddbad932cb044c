// Main-sequence magnitudes and temperatures by spectral type, and the classes of white dwarfs.
#include "tools/importer/SpectralEstimates.h"

#include "tools/importer/Designations.h"

#include <algorithm>
#include <cctype>
#include <cmath>
#include <cstdlib>
#include <cstring>
#include <iterator>
#include <limits>
#include <string_view>

namespace {

constexpr size_t kMaxClass = 7; // the longest class word the program keeps

// Absolute visual magnitudes of main-sequence stars, after the mean dwarf sequence of Pecaut
// and Mamajek (2013), with the red dwarfs set to the medians of the 10-parsec sample. The
// type is a number: ten for each class letter from O (0) on, plus the subclass.
struct Point {
    double type, magnitude;
};
constexpr Point kMainSequence[] = {
    { 5, -5.2 }, // O5
    { 10, -4.0 }, // B0
    { 15, -1.1 }, // B5
    { 20, 1.0 }, // A0
    { 25, 1.9 }, // A5
    { 30, 2.5 }, // F0
    { 35, 3.4 }, // F5
    { 40, 4.4 }, // G0
    { 45, 5.1 }, // G5
    { 50, 5.9 }, // K0
    { 55, 7.3 }, // K5
    { 60, 8.9 }, // M0
    { 61, 9.8 }, { 62, 10.6 }, { 63, 11.7 }, { 64, 13.1 }, { 65, 14.7 }, { 66, 16.4 }, { 67, 17.6 },
    { 68, 18.6 }, { 69, 19.4 }, { 70, 20.2 }, // L0
    { 75, 22.0 }, // L5
};
constexpr char kLetters[] = "OBAFGKML";

// The subclass written after the letter ("4.5" in "M4.5V"); 5 when there is none.
double Subclass(const std::string& type, size_t at)
{
    size_t end = at;
    while (end < type.size()
        && (std::isdigit(static_cast<unsigned char>(type[end])) || type[end] == '.'))
        end++;
    if (end == at)
        return 5;
    const double value = std::strtod(type.substr(at, end - at).c_str(), nullptr);
    return std::isfinite(value) && value < 10 ? value : 5;
}

// Effective temperatures (kelvins) and B-V colours of main-sequence stars of every whole
// subclass from O3 to M9, from E. Mamajek's table "A Modern Mean Dwarf Stellar Color and
// Effective Temperature Sequence", the sequence of Pecaut and Mamajek (2013, ApJS 208, 9). The
// temperatures fall row by row; the colours rise or stay (all O stars are -0.32). The table
// gives no B-V for M9.
struct Dwarf {
    double temperature, bv;
};
constexpr int kFirstSubclass = 3; // the first row is O3: 10 x letter (O = 0) + subclass
constexpr double kNoColour = std::numeric_limits<double>::quiet_NaN();
constexpr Dwarf kDwarfs[] = {
    { 46000, -0.32 }, // O3
    { 43000, -0.32 }, // O4
    { 41500, -0.32 }, // O5
    { 39000, -0.32 }, // O6
    { 36500, -0.32 }, // O7
    { 34500, -0.32 }, // O8
    { 32500, -0.318 }, // O9
    { 31500, -0.307 }, // B0
    { 26000, -0.278 }, // B1
    { 20600, -0.210 }, // B2
    { 17000, -0.178 }, // B3
    { 16700, -0.165 }, // B4
    { 15700, -0.156 }, // B5
    { 14500, -0.140 }, // B6
    { 14000, -0.128 }, // B7
    { 12500, -0.109 }, // B8
    { 10700, -0.070 }, // B9
    { 9700, 0.000 }, // A0
    { 9200, 0.043 }, // A1
    { 8840, 0.074 }, // A2
    { 8550, 0.090 }, // A3
    { 8270, 0.140 }, // A4
    { 8080, 0.160 }, // A5
    { 8000, 0.170 }, // A6
    { 7800, 0.210 }, // A7
    { 7500, 0.250 }, // A8
    { 7440, 0.255 }, // A9
    { 7220, 0.294 }, // F0
    { 7030, 0.334 }, // F1
    { 6810, 0.374 }, // F2
    { 6720, 0.389 }, // F3
    { 6640, 0.412 }, // F4
    { 6510, 0.438 }, // F5
    { 6340, 0.484 }, // F6
    { 6240, 0.510 }, // F7
    { 6170, 0.530 }, // F8
    { 6040, 0.552 }, // F9
    { 5920, 0.596 }, // G0
    { 5880, 0.604 }, // G1
    { 5770, 0.650 }, // G2
    { 5720, 0.661 }, // G3
    { 5680, 0.674 }, // G4
    { 5660, 0.680 }, // G5
    { 5590, 0.704 }, // G6
    { 5530, 0.713 }, // G7
    { 5490, 0.737 }, // G8
    { 5340, 0.777 }, // G9
    { 5280, 0.816 }, // K0
    { 5170, 0.847 }, // K1
    { 5040, 0.893 }, // K2
    { 4840, 0.990 }, // K3
    { 4620, 1.100 }, // K4
    { 4410, 1.150 }, // K5
    { 4230, 1.240 }, // K6
    { 4070, 1.330 }, // K7
    { 4000, 1.356 }, // K8
    { 3940, 1.382 }, // K9
    { 3870, 1.408 }, // M0
    { 3700, 1.475 }, // M1
    { 3550, 1.500 }, // M2
    { 3410, 1.544 }, // M3
    { 3200, 1.661 }, // M4
    { 3030, 1.874 }, // M5
    { 2850, 2.00 }, // M6
    { 2650, 2.06 }, // M7
    { 2500, 2.20 }, // M8
    { 2400, kNoColour }, // M9
};
constexpr char kHarvardLetters[] = "OBAFGKM";

// The class on the table's scale (10 x letter + subclass, O3 is 3) of a temperature.
double SubclassOfTemperature(double kelvins)
{
    if (kelvins >= kDwarfs[0].temperature)
        return kFirstSubclass;
    for (size_t i = 1; i < std::size(kDwarfs); i++) {
        const Dwarf& a = kDwarfs[i - 1];
        const Dwarf& b = kDwarfs[i];
        if (kelvins >= b.temperature)
            return static_cast<double>(kFirstSubclass + i - 1)
                + (a.temperature - kelvins) / (a.temperature - b.temperature);
    }
    return static_cast<double>(kFirstSubclass + std::size(kDwarfs) - 1);
}

// The temperature index of a white dwarf's type: the number after D and its letters ("9" of
// "DQ9P", "2.9" of "DA2.9"); 0 when there is none.
double TemperatureIndex(const std::string& type)
{
    size_t at = 1;
    while (at < type.size() && std::isupper(static_cast<unsigned char>(type[at])))
        at++;
    size_t end = at;
    while (end < type.size()
        && (std::isdigit(static_cast<unsigned char>(type[end])) || type[end] == '.'))
        end++;
    const double index = std::strtod(type.substr(at, end - at).c_str(), nullptr);
    return std::isfinite(index) && index > 0 ? index : 0;
}

} // namespace

std::optional<double> MagnitudeOfType(const std::string& type)
{
    // Lower-case prefixes ("sd" subdwarf, "d" dwarf) come before the letter; a type of only
    // lower case ("m") is read as its capital.
    size_t at = 0;
    while (at < type.size() && std::islower(static_cast<unsigned char>(type[at])))
        at++;
    char letter = 0;
    if (at < type.size())
        letter = type[at];
    else if (!type.empty())
        letter = static_cast<char>(std::toupper(static_cast<unsigned char>(type[0])));
    if (letter == 'D') {
        // White dwarfs: D, then letters for the kind of spectrum, then the temperature index;
        // a cooler one is fainter.
        at++;
        while (at < type.size() && std::isupper(static_cast<unsigned char>(type[at])))
            at++;
        return 10.0 + 0.5 * Subclass(type, at);
    }
    const char* found = letter ? std::strchr(kLetters, letter) : nullptr;
    if (!found)
        return std::nullopt;
    const double x = 10.0 * static_cast<double>(found - kLetters) + Subclass(type, at + 1);
    if (x <= kMainSequence[0].type)
        return kMainSequence[0].magnitude;
    for (size_t i = 1; i < std::size(kMainSequence); i++) {
        const Point& a = kMainSequence[i - 1];
        const Point& b = kMainSequence[i];
        if (x <= b.type)
            return a.magnitude + (x - a.type) / (b.type - a.type) * (b.magnitude - a.magnitude);
    }
    return kMainSequence[std::size(kMainSequence) - 1].magnitude;
}

std::string TypeOfMagnitude(double absoluteMagnitude)
{
    double x = kMainSequence[0].type;
    if (absoluteMagnitude >= kMainSequence[std::size(kMainSequence) - 1].magnitude)
        x = kMainSequence[std::size(kMainSequence) - 1].type;
    for (size_t i = 1; i < std::size(kMainSequence); i++) {
        const Point& a = kMainSequence[i - 1];
        const Point& b = kMainSequence[i];
        if (absoluteMagnitude > a.magnitude && absoluteMagnitude <= b.magnitude)
            x = a.type
                + (absoluteMagnitude - a.magnitude) / (b.magnitude - a.magnitude)
                    * (b.type - a.type);
    }
    const int rounded = static_cast<int>(std::lround(x));
    // Spelt out character by character: GCC 12 at -O3 warns falsely (-Wrestrict) about the same
    // string joined with operator+.
    const char type[] = { kLetters[rounded / 10], char('0' + rounded % 10), 'V', '\0' };
    return type;
}

std::string ShortSpectralType(const std::string& type)
{
    std::string clean;
    for (char c : type) {
        if (c > ' ' && c < 127)
            clean += c;
    }
    if (clean.size() <= kMaxClass)
        return clean;
    const std::string first = clean.substr(0, clean.find('+'));
    if (!first.empty() && first.size() <= kMaxClass)
        return first;
    // Prefix, letters, subclass, luminosity class (roman numerals, then a or b).
    size_t end = 0;
    auto take = [&](auto test) {
        while (end < first.size() && test(first[end]))
            end++;
    };
    take([](char c) { return std::islower(static_cast<unsigned char>(c)) != 0; });
    take(
        [](char c) { return std::isupper(static_cast<unsigned char>(c)) && c != 'I' && c != 'V'; });
    take([](char c) { return std::isdigit(static_cast<unsigned char>(c)) || c == '.'; });
    take([](char c) { return c == 'I' || c == 'V'; });
    take([](char c) { return c == 'a' || c == 'b'; });
    return CleanSpectralClass(first.substr(0, end > 0 ? end : first.size()));
}

double TemperatureOfColour(double bv)
{
    if (bv <= kDwarfs[0].bv)
        return kDwarfs[0].temperature;
    double coolest = kDwarfs[0].temperature;
    for (size_t i = 1; i < std::size(kDwarfs) && !std::isnan(kDwarfs[i].bv); i++) {
        // The colours never fall, so the first row at least as red as bv follows one bluer.
        const Dwarf& a = kDwarfs[i - 1];
        const Dwarf& b = kDwarfs[i];
        if (bv <= b.bv)
            return a.temperature + (bv - a.bv) / (b.bv - a.bv) * (b.temperature - a.temperature);
        coolest = b.temperature;
    }
    return coolest;
}

std::string HarvardClassOfTemperature(double kelvins)
{
    const long subclass = std::lround(SubclassOfTemperature(kelvins));
    // Spelt out for the reason given in TypeOfMagnitude.
    const char harvard[] = { kHarvardLetters[subclass / 10], char('0' + subclass % 10), '\0' };
    return harvard;
}

WhiteDwarfClass PlaceWhiteDwarf(const std::string& word, std::optional<double> bv)
{
    WhiteDwarfClass placed { word, 0, WhiteDwarfSource::NotNeeded };
    const bool whiteDwarf = word.size() >= 2 && word[0] == 'D'
        && std::string_view("ABCOQZXPHEV").find(word[1]) != std::string_view::npos;
    if (!whiteDwarf || word.find_first_of("WOBAFGKMRNwobafgkmrn") != std::string::npos)
        return placed;

    if (const double index = TemperatureIndex(word); index > 0) {
        placed.temperature = 50400 / index;
        placed.source = WhiteDwarfSource::TemperatureIndex;
    } else if (bv) {
        placed.temperature = TemperatureOfColour(*bv);
        placed.source = WhiteDwarfSource::Colour;
    } else {
        placed.source = WhiteDwarfSource::Unplaced;
        return placed;
    }
    // A cut keeps the index's whole number or none of it: "DQZ10" is "DQZ", not "DQZ1", and
    // "DQ9.5P" is "DQ9".
    std::string harvard(1, ':');
    harvard += HarvardClassOfTemperature(placed.temperature);
    auto digit = [&](size_t i) { return std::isdigit(static_cast<unsigned char>(word[i])) != 0; };
    size_t keep = std::max<size_t>(2, kMaxClass - harvard.size());
    if (keep < word.size()) {
        while (keep > 2 && digit(keep) && digit(keep - 1))
            keep--;
        while (keep > 2 && word[keep - 1] == '.')
            keep--;
    }
    placed.word = word.substr(0, keep) + harvard;
    return placed;
}

std::string PublishedClass(const std::string& word, std::optional<double> bv, ImportReport& report)
{
    WhiteDwarfClass placed = PlaceWhiteDwarf(word, bv);
    switch (placed.source) {
    case WhiteDwarfSource::NotNeeded:
        break;
    case WhiteDwarfSource::TemperatureIndex:
        report.whiteDwarfsFromIndex++;
        break;
    case WhiteDwarfSource::Colour:
        report.whiteDwarfsFromColour++;
        break;
    case WhiteDwarfSource::Unplaced:
        report.whiteDwarfsUnplaced++;
        break;
    }
    return std::move(placed.word);
}
