// Writing the program's catalogue: its text, and the file it replaces.
#include "tools/importer/CatalogueWriter.h"

#include "tools/importer/Designations.h"
#include "tools/importer/StrictNumbers.h"

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <sys/stat.h>
#include <unistd.h>

// Where a star FormatCatalogue cannot write came from, for its errors; the star's line in
// its source goes with it.
static const char* const kUnwritable = "the stars to write";

WriteSummary FormatCatalogue(
    std::FILE* out, const std::vector<ImportStar>& stars, const std::vector<StarGroup>& systems)
{
    WriteSummary summary;
    auto count = [&](size_t size) {
        if (summary.systemsBySize.size() <= size)
            summary.systemsBySize.resize(size + 1);
        summary.systemsBySize[size]++;
        summary.systems++;
        summary.stars += static_cast<int64_t>(size);
    };

    std::fprintf(out, "The Sun\nG2V 4.83 0 0 0\n");
    count(1);
    // The position the program read last, as it reads it back (as doubles, so "-0.000000" is
    // the Sun's 0 0 0 too).
    double previous[3] = { 0, 0, 0 };
    for (const StarGroup& system : systems) {
        const ImportStar& primary = stars[system.members.front()];
        double xyz[3], read[3];
        CartesianPosition(primary, &xyz[0], &xyz[1], &xyz[2]);
        for (double coordinate : xyz)
            InRange(coordinate, -kMaxParsecs, kMaxParsecs, kUnwritable, primary.line, "position");
        char position[128];
        auto print = [&] {
            std::snprintf(position, sizeof position, "%.6f %.6f %.6f", xyz[0], xyz[1], xyz[2]);
            char* next = position;
            for (double& coordinate : read)
                coordinate = std::strtod(next, &next);
        };
        print();
        // Two systems whose positions read back alike would be one: move the second by the
        // smallest step the file shows.
        while (std::equal(read, read + 3, previous)) {
            xyz[0] += 1e-6;
            print();
        }
        std::copy(read, read + 3, previous);
        for (size_t member : system.members) {
            const ImportStar& star = stars[member];
            // The readers hand over clean names and classes; cleaning again costs little and
            // keeps every line one the program reads back as it was meant.
            const std::string cleanClass = CleanSpectralClass(star.spectralClass);
            std::fprintf(out, "%s\n%s %.3f %s\n", CleanName(star.name).c_str(),
                cleanClass.empty() ? "?" : cleanClass.c_str(),
                CheckedMagnitude(
                    star.absoluteMagnitude, kUnwritable, star.line, "absolute magnitude"),
                position);
        }
        count(system.members.size());
    }

    return summary;
}

WriteSummary WriteCatalogue(const std::string& path, const std::vector<ImportStar>& stars,
    const std::vector<StarGroup>& systems)
{
    std::string pattern = path + ".XXXXXX";
    const int fd = mkstemp(pattern.data());
    if (fd < 0)
        throw ImportError(
            path, 0, std::string("cannot create a file beside it: ") + std::strerror(errno));
    std::FILE* out = fdopen(fd, "w");
    if (!out) {
        close(fd);
        unlink(pattern.c_str());
        throw ImportError(path, 0, std::string("cannot write: ") + std::strerror(errno));
    }

    const WriteSummary summary = FormatCatalogue(out, stars, systems);

    const bool failed = std::ferror(out) != 0;
    const int error = errno;
    if (std::fclose(out) != 0 || failed) {
        unlink(pattern.c_str());
        throw ImportError(
            path, 0, std::string("cannot write: ") + std::strerror(failed ? error : errno));
    }
    // Readable like any data file, whatever mkstemp chose.
    chmod(pattern.c_str(), 0644);
    if (std::rename(pattern.c_str(), path.c_str()) != 0) {
        const int renameError = errno;
        unlink(pattern.c_str());
        throw ImportError(path, 0, std::string("cannot replace it: ") + std::strerror(renameError));
    }
    return summary;
}
