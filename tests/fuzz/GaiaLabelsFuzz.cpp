// Fuzzing the readers of the Gaia catalogue's label files. The first byte of an input picks the
// file (0: the cross-identifications, 1: the Bayer and Flamsteed designations, 2: the IAU
// names, 3: the spectral types), the rest is its content. What a reader does not refuse labels
// a fixed star file, whose stars must come out named as the catalogue can hold them, with
// other names the names file can hold, and read back as they were written.
#include "GaiaFuzzInputs.h"
#include "ImportRoundTrip.h"

#include <string_view>
#include <vector>

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    static const std::string starFile = GaiaFuzzStarFile();
    if (size == 0)
        return 0;
    const std::string_view text(reinterpret_cast<const char*>(data) + 1, size - 1);
    GaiaLabels labels;
    std::vector<ImportStar> stars;
    ImportReport report;
    try {
        switch (data[0] % 4) {
        case 0:
            ReadGaiaCrossIds(text, "fuzz", labels);
            break;
        case 1:
            ReadGaiaDesignations(text, "fuzz", labels);
            break;
        case 2:
            ReadGaiaIauNames(text, "fuzz", labels);
            break;
        default:
            ReadGaiaSpectralTypes(text, labels);
            break;
        }
        ReadGaiaStars(starFile, "stars", labels, stars, report);
    } catch (const ImportError&) {
        return 0;
    }
    FuzzCheck(stars.size() == 15, "the fixed stars were not all read");
    for (const ImportStar& star : stars) {
        FuzzCheck(!star.name.empty() && star.name.size() <= 79, "a name empty or too long");
        FuzzCheck(star.name.find('\n') == std::string::npos, "a name with a line feed");
    }
    CheckStarsRoundTrip(stars);
    return 0;
}
