// Synthetic catalogues for benchmarks, and spectral letters from colour.
#include "core/Constants.h"
#include "tools/importer/SourceReaders.h"

#include <cmath>
#include <random>

const char* ClassFromColour(double bv)
{
    // Typical B-V of main-sequence stars at the boundaries between the classes.
    if (bv < -0.30)
        return "O";
    if (bv < -0.02)
        return "B";
    if (bv < 0.30)
        return "A";
    if (bv < 0.58)
        return "F";
    if (bv < 0.81)
        return "G";
    if (bv < 1.40)
        return "K";
    return "M";
}

void GenerateStars(
    int64_t count, uint64_t seed, std::vector<ImportStar>& stars, ImportReport& report)
{
    // The generator's raw output is fixed by the standard; the doubles are made from it by
    // hand, so the same seed gives the same catalogue on every platform.
    std::mt19937_64 random(seed);
    auto uniform = [&] { return static_cast<double>(random() >> 11) * 0x1.0p-53; };
    static const char* const kClasses[] = { "O9V", "B2IV", "B8V", "A0V", "A5V", "F2V", "F8V", "G2V",
        "G8III", "K0III", "K2V", "K5V", "M0V", "M2V", "M4Ve", "M6V" };
    // Stars per cubic parsec near the Sun, about; the sphere grows with the count.
    const double radius = std::cbrt(3.0 * static_cast<double>(count) / (4 * kPI * 0.1));

    stars.reserve(stars.size() + static_cast<size_t>(count));
    ImportStar previous;
    for (int64_t i = 0; i < count; i++) {
        ImportStar star;
        star.line = i + 1;
        if (i > 0 && random() % 8 == 0) {
            // A companion at the same place.
            star.ra = previous.ra;
            star.dec = previous.dec;
            star.parallax = previous.parallax;
            star.group = previous.group;
        } else {
            const double d = radius * std::cbrt(uniform()) + 0.5;
            star.ra = (kPI + kPI) * uniform();
            star.dec = std::asin(2 * uniform() - 1);
            star.parallax = 1000.0 / d;
            star.group = i;
        }
        star.absoluteMagnitude = std::round((-4 + 20 * uniform()) * 100) / 100;
        star.spectralClass = kClasses[random() % 16];
        star.name = "SYN " + std::to_string(i + 1);
        stars.push_back(star);
        previous = star;
        report.read++;
    }
}
