// The fixed-column Hipparcos-derived catalogue.
#include "core/Constants.h"
#include "tools/importer/Designations.h"
#include "tools/importer/SourceReaders.h"
#include "tools/importer/SpectralEstimates.h"
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

std::string Trimmed(std::string s)
{
    while (!s.empty() && s.back() == ' ')
        s.pop_back();
    while (!s.empty() && s.front() == ' ')
        s.erase(0, 1);
    return s;
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
        auto number_at = [&](const Columns& c, double low = -HUGE_VAL, double high = HUGE_VAL) {
            return InRange(StrictNumber(Field(line, c), file, number, c.what), low, high, file,
                number, c.what);
        };
        const double raH = number_at(kRaHours, 0, 23), raM = number_at(kRaMinutes, 0, 59),
                     raS = number_at(kRaSeconds, 0, 60);
        const std::string sign = Field(line, kDecSign);
        if (sign != "+" && sign != "-")
            throw ImportError(file, number, "declination sign is '" + sign + "', not + or -");
        const double decD = number_at(kDecDegrees, 0, 90), decM = number_at(kDecMinutes, 0, 59),
                     decS = number_at(kDecSeconds, 0, 60);
        const double decDegrees = decD + decM / 60 + decS / 3600;
        if (decDegrees > 90)
            throw ImportError(file, number,
                "declination " + sign + Field(line, kDecDegrees) + " " + Field(line, kDecMinutes)
                    + " " + Field(line, kDecSeconds) + " lies beyond the pole");
        const double parallax = number_at(kParallax);
        const double magnitude = number_at(kMagnitude, kMinMagnitude, kMaxMagnitude);

        if (!(parallax > 0)) {
            report.Skip("without a usable parallax");
            continue;
        }
        CheckedParsecs(ParsecsFromParallax(parallax), file, number,
            "parallax " + Trimmed(Field(line, kParallax)) + " mas");

        ImportStar star;
        star.line = number;
        star.ra = (raH + raM / 60 + raS / 3600) / 24 * (kPI + kPI);
        star.dec = (sign == "-" ? -1 : 1) * decDegrees / 180 * kPI;
        star.parallax = parallax;
        star.absoluteMagnitude = CheckedMagnitude(
            magnitude + 5 + 5 * std::log10(parallax / 1000), file, number, "absolute magnitude");

        double bv = 0;
        const bool coloured = ParseNumber(Field(line, kColour), &bv);
        std::string type = CleanSpectralClass(Field(line, kSpectralType));
        if (!type.empty()) {
            type
                = PublishedClass(type, coloured ? std::optional<double>(bv) : std::nullopt, report);
        } else {
            if (coloured) {
                type = ClassFromColour(bv);
                report.classesFromColour++;
            } else {
                type = "?";
            }
            star.classEstimated = true;
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
        NameStar(star,
            { { common, NameKind::Proper },
                { ReadableDesignation(designation), NameKind::Designation },
                { designation, NameKind::Other } });
        stars.push_back(std::move(star));
    }
    if (in.bad())
        throw ImportError(file, number, "read error");
}
