// Main-sequence magnitudes by spectral type.
#include "tools/importer/SpectralEstimates.h"

#include "tools/importer/Designations.h"

#include <cctype>
#include <cmath>
#include <cstdlib>
#include <cstring>
#include <iterator>

namespace {

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
    return std::string(1, kLetters[rounded / 10]) + std::to_string(rounded % 10) + "V";
}

std::string ShortSpectralType(const std::string& type)
{
    std::string clean;
    for (char c : type) {
        if (c > ' ' && c < 127)
            clean += c;
    }
    constexpr size_t kMaxClass = 7;
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
