// Numbers in catalogue fields: the whole field (blanks around it aside) must be the number, and
// the values a star is made of must lie where the program's catalogue can hold them.
#pragma once

#include <cstdint>
#include <string>

// True when text, apart from blanks at either end, is one finite decimal number with at most
// one sign.
bool ParseNumber(const std::string& text, double* value);

// The number, or an ImportError naming the file, the line and the field.
double StrictNumber(
    const std::string& text, const std::string& file, int64_t line, const std::string& what);

// Limits of the values written. Beyond a million parsecs lie no catalogue stars (and the
// written line would grow); nearer than one astronomical unit is no star but the Sun.
inline constexpr double kMaxParsecs = 1e6;
inline constexpr double kMinParsecs = 1 / 206264.806247; // 1 AU
inline constexpr double kMinMagnitude = -30; // apparent or absolute
inline constexpr double kMaxMagnitude = 40;

// value, or an ImportError "what value out of range low..high" naming the file and the line.
double InRange(double value, double low, double high, const std::string& file, int64_t line,
    const std::string& what);

// A magnitude (apparent or absolute, as what says) within kMinMagnitude..kMaxMagnitude.
double CheckedMagnitude(
    double magnitude, const std::string& file, int64_t line, const std::string& what);

// A distance in parsecs within kMinParsecs..kMaxParsecs. shown is the field it came from with
// its own value and unit, for the message ("parallax 1e-300 mas").
double CheckedParsecs(
    double parsecs, const std::string& file, int64_t line, const std::string& shown);
