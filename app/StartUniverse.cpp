// Finding, reading or generating the universe at start, with one clear line for each problem.
#include "app/StartUniverse.h"

#include "platform/ExecutablePath.h"

#include <QApplication>
#include <QFontMetrics>
#include <QProgressDialog>
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

// The help line's text: before, the file's name, then after, the name shortened in its middle
// as far as the line's width asks for. Should even that not be enough, the whole is cut at its
// end.
std::string HelpLine(
    const std::string& before, const std::filesystem::path& file, const std::string& after)
{
    const QFontMetrics metrics(QApplication::font("QLabel"));
    const QString head = QString::fromStdString(before);
    const QString tail = QString::fromStdString(after);
    const int room = kHelpLineWidth - metrics.horizontalAdvance(head + tail);
    const QString name = metrics.elidedText(
        QString::fromStdString(file.filename().string()), Qt::ElideMiddle, std::max(room, 0));
    return metrics.elidedText(head + name + tail, Qt::ElideRight, kHelpLineWidth).toStdString();
}

// "1 record" or "n records".
std::string Records(int64_t n)
{
    return std::to_string(n) + (n == 1 ? " record" : " records");
}

// The reading of a big catalogue shown as it goes: a progress window from the first window of
// the file read to the end of reading.
class ReadingProgress {
public:
    ReadingProgress(const std::filesystem::path& path, uint64_t size)
        : fSize(size)
    {
        if (size < kProgressCatalogueBytes
            || !qobject_cast<QApplication*>(QCoreApplication::instance()))
            return;
        fDialog = std::make_unique<QProgressDialog>();
        fDialog->setWindowTitle("3D Nightdome");
        fDialog->setLabelText(QString("Reading the star catalogue %1")
                                  .arg(QString::fromStdString(path.filename().string())));
        fDialog->setCancelButton(nullptr);
        fDialog->setRange(0, kSteps);
        fDialog->setWindowModality(Qt::ApplicationModal);
        fDialog->setMinimumDuration(0);
        fDialog->setValue(0);
        fDialog->show();
        QCoreApplication::processEvents();
    }

    // Told the bytes read so far.
    void operator()(uint64_t bytes)
    {
        if (!fDialog)
            return;
        const int step
            = int(std::min<uint64_t>(bytes, fSize) * kSteps / std::max<uint64_t>(fSize, 1));
        if (step == fDialog->value())
            return;
        fDialog->setValue(step);
        // The window is modal, so that nothing but it answers while the catalogue is read.
        QCoreApplication::processEvents();
    }

private:
    static constexpr int kSteps = 1000;
    uint64_t fSize;
    std::unique_ptr<QProgressDialog> fDialog;
};

// The catalogue read into a new universe; false, with the reason, when it cannot be read.
bool ReadCatalogueFile(const std::filesystem::path& path, int32_t maxStars, Universe* universe,
    bool* cut, CatalogueReport* report, std::string* reason)
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
    const uintmax_t size = std::filesystem::file_size(path, error);
    ReadingProgress progress(path, error ? 0 : uint64_t(size));
    *cut = ReadCatalogue(file.get(), maxStars, universe, kCatalogueWindow, report,
        [&progress](uint64_t bytes) { progress(bytes); });
    if (std::ferror(file.get())) {
        *reason = std::string("reading failed: ") + std::strerror(errno);
        return false;
    }
    return true;
}

// What the reading met, one line of standard error for each kind of flaw, and the first of
// them for the help line.
void TellFlaws(
    const std::filesystem::path& path, const CatalogueReport& report, StartedUniverse* started)
{
    const auto at = [&path](int64_t line) {
        return "nightdome: " + Quoted(path) + ", line " + std::to_string(line) + ": ";
    };
    const auto help = [&path, &started](int64_t line, const std::string& what) {
        if (started->helpLine.empty())
            started->helpLine = HelpLine("", path, ", line " + std::to_string(line) + ": " + what);
    };
    if (report.malformed > 0) {
        static const char* const kCauses[][2] = {
            { "a name longer than 500 characters", "name too long" },
            { "a line longer than 500 characters", "line too long" },
            { "a data line without its five fields", "fields missing" },
        };
        const char* const* cause = kCauses[report.cause];
        started->report += at(report.malformedLine) + cause[0] + "; " + Records(report.malformed)
            + " malformed\n";
        help(report.malformedLine,
            std::string(cause[1]) + "; " + std::to_string(report.malformed) + " bad "
                + (report.malformed == 1 ? "record" : "records"));
    }
    if (report.nonFinite > 0) {
        started->report += at(report.nonFiniteLine)
            + "a number that is not finite (nan, inf or too large), read as 0; "
            + Records(report.nonFinite) + " with such numbers\n";
        help(report.nonFiniteLine, "not finite, read as 0; " + Records(report.nonFinite));
    }
    if (report.outOfRange > 0) {
        started->report += at(report.outOfRangeLine)
            + "a position beyond a million parsecs or a magnitude beyond 100, kept as read; "
            + Records(report.outOfRange) + " so far out\n";
        help(report.outOfRangeLine, "far out of range; " + Records(report.outOfRange));
    }
}

// "1 name" or "n names".
std::string Names(int64_t n)
{
    return std::to_string(n) + (n == 1 ? " name" : " names");
}

// The help line's text, unless something said earlier holds it.
void HelpOnce(StartedUniverse* started, const std::string& before,
    const std::filesystem::path& file, const std::string& after)
{
    if (started->helpLine.empty())
        started->helpLine = HelpLine(before, file, after);
}

// What reading the names file at path (beside catalogue) met, one line of standard error for
// each kind of problem and the first of them for the help line.
void TellNameFlaws(const std::filesystem::path& path, const std::filesystem::path& catalogue,
    const StarNamesReport& report, StartedUniverse* started)
{
    const std::string named = "nightdome: " + Quoted(path);
    const std::string unused = "; the stars keep only their own names\n";
    if (report.notNames) {
        started->report += named + " is not a star names file (its first line is not '"
            + kStarNamesMagic + "' with the catalogue's star count and size below it)" + unused;
        HelpOnce(started, "", path, " is not a star names file");
        return;
    }
    if (report.stale) {
        started->report += named + " is stale: it is for a catalogue of "
            + std::to_string(report.namedStars) + " stars and " + std::to_string(report.namedBytes)
            + " bytes, " + Quoted(catalogue) + " holds " + std::to_string(report.stars)
            + " stars in " + std::to_string(report.bytes) + " bytes" + unused;
        HelpOnce(started, "", path, " is stale: names not used");
        return;
    }
    const auto at = [](int64_t line) { return ", line " + std::to_string(line) + ": "; };
    if (report.badLines > 0) {
        const std::string kCauses[][2] = {
            { "a star index that is not a number", "bad star index" },
            { "a star index beyond the catalogue's stars", "no such star" },
            { "a star index not after the one of the line before", "out of order" },
            { "a star index without names", "no names" },
            { "a line longer than " + std::to_string(kMaxNamesLine) + " characters",
                "line too long" },
        };
        const std::string* cause = kCauses[report.cause];
        const std::string lines
            = std::to_string(report.badLines) + (report.badLines == 1 ? " line" : " lines");
        started->report
            += named + at(report.badLinesLine) + cause[0] + "; " + lines + " passed over\n";
        HelpOnce(started, "", path, at(report.badLinesLine) + cause[1] + "; " + lines + " bad");
    }
    if (report.badNames > 0) {
        started->report += named + at(report.badNamesLine)
            + "a name empty, longer than 79 characters or not printable ASCII; "
            + Names(report.badNames) + " passed over\n";
        HelpOnce(started, "", path,
            at(report.badNamesLine) + "bad name; " + Names(report.badNames) + " bad");
    }
    if (report.dropped > 0) {
        started->report += named + ": more names than the program holds (4 GiB); "
            + Names(report.dropped) + " passed over\n";
        HelpOnce(started, "", path, ": too many names; " + Names(report.dropped) + " not kept");
    }
}

// The names file beside the catalogue read into the started universe, and what it met told.
// No names file is nothing to tell.
void ReadNamesBeside(const std::filesystem::path& catalogue, bool cut, StartedUniverse* started)
{
    std::filesystem::path path = catalogue;
    path.replace_extension(".names");
    std::error_code error;
    if (!std::filesystem::exists(path, error))
        return;
    const auto cannot = [&path, &started](const std::string& reason) {
        started->report += "nightdome: cannot read the star names " + Quoted(path) + ": " + reason
            + "; the stars keep only their own names\n";
        HelpOnce(started, "Cannot read ", path, ": " + reason);
    };
    if (std::filesystem::is_directory(path, error))
        return cannot("it is a folder");
    std::unique_ptr<std::FILE, int (*)(std::FILE*)> file(
        std::fopen(path.c_str(), "rb"), &std::fclose);
    if (!file)
        return cannot(std::strerror(errno));
    const uintmax_t bytes = std::filesystem::file_size(catalogue, error);
    StarNamesReport report;
    ReadStarNames(file.get(), error ? 0 : uint64_t(bytes), cut, started->universe, &report);
    if (std::ferror(file.get())) {
        started->universe->otherNames.Clear();
        return cannot(std::string("reading failed: ") + std::strerror(errno));
    }
    TellNameFlaws(path, catalogue, report, started);
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
    CatalogueReport flaws;
    if (!ReadCatalogueFile(path, maxStars, started.universe, &cut, &flaws, &reason)) {
        delete started.universe;
        started.universe = new Universe(kUniverseBlockSize);
        started.report = "nightdome: cannot read the star catalogue " + Quoted(path) + ": " + reason
            + "; starting with an empty sky\n";
        started.helpLine = HelpLine("Cannot read ", path, ": " + reason);
        return started;
    }
    if (flaws.notText) {
        started.report = "nightdome: " + Quoted(path)
            + " holds NUL bytes, which no text does: it is not a star catalogue; starting with an "
              "empty sky\n";
        started.helpLine = HelpLine("", path, " is not a star catalogue: the sky is empty");
        return started;
    }
    started.catalogue = path;
    if (started.universe->IsEmpty()) {
        started.report = "nightdome: the star catalogue " + Quoted(path)
            + " holds no stars; starting with an empty sky\n";
        started.helpLine = HelpLine("", path, " holds no stars: the sky is empty");
        return started;
    }
    TellFlaws(path, flaws, &started);
    if (cut) {
        const std::string limit = std::to_string(maxStars);
        started.report += "nightdome: the star catalogue " + Quoted(path) + " holds more than "
            + limit + " stars, the most the program holds; only the first " + limit
            + " were read\n";
        if (started.helpLine.empty())
            started.helpLine = HelpLine("Read only the first " + limit + " stars of ", path, "");
    }
    ReadNamesBeside(path, cut, &started);
    return started;
}
