// Fuzzing the importer's reader of the Gaia DR3 and Hipparcos star files, with a fixed set of
// labels: a file it does not refuse gives stars at finite places on the sky, each with a
// parallax of at least five times its error as the file gives them and a name the catalogue
// can hold, and what the importer writes of them reads back to the same stars.
#include "GaiaFuzzInputs.h"
#include "ImportRoundTrip.h"

#include "core/Constants.h"

#include <cmath>
#include <string_view>
#include <vector>

namespace {

uint32_t Little(std::string_view bytes, size_t at, size_t size)
{
    uint32_t value = 0;
    for (size_t i = 0; i < size; i++)
        value |= static_cast<uint32_t>(static_cast<unsigned char>(bytes[at + i])) << (8 * i);
    return value;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    static const GaiaLabels labels = GaiaFuzzLabels();
    const std::string_view bytes(reinterpret_cast<const char*>(data), size);
    std::vector<ImportStar> stars;
    ImportReport report;
    try {
        ReadGaiaStars(bytes, "fuzz", labels, stars, report);
    } catch (const ImportError&) {
        return 0;
    }
    // The reader took the header, so the level is one it can make a table of.
    const size_t level = Little(bytes, 16, 4);
    const size_t firstRecord = 28 + 4 * (20 * (size_t { 1 } << (2 * level)) + 1);
    FuzzCheck(report.read == static_cast<int64_t>((size - firstRecord) / 48),
        "not every record was read");
    FuzzCheck(report.read == static_cast<int64_t>(stars.size()) + report.Skipped(),
        "records neither read nor skipped");
    for (const ImportStar& star : stars) {
        FuzzCheck(std::isfinite(star.ra) && star.ra >= 0 && star.ra < 2 * kPI,
            "a right ascension out of range");
        FuzzCheck(
            std::isfinite(star.dec) && std::abs(star.dec) <= kPI / 2, "a declination out of range");
        FuzzCheck(star.line >= 1 && star.line <= report.read, "a star from no record");
        const size_t at = firstRecord + 48 * static_cast<size_t>(star.line - 1);
        const uint32_t parallax = Little(bytes, at + 36, 2), error = Little(bytes, at + 38, 2);
        FuzzCheck(parallax > 0, "a star without a parallax");
        FuzzCheck(parallax * 0.02 == star.parallax, "a parallax read otherwise");
        FuzzCheck(2 * parallax >= 5 * error, "a parallax under five times its error");
        FuzzCheck(!star.name.empty() && star.name.size() <= 79, "a name empty or too long");
        FuzzCheck(star.name.find('\n') == std::string::npos, "a name with a line feed");
    }
    CheckStarsRoundTrip(stars);
    return 0;
}
