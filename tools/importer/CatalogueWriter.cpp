// Writing the program's catalogue: its text, and the file it replaces.
#include "tools/importer/CatalogueWriter.h"

#include "tools/importer/Designations.h"
#include "tools/importer/StrictNumbers.h"

#include <algorithm>
#include <cctype>
#include <cerrno>
#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fcntl.h>
#include <filesystem>
#include <pthread.h>
#include <sys/file.h>
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

std::string NamesFileOf(const std::string& catalogue)
{
    const std::filesystem::path path(catalogue);
    if (!path.has_extension() || path.filename() == path.extension())
        return catalogue + ".names";
    std::filesystem::path names = path;
    names.replace_extension(".names");
    return names.string();
}

void FormatNames(std::FILE* out, const std::vector<ImportStar>& stars,
    const std::vector<StarGroup>& systems, int64_t catalogueBytes, WriteSummary& summary)
{
    int64_t count = 1; // the Sun
    for (const StarGroup& system : systems)
        count += static_cast<int64_t>(system.members.size());
    std::fprintf(out, "nightdome names 1\n%lld %lld\n", static_cast<long long>(count),
        static_cast<long long>(catalogueBytes));
    int64_t index = 1;
    std::vector<std::string> written;
    for (const StarGroup& system : systems) {
        for (size_t member : system.members) {
            const ImportStar& star = stars[member];
            written.assign(1, CleanName(star.name));
            ForEachAlias(star.aliases, [&](const std::string& alias) {
                std::string clean = CleanName(alias);
                // The names file holds printable ASCII only; a name with other characters
                // ("Citalá", the IAU name of a star a table renamed) is left out.
                const bool ascii = std::all_of(
                    clean.begin(), clean.end(), [](char c) { return c >= ' ' && c <= '~'; });
                if (!clean.empty() && ascii
                    && std::find(written.begin(), written.end(), clean) == written.end())
                    written.push_back(std::move(clean));
            });
            if (written.size() > 1) {
                std::fprintf(out, "%lld", static_cast<long long>(index));
                for (size_t i = 1; i < written.size(); i++)
                    std::fprintf(out, "\t%s", written[i].c_str());
                std::fputc('\n', out);
                summary.starsWithOtherNames++;
                summary.otherNames += static_cast<int64_t>(written.size() - 1);
            }
            index++;
        }
    }
}

namespace {

namespace fs = std::filesystem;

// Temporary catalogues are named "<catalogue>.importing-XXXXXX": a name no file of the user's
// ("stars.dat.backup", say) is mistaken for when the leftovers of killed imports are removed.
const char kTemporaryInfix[] = ".importing-";
constexpr int kRandomLetters = 6; // the XXXXXX mkstemp fills in

// The signals on which an import removes its temporary file before it dies.
constexpr int kCleanedSignals[] = { SIGINT, SIGTERM, SIGHUP };
constexpr int kCleanedCount = sizeof kCleanedSignals / sizeof kCleanedSignals[0];

// The temporary file being written, for the signal handler, which may not allocate: a fixed
// buffer, and a flag set only while a file of that name is ours. One import at a time per
// process; both change only while the signals above are held back.
char gTemporary[4096];
volatile std::sig_atomic_t gTemporaryArmed = 0;

void RemoveTemporaryAndDie(int signal)
{
    if (gTemporaryArmed)
        unlink(gTemporary);
    struct sigaction standard { };
    standard.sa_handler = SIG_DFL;
    sigaction(signal, &standard, nullptr);
    raise(signal); // delivered when the handler returns: the process ends as the sender meant
}

// Holds back the cleaned signals for its lifetime, while the temporary file and its name in
// gTemporary change together.
class SignalsHeld {
public:
    SignalsHeld()
    {
        sigset_t held;
        sigemptyset(&held);
        for (int signal : kCleanedSignals)
            sigaddset(&held, signal);
        pthread_sigmask(SIG_BLOCK, &held, &fPrevious);
    }
    ~SignalsHeld() { pthread_sigmask(SIG_SETMASK, &fPrevious, nullptr); }
    SignalsHeld(const SignalsHeld&) = delete;
    SignalsHeld& operator=(const SignalsHeld&) = delete;

private:
    sigset_t fPrevious;
};

// RemoveTemporaryAndDie handles the cleaned signals for its lifetime. A signal the process
// ignores (as a background job or under nohup) stays ignored, and one with a handler of its
// own keeps it.
class CleanupOnSignals {
public:
    CleanupOnSignals()
    {
        struct sigaction cleanup { };
        cleanup.sa_handler = RemoveTemporaryAndDie;
        sigemptyset(&cleanup.sa_mask);
        for (int i = 0; i < kCleanedCount; i++) {
            sigaction(kCleanedSignals[i], nullptr, &fPrevious[i]);
            fInstalled[i] = !(fPrevious[i].sa_flags & SA_SIGINFO)
                && fPrevious[i].sa_handler == SIG_DFL
                && sigaction(kCleanedSignals[i], &cleanup, nullptr) == 0;
        }
    }
    ~CleanupOnSignals()
    {
        for (int i = 0; i < kCleanedCount; i++) {
            if (fInstalled[i])
                sigaction(kCleanedSignals[i], &fPrevious[i], nullptr);
        }
    }
    CleanupOnSignals(const CleanupOnSignals&) = delete;
    CleanupOnSignals& operator=(const CleanupOnSignals&) = delete;

private:
    struct sigaction fPrevious[kCleanedCount];
    bool fInstalled[kCleanedCount] = {};
};

std::string Reason(const char* what, int error)
{
    return std::string(what) + ": " + std::strerror(error);
}

bool SameFile(const struct stat& a, const struct stat& b)
{
    return a.st_dev == b.st_dev && a.st_ino == b.st_ino;
}

// The temporary file a catalogue is written to, beside the file it replaces. It is locked
// (flock) while it exists, so that another import can tell it from the leftover of a killed
// one; it is removed on the cleaned signals, and when it is destroyed without replacing.
class TemporaryCatalogue {
public:
    // target: the file to replace; shown: its name in messages.
    TemporaryCatalogue(const std::string& target, const std::string& shown)
        : fTarget(target)
        , fShown(shown)
    {
        const std::string pattern = target + kTemporaryInfix + std::string(kRandomLetters, 'X');
        if (pattern.size() >= sizeof gTemporary)
            throw ImportError(shown, 0, "the name is too long");
        // Another import may find the file unlocked between mkstemp and flock and remove it
        // as a leftover; then the file locked is no longer named, and another is made.
        for (int attempt = 0; !fFile; attempt++) {
            int fd;
            {
                SignalsHeld held;
                std::memcpy(gTemporary, pattern.c_str(), pattern.size() + 1);
                fd = mkstemp(gTemporary);
                gTemporaryArmed = fd >= 0;
            }
            if (fd < 0)
                throw ImportError(shown, 0, Reason("cannot create a file beside it", errno));
            // A file system without locks leaves the file unlocked; there, no import takes
            // another's file for a leftover, since it cannot lock it either.
            flock(fd, LOCK_EX);
            struct stat opened, named;
            if (fstat(fd, &opened) != 0 || lstat(gTemporary, &named) != 0
                || !SameFile(opened, named)) {
                gTemporaryArmed = 0; // removed by the other import
                close(fd);
                if (attempt == 10)
                    throw ImportError(shown, 0, Reason("cannot create a file beside it", EEXIST));
                continue;
            }
            fFile = fdopen(fd, "w");
            if (!fFile) {
                const int error = errno;
                Remove();
                close(fd);
                throw ImportError(shown, 0, Reason("cannot write", error));
            }
        }
    }

    ~TemporaryCatalogue()
    {
        Remove();
        // Unlocks it too; a renamed file's text was flushed to the system by Replace.
        std::fclose(fFile);
    }

    TemporaryCatalogue(const TemporaryCatalogue&) = delete;
    TemporaryCatalogue& operator=(const TemporaryCatalogue&) = delete;

    std::FILE* File() const { return fFile; }

    // Puts the text written in place of the target, with the given permissions. The file
    // stays locked until it has its new name.
    void Replace(mode_t mode)
    {
        if (std::fflush(fFile) != 0 || std::ferror(fFile))
            throw ImportError(fShown, 0, Reason("cannot write", errno));
        if (fchmod(fileno(fFile), mode) != 0)
            throw ImportError(fShown, 0, Reason("cannot set its permissions", errno));
        int error = 0;
        {
            SignalsHeld held;
            if (std::rename(gTemporary, fTarget.c_str()) == 0)
                gTemporaryArmed = 0;
            else
                error = errno;
        }
        if (error != 0)
            throw ImportError(fShown, 0, Reason("cannot replace it", error));
    }

private:
    void Remove()
    {
        SignalsHeld held;
        if (gTemporaryArmed)
            unlink(gTemporary);
        gTemporaryArmed = 0;
    }

    CleanupOnSignals fCleanup; // first made, last undone
    std::string fTarget;
    std::string fShown;
    std::FILE* fFile = nullptr;
};

bool IsTemporaryName(const std::string& name, const std::string& prefix)
{
    if (name.size() != prefix.size() + kRandomLetters
        || name.compare(0, prefix.size(), prefix) != 0)
        return false;
    return std::all_of(name.begin() + static_cast<std::ptrdiff_t>(prefix.size()), name.end(),
        [](char c) { return std::isalnum(static_cast<unsigned char>(c)) != 0; });
}

// Removes the temporary files that killed imports into target left beside it: named like
// ours, and locked by no running import. Returns how many it removed.
int64_t RemoveLeftovers(const std::string& target)
{
    const fs::path path(target);
    const fs::path folder = path.has_parent_path() ? path.parent_path() : fs::path(".");
    const std::string prefix = path.filename().string() + kTemporaryInfix;
    int64_t removed = 0;
    std::error_code error;
    for (fs::directory_iterator entry(folder, error), end; !error && entry != end;
         entry.increment(error)) {
        const std::string name = entry->path().string();
        if (!IsTemporaryName(entry->path().filename().string(), prefix))
            continue;
        const int fd = open(name.c_str(), O_RDONLY | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC);
        if (fd < 0)
            continue;
        struct stat opened, named;
        if (fstat(fd, &opened) == 0 && S_ISREG(opened.st_mode) && flock(fd, LOCK_EX | LOCK_NB) == 0
            && lstat(name.c_str(), &named) == 0 && SameFile(opened, named)
            && unlink(name.c_str()) == 0)
            removed++;
        close(fd);
    }
    return removed;
}

const char* KindOfFile(mode_t mode)
{
    if (S_ISDIR(mode))
        return "a directory";
    if (S_ISCHR(mode))
        return "a character device";
    if (S_ISBLK(mode))
        return "a block device";
    if (S_ISFIFO(mode))
        return "a named pipe";
    if (S_ISSOCK(mode))
        return "a socket";
    return "not a file";
}

} // namespace

std::string CatalogueTarget(const std::string& path)
{
    // As many links as the system itself follows before it gives up (ELOOP).
    constexpr int kMaxLinks = 40;
    std::string target = path;
    for (int links = 0;; links++) {
        struct stat st;
        if (lstat(target.c_str(), &st) != 0) {
            if (errno == ENOENT)
                return target; // a new file
            throw ImportError(path, 0, Reason("cannot look at it", errno));
        }
        if (S_ISREG(st.st_mode))
            return target;
        if (!S_ISLNK(st.st_mode)) {
            const std::string what
                = target == path ? std::string("is ") : "leads to " + target + ", which is ";
            throw ImportError(path, 0,
                what + KindOfFile(st.st_mode)
                    + ", not a regular file; a catalogue replaces only a regular file");
        }
        std::error_code error;
        const fs::path next = fs::read_symlink(target, error);
        if (error)
            throw ImportError(path, 0, Reason("cannot follow the link", error.value()));
        if (links == kMaxLinks)
            throw ImportError(path, 0, Reason("cannot follow the link", ELOOP));
        target
            = next.is_absolute() ? next.string() : (fs::path(target).parent_path() / next).string();
    }
}

WriteSummary WriteCatalogue(const std::string& path, const std::vector<ImportStar>& stars,
    const std::vector<StarGroup>& systems)
{
    const std::string target = CatalogueTarget(path);
    // The catalogue replaced keeps its permissions; a new one is readable like any data file.
    struct stat old;
    const mode_t mode = stat(target.c_str(), &old) == 0 ? old.st_mode & 07777 : 0644;
    const int64_t leftovers = RemoveLeftovers(target);

    WriteSummary summary;
    int64_t bytes = 0;
    {
        TemporaryCatalogue temporary(target, path);
        summary = FormatCatalogue(temporary.File(), stars, systems);
        if (std::fflush(temporary.File()) != 0 || (bytes = std::ftell(temporary.File())) < 0)
            throw ImportError(path, 0, Reason("cannot write", errno));
        temporary.Replace(mode);
    }
    summary.leftoversRemoved = leftovers;

    // The other names, written after the catalogue they go with: a run killed in between
    // leaves a names file whose size no longer matches, which the program passes over.
    summary.namesFile = NamesFileOf(path);
    const std::string namesTarget = CatalogueTarget(summary.namesFile);
    struct stat oldNames;
    const mode_t namesMode
        = stat(namesTarget.c_str(), &oldNames) == 0 ? oldNames.st_mode & 07777 : mode;
    summary.leftoversRemoved += RemoveLeftovers(namesTarget);
    TemporaryCatalogue names(namesTarget, summary.namesFile);
    FormatNames(names.File(), stars, systems, bytes, summary);
    names.Replace(namesMode);
    return summary;
}
