// Finding, reading or generating the universe at start, with one clear line for each problem.
#include "app/StartUniverse.h"

#include "platform/ExecutablePath.h"

#include <QStandardPaths>
#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <cstring>
#include <memory>
#include <system_error>

namespace {

constexpr char kCatalogueName[] = "stars.dat";

std::string Quoted(const std::filesystem::path& path)
{
    // Appended piece by piece: GCC 12 at -O3 warns falsely (-Wrestrict) about "'" + text.
    std::string quoted(1, '\'');
    quoted += path.string();
    quoted += '\'';
    return quoted;
}

// The catalogue read into a new universe; false, with the reason, when it cannot be read.
bool ReadCatalogueFile(const std::filesystem::path& path, int32_t maxStars, Universe* universe,
    bool* cut, std::string* reason)
{
    std::error_code error;
    if (std::filesystem::is_directory(path, error)) {
        *reason = "it is a folder";
        return false;
    }
    std::unique_ptr<std::FILE, int (*)(std::FILE*)> file(
        std::fopen(path.c_str(), "rb"), &std::fclose);
    if (!file) {
        *reason = std::strerror(errno);
        return false;
    }
    *cut = ReadCatalogue(file.get(), maxStars, universe);
    if (std::ferror(file.get())) {
        *reason = std::string("reading failed: ") + std::strerror(errno);
        return false;
    }
    return true;
}

} // namespace

std::vector<std::filesystem::path> CatalogueCandidates()
{
    std::vector<std::filesystem::path> candidates;
    const auto add = [&candidates](const std::filesystem::path& path) {
        if (!path.empty()
            && std::find(candidates.begin(), candidates.end(), path) == candidates.end())
            candidates.push_back(path);
    };
    const std::filesystem::path self = ExecutableDirectory();
    if (!self.empty())
        add(self / kCatalogueName);
    const QStringList data = QStandardPaths::standardLocations(QStandardPaths::GenericDataLocation);
    if (!data.isEmpty())
        add(std::filesystem::path(data.first().toStdString()) / "nightdome" / kCatalogueName);
    if (!self.empty())
        add((self / ND_BIN_TO_DATA / kCatalogueName).lexically_normal());
    add(std::filesystem::path(ND_INSTALL_DATADIR) / kCatalogueName);
    for (qsizetype i = 1; i < data.size(); i++)
        add(std::filesystem::path(data[i].toStdString()) / "nightdome" / kCatalogueName);
    return candidates;
}

StartedUniverse StartUniverse(const StartOptions& options, int32_t maxStars)
{
    StartedUniverse started;
    if (options.generate >= 0) {
        started.universe = Universe::Generate(options.generate, kDenseDensity, kUniverseBlockSize);
        return started;
    }

    std::filesystem::path path = options.catalogue;
    if (path.empty()) {
        for (const std::filesystem::path& candidate : CatalogueCandidates()) {
            std::error_code error;
            if (std::filesystem::is_regular_file(candidate, error)) {
                path = candidate;
                break;
            }
        }
    }
    started.universe = new Universe(kUniverseBlockSize);
    if (path.empty()) {
        std::string places;
        for (const std::filesystem::path& candidate : CatalogueCandidates())
            places += (places.empty() ? "" : ", ") + candidate.parent_path().string();
        started.report = "nightdome: no star catalogue found (looked for stars.dat in " + places
            + "); starting with an empty sky; give one with --catalogue FILE\n";
        started.helpLine = "No star catalogue found: the sky is empty";
        return started;
    }

    bool cut = false;
    std::string reason;
    if (!ReadCatalogueFile(path, maxStars, started.universe, &cut, &reason)) {
        delete started.universe;
        started.universe = new Universe(kUniverseBlockSize);
        started.report = "nightdome: cannot read the star catalogue " + Quoted(path) + ": " + reason
            + "; starting with an empty sky\n";
        started.helpLine = "Cannot read " + path.filename().string() + ": " + reason;
        return started;
    }
    started.catalogue = path;
    if (started.universe->IsEmpty()) {
        started.report = "nightdome: the star catalogue " + Quoted(path)
            + " holds no stars; starting with an empty sky\n";
        started.helpLine = path.filename().string() + " holds no stars: the sky is empty";
    } else if (cut) {
        const std::string limit = std::to_string(maxStars);
        started.report = "nightdome: the star catalogue " + Quoted(path) + " holds more than "
            + limit + " stars, the most the program holds; only the first " + limit
            + " were read\n";
        started.helpLine
            = "Only the first " + limit + " stars of " + path.filename().string() + " were read";
    }
    return started;
}
