// The fixed-column Hipparcos-derived catalogue.
#include "core/Constants.h"
#include "tools/importer/Designations.h"
#include "tools/importer/SourceReaders.h"
#include "tools/importer/StrictNumbers.h"

#include <cmath>

namespace {

// Column positions (0-based, end exclusive), checked against the file itself.
struct Columns {
    size_t begin, end;
    const char* what;
};
constexpr Columns kRaHours { 0, 2, "right ascension hours" };
constexpr Columns kRaMinutes { 2, 4, "right ascension minutes" };
constexpr Columns kRaSeconds { 4, 9, "right ascension seconds" };
constexpr Columns kDecSign { 10, 11, "declination sign" };
constexpr Columns kDecDegrees { 11, 13, "declination degrees" };
constexpr Columns kDecMinutes { 13, 15, "declination arc-minutes" };
constexpr Columns kDecSeconds { 15, 19, "declination arc-seconds" };
constexpr Columns kParallax { 38, 45, "parallax" };
constexpr Columns kMagnitude { 45, 51, "V magnitude" };
constexpr Columns kColour { 51, 56, "B-V colour index" };
constexpr Columns kSpectralType { 56, 58, "spectral type" };

std::string Field(const std::string& line, const Columns& c)
{
    return line.substr(c.begin, c.end - c.begin);
}

} // namespace

void ReadKStars(
    std::istream& in, const std::string& file, std::vector<ImportStar>& stars, ImportReport& report)
{
    std::string line;
    int64_t number = 0;
    while (std::getline(in, line)) {
        number++;
        if (!line.empty() && line.back() == '\r')
            line.pop_back();
        if (line.empty() || line[0] == '#')
            continue;
        if (line.size() < kSpectralType.end)
            throw ImportError(file, number,
                "line is " + std::to_string(line.size())
                    + " characters long, a star needs at least "
                    + std::to_string(kSpectralType.end));
        report.read++;

        // A field's number, checked against its range. Sixty seconds occur in the catalogue
        // (rounded 59.995) and mean the next minute; they are read as they stand.
        auto number_at = [&](const Columns& c, double low = -1e9, double high = 1e9) {
            const double value = StrictNumber(Field(line, c), file, number, c.what);
            if (value < low || value > high)
                throw ImportError(
                    file, number, std::string(c.what) + " " + Field(line, c) + " out of range");
            return value;
        };
        const double raH = number_at(kRaHours, 0, 23), raM = number_at(kRaMinutes, 0, 59),
                     raS = number_at(kRaSeconds, 0, 60);
        const std::string sign = Field(line, kDecSign);
        if (sign != "+" && sign != "-")
            throw ImportError(file, number, "declination sign is '" + sign + "', not + or -");
        const double decD = number_at(kDecDegrees, 0, 90), decM = number_at(kDecMinutes, 0, 59),
                     decS = number_at(kDecSeconds, 0, 60);
        const double parallax = number_at(kParallax);
        const double magnitude = number_at(kMagnitude);

        if (!(parallax > 0)) {
            report.Skip("without a usable parallax");
            continue;
        }

        ImportStar star;
        star.line = number;
        star.ra = (raH + raM / 60 + raS / 3600) / 24 * (kPI + kPI);
        star.dec = (sign == "-" ? -1 : 1) * (decD + decM / 60 + decS / 3600) / 180 * kPI;
        star.parallax = parallax;
        star.absoluteMagnitude = magnitude + 5 + 5 * std::log10(parallax / 1000);

        std::string type = Field(line, kSpectralType);
        while (!type.empty() && type.back() == ' ')
            type.pop_back();
        while (!type.empty() && type.front() == ' ')
            type.erase(0, 1);
        if (type.empty()) {
            const std::string colour = Field(line, kColour);
            double bv = 0;
            if (ParseNumber(colour, &bv)) {
                type = ClassFromColour(bv);
                report.classesFromColour++;
            } else {
                type = "?";
            }
        }
        star.spectralClass = type;

        // ", designation, common name" after the fixed columns; either may be absent.
        std::string designation, common;
        const size_t comma = line.find(',', kSpectralType.end);
        if (comma != std::string::npos) {
            const std::string rest = line.substr(comma + 1);
            const size_t second = rest.find(',');
            designation = rest.substr(0, second);
            if (second != std::string::npos)
                common = rest.substr(second + 1);
        }
        std::string name = CleanName(common);
        if (name.empty())
            name = CleanName(ReadableDesignation(designation));
        if (name.empty())
            name = CleanName(designation);
        if (name.empty())
            name = PositionDesignation(star.ra, star.dec);
        star.name = name;
        stars.push_back(std::move(star));
    }
    if (in.bad())
        throw ImportError(file, number, "read error");
}
