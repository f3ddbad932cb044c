// Reading the catalogue file and generating random universes.
#include "catalog/Universe.h"

#include "catalog/CNumbers.h"
#include "catalog/Star.h"
#include "core/Constants.h"
#include "platform/ExecutablePath.h"
#include "render/SpectralTables.h"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <cstring>
#include <filesystem>
#include <memory>
#include <vector>

namespace {

// A line is read up to its line feed or to this many characters; a longer line is split, its
// next character dropped as if it were the line feed.
constexpr size_t kMaxLine = 500;
// Names are kept to this many characters.
constexpr size_t kMaxName = 79;
// One record is two lines and their two line ends (a line feed, or a carriage return and a
// line feed).
constexpr size_t kMaxRecord = 2 * (kMaxLine + 2);

// Bytes past the window the readers of words and numbers may load (and ignore): sixteen
// characters of a number after its minus.
constexpr size_t kLoadSlack = 17;

// One line of the catalogue text: where its characters stand, how many were taken, and whether
// the line went on past them (so that its rest is read as the next line).
struct CatalogueLine {
    const char* text;
    size_t length;
    bool split;
};

// The catalogue text seen through a sliding window that always holds a whole record when the
// file has one left.
class CatalogueText {
public:
    CatalogueText(std::FILE* file, size_t window, const CatalogueProgress& progress)
        : fFile(file)
        , fBuffer(window + kMaxRecord + kLoadSlack)
        , fProgress(progress)
    {
        std::setvbuf(file, nullptr, _IONBF, 0);
    }

    // True while the read position is inside the text, and the text is text.
    bool More()
    {
        if (!fEnded && !fBinary && fLimit - fPosition < kMaxRecord)
            Refill();
        return !fBinary && fPosition < fLimit;
    }

    // Whether a NUL byte has been read: no text holds one.
    bool Binary() const { return fBinary; }

    // How far the buffer may be loaded from, past the text's end: the readers of words and
    // numbers take sixteen characters at a time and ignore those past a line's end.
    const char* Readable() const { return fBuffer.data() + fBuffer.size(); }

    // The next line: its characters up to the line feed, at most kMaxLine of them; the read
    // position then steps over one more character. A carriage return before the line feed
    // belongs to the line end, so catalogues written with CR LF read as with LF alone.
    CatalogueLine Line()
    {
        const char* start = fBuffer.data() + std::min(fPosition, fLimit);
        const size_t left = fPosition < fLimit ? fLimit - fPosition : 0;
        const size_t available = std::min(kMaxLine, left);
        const void* feed = std::memchr(start, '\n', available);
        size_t length = feed ? static_cast<const char*>(feed) - start : available;
        size_t step = length + 1;
        bool split = false;
        if (feed || (length < left && start[length] == '\n')) {
            // A line of at most kMaxLine characters before its line feed.
            if (length > 0 && start[length - 1] == '\r')
                length--;
        } else if (length + 1 < left && start[length] == '\r' && start[length + 1] == '\n') {
            // kMaxLine characters, then CR LF: one line end, not a split line.
            step++;
        } else {
            // Longer than kMaxLine, unless the text ends here: the next character is dropped
            // and what follows it is read as the next line.
            split = length < left;
        }
        fPosition += step;
        return { start, length, split };
    }

private:
    void Refill()
    {
        const size_t kept = fPosition < fLimit ? fLimit - fPosition : 0;
        std::memmove(fBuffer.data(), fBuffer.data() + fLimit - kept, kept);
        fLimit = kept;
        fPosition = 0;
        const size_t capacity = fBuffer.size() - kLoadSlack;
        while (!fEnded && fLimit < capacity) {
            const size_t got = std::fread(fBuffer.data() + fLimit, 1, capacity - fLimit, fFile);
            if (std::memchr(fBuffer.data() + fLimit, '\0', got))
                fBinary = true;
            fLimit += got;
            fRead += got;
            if (got == 0)
                fEnded = true;
        }
        if (fProgress)
            fProgress(fRead);
    }

    std::FILE* fFile;
    std::vector<char> fBuffer;
    const CatalogueProgress& fProgress;
    size_t fPosition = 0;
    size_t fLimit = 0;
    uint64_t fRead = 0; // bytes read from the file
    bool fEnded = false;
    bool fBinary = false;
};

// Notes a record with a problem of one kind: one more, and the line of the first.
void Count(int64_t* records, int64_t* firstLine, int64_t line)
{
    if ((*records)++ == 0)
        *firstLine = line;
}

// Reads a number that is not finite as 0, as one that cannot be read reads; true when it was.
bool ZeroIfNotFinite(double* value)
{
    if (std::isfinite(*value))
        return false;
    *value = 0;
    return true;
}

// Class texts already parsed. A catalogue holds a few thousand different texts among a
// million stars; parsing one is the same work every time. Texts of up to 7 characters are
// remembered, keyed by their bytes, one per slot.
class ClassMemo {
public:
    // text may be loaded eight bytes from its start, past its NUL.
    const SpectralClass& Parsed(const char* text)
    {
        uint64_t word;
        std::memcpy(&word, text, sizeof word);
        // The lowest byte that is zero gets its high bit set here, and no byte below it does.
        const uint64_t zeros = (word - 0x0101010101010101u) & ~word & 0x8080808080808080u;
        if (zeros == 0) {
            fLong.SetSpectralClass(text);
            return fLong;
        }
        // The text's bytes, without what follows its NUL.
        const uint64_t key = word & ((zeros ^ (zeros - 1)) >> 8);
        Slot& slot = fSlots[(key * 0x9E3779B97F4A7C15u) >> (64 - kSlotBits)];
        if (!slot.used || slot.key != key) {
            slot.parsed.SetSpectralClass(text);
            slot.key = key;
            slot.used = true;
        }
        return slot.parsed;
    }

private:
    static constexpr int kSlotBits = 8;
    struct Slot {
        uint64_t key = 0;
        bool used = false;
        SpectralClass parsed;
    };
    Slot fSlots[size_t(1) << kSlotBits];
    SpectralClass fLong;
};

// Luminosities of magnitudes already met: written with two or three decimals, a million stars
// have a few tens of thousands of different magnitudes, and pow is dear. Keyed by the
// magnitude's bits, so every luminosity is the very value SolarLuminosity gives.
class LuminosityMemo {
public:
    double Of(double magnitude)
    {
        uint64_t bits;
        std::memcpy(&bits, &magnitude, sizeof bits);
        Slot& slot = fSlots[(bits * 0x9E3779B97F4A7C15u) >> (64 - kSlotBits)];
        if (slot.bits != bits) {
            slot.bits = bits;
            slot.luminosity = SolarLuminosity(magnitude);
        }
        return slot.luminosity;
    }

private:
    static constexpr int kSlotBits = 13;
    // A NaN's bits: magnitudes reaching here are finite, so no slot matches before it is set.
    static constexpr uint64_t kNone = ~uint64_t(0);
    struct Slot {
        uint64_t bits = kNone;
        double luminosity = 0;
    };
    std::vector<Slot> fSlots = std::vector<Slot>(size_t(1) << kSlotBits);
};

// Appends systems to a universe in runs: room for kRun of them is added at once, as a list of
// that many empty places, and each system is then written into its place; Finish takes out
// the places left over. Appending a million systems one by one costs a capacity reckoning
// with two divisions and a call to memmove each.
class SystemAppender {
public:
    explicit SystemAppender(Universe* universe)
        : fUniverse(universe)
        , fNext(universe->CountItems())
        , fEnd(fNext)
    {
    }
    SystemAppender(const SystemAppender&) = delete;
    SystemAppender& operator=(const SystemAppender&) = delete;

    void Append(StarSystem* system)
    {
        if (fNext == fEnd)
            Grow();
        fUniverse->Items()[fNext++] = system;
    }

    // Leaves the universe with the systems appended and no empty place.
    void Finish()
    {
        while (fUniverse->CountItems() > fNext)
            fUniverse->RemoveItem(fUniverse->CountItems() - 1);
        fEnd = fNext;
    }

private:
    static constexpr int32_t kRun = 4096;

    void Grow()
    {
        if (fPlaces.IsEmpty()) {
            for (int32_t i = 0; i < kRun; i++)
                fPlaces.AddItem(nullptr);
        }
        fUniverse->AddList(&fPlaces);
        fEnd = fUniverse->CountItems();
    }

    Universe* fUniverse;
    BList fPlaces { kRun };
    int32_t fNext; // where the next system goes
    int32_t fEnd; // past the last empty place
};

std::filesystem::path CataloguePath(const char* fileName)
{
    const std::filesystem::path path(fileName);
    if (path.is_absolute())
        return path;
    return ExecutableDirectory() / path;
}

} // namespace

const ColorTable* SpectralTableFor(HarvardClass hc)
{
    if (!gSpectralCTable)
        return nullptr;
    const int table = hc >= kClassO && hc <= kClassM ? hc - kClassO : kClassG - kClassO;
    return gSpectralCTable + table;
}

Universe::Universe(int32_t blockSize)
    : BList(blockSize)
{
}

bool ReadCatalogue(std::FILE* file, int32_t maxStars, Universe* universe, size_t window,
    CatalogueReport* report, const CatalogueProgress& progress)
{
    CatalogueText text(file, window, progress);
    CatalogueReport met;
    const int32_t before = universe->CountItems();
    // The scan targets live across records: a line with fewer fields keeps the values the
    // record before it had.
    char classText[kMaxLine + 1] = "";
    double magnitude = 0, x = 0, y = 0, z = 0;
    SVector previous(0, 0, 314000); // no catalogue star sits there
    CatalogueArena* arena = universe->Arena();
    StarSystem* system = nullptr;
    auto classes = std::make_unique<ClassMemo>();
    LuminosityMemo luminosities;
    SystemAppender systems(universe);

    int64_t line = 1; // of the file, where the next line starts
    int32_t records = 0;
    for (; records < maxStars && text.More(); records++) {
        const CatalogueLine nameLine = text.Line();
        const int64_t nameAt = line;
        line += nameLine.split ? 0 : 1;
        // One copy of the name, cut to kMaxName, shared by the star and the system it opens.
        char* name = arena->Keep(nameLine.text, std::min(nameLine.length, kMaxName));

        const CatalogueLine dataLine = text.Line();
        const int64_t dataAt = line;
        line += dataLine.split ? 0 : 1;
        const int fields = ScanCatalogueData(dataLine.text, dataLine.text + dataLine.length,
            text.Readable(), classText, &magnitude, &x, &y, &z);

        if (nameLine.split || dataLine.split || fields < 5) {
            if (met.malformed == 0)
                met.cause = nameLine.split ? CatalogueReport::kLongName
                    : dataLine.split       ? CatalogueReport::kLongData
                                           : CatalogueReport::kMissingFields;
            Count(&met.malformed, &met.malformedLine, nameLine.split ? nameAt : dataAt);
        }
        // Every number not finite is read as 0, not only the first.
        const int zeroed = int(ZeroIfNotFinite(&magnitude)) + int(ZeroIfNotFinite(&x))
            + int(ZeroIfNotFinite(&y)) + int(ZeroIfNotFinite(&z));
        if (zeroed > 0)
            Count(&met.nonFinite, &met.nonFiniteLine, dataAt);
        if (std::fabs(x) > kFarthestCatalogueStar || std::fabs(y) > kFarthestCatalogueStar
            || std::fabs(z) > kFarthestCatalogueStar
            || std::fabs(magnitude) > kBrightestCatalogueMagnitude)
            Count(&met.outOfRange, &met.outOfRangeLine, dataAt);

        auto* star
            = arena->Make<Star>(GravName::Kept(name), classes->Parsed(classText), magnitude, 1);
        // A first record at the sentinel position still opens a system of its own.
        if (!system || x != previous.x || y != previous.y || z != previous.z) {
            previous.Set(x, y, z);
            const double luminosity = luminosities.Of(magnitude);
            system = arena->Make<StarSystem>(GravName::Kept(name), previous, luminosity,
                SpectralTableFor(star->spectralClass.harvardClass), 2);
            systems.Append(system);
        }
        system->AddItem(star);
    }
    systems.Finish();
    const bool cut = records >= maxStars && text.More();
    if (text.Binary()) {
        // Not a catalogue: nothing of it stays.
        while (universe->CountItems() > before)
            GravSystem::Destroy(
                static_cast<StarSystem*>(universe->RemoveItem(universe->CountItems() - 1)));
        met = CatalogueReport();
        met.notText = true;
    }
    if (report)
        *report = met;
    return cut && !met.notText;
}

Universe::Universe(const char* fileName, int32_t maxStars, int32_t blockSize)
    : BList(blockSize)
{
    if (!fileName)
        return;
    std::unique_ptr<std::FILE, int (*)(std::FILE*)> file(
        std::fopen(CataloguePath(fileName).c_str(), "rb"), &std::fclose);
    if (file)
        ReadCatalogue(file.get(), maxStars, this);
}

Universe::Universe(double radius, stellarDensity density, int32_t blockSize, Random random)
    : BList(blockSize)
{
    // pi, not 4/3 pi: the count is a density over the generator's cube, not a sphere.
    const auto count = static_cast<int64_t>(
        kPI * radius * radius * radius * static_cast<int32_t>(density) * 0.01);
    Scatter(count, radius, random);
}

Universe* Universe::Generate(
    int32_t count, stellarDensity density, int32_t blockSize, Random random)
{
    // The radius at which the constructor above would make count systems.
    const double radius
        = std::cbrt(std::max(count, 0) / (kPI * static_cast<int32_t>(density) * 0.01));
    auto* universe = new Universe(blockSize);
    universe->Scatter(std::max(count, 0), radius, random);
    return universe;
}

void Universe::Scatter(int64_t count, double radius, Random& random)
{
    // A million systems in the arena, sharing one empty name: no allocation of their own.
    char* unnamed = fArena.Keep("", 0);
    for (int64_t i = 0; i < count; i++) {
        const double x = random.Rand(20000) * 0.0001 * radius - radius;
        const double y = random.Rand(20000) * 0.0001 * radius - radius;
        const double z = random.Rand(20000) * 0.0001 * radius - radius;
        AddItem(
            fArena.Make<StarSystem>(GravName::Kept(unnamed), SVector(x, y, z), 1.0, nullptr, 5));
    }
}

Universe::~Universe()
{
    const int32_t count = CountItems();
    for (int32_t i = 0; i < count; i++)
        GravSystem::Destroy(static_cast<StarSystem*>(ItemAtFast(i)));
}
