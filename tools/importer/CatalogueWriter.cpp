// Writing the program's catalogue: its text, and the file it replaces.
#include "tools/importer/CatalogueWriter.h"

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <sys/stat.h>
#include <unistd.h>

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
    char previous[128] = "0.000000 0.000000 0.000000";
    for (const StarGroup& system : systems) {
        const ImportStar& primary = stars[system.members.front()];
        double x, y, z;
        CartesianPosition(primary, &x, &y, &z);
        char position[128];
        std::snprintf(position, sizeof position, "%.6f %.6f %.6f", x, y, z);
        // Two systems whose positions print alike would read back as one: move the second by
        // the smallest step the file shows.
        if (std::strcmp(position, previous) == 0)
            std::snprintf(position, sizeof position, "%.6f %.6f %.6f", x + 1e-6, y, z);
        std::strcpy(previous, position);
        for (size_t member : system.members) {
            const ImportStar& star = stars[member];
            std::fprintf(out, "%s\n%s %.3f %s\n", star.name.c_str(), star.spectralClass.c_str(),
                star.absoluteMagnitude, position);
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
