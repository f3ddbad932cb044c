// The names arena and the reader of the names file that may stand beside a catalogue
// ("stars.names" beside "stars.dat"): a first line "nightdome names 1", a second line with the
// catalogue's star count and size in bytes, then one line per star that has other names, its
// 0-based index in the catalogue and each name after a tab, the stars in increasing order.
#include "catalog/StarNames.h"

#include "catalog/Universe.h"

#include <algorithm>
#include <charconv>
#include <cstring>
#include <iterator>
#include <limits>
#include <string>
#include <string_view>

bool StarNames::Add(int32_t system, const char* name, size_t length)
{
    if (system < 0 || length == 0 || (!fEnd.empty() && size_t(system) + 1 < fEnd.size()))
        return false;
    if (fText.size() + length + 1 > std::numeric_limits<uint32_t>::max())
        return false;
    while (fEnd.size() <= size_t(system))
        fEnd.push_back(static_cast<uint32_t>(fText.size()));
    fText.insert(fText.end(), name, name + length);
    for (size_t i = 0; i < length; i++)
        fByteCount[static_cast<unsigned char>(name[i])]++;
    fText.push_back('\0');
    fEnd.back() = static_cast<uint32_t>(fText.size());
    fCount++;
    return true;
}

void StarNames::Trim()
{
    fText.shrink_to_fit();
    fEnd.shrink_to_fit();
}

void StarNames::Clear()
{
    fText = {};
    fEnd = {};
    fCount = 0;
    std::fill(std::begin(fByteCount), std::end(fByteCount), 0);
}

namespace {

// The lines of a file read window by window. A line longer than kMaxNamesLine is cut there
// and said to be so; the rest of it is passed over. Reading stops at the first NUL byte, which
// no text holds.
class NamesLines {
public:
    NamesLines(std::FILE* file, size_t window)
        : fFile(file)
        , fBuffer(window > 0 ? window : 1)
    {
    }

    // The next line, without its line feed or a carriage return before it; false at the end.
    bool Next(std::string_view* line, bool* tooLong)
    {
        fLine.clear();
        *tooLong = false;
        bool any = false;
        for (;;) {
            if (fPosition == fLimit && !Refill())
                break;
            any = true;
            const char* start = fBuffer.data() + fPosition;
            const size_t left = fLimit - fPosition;
            const void* feed = std::memchr(start, '\n', left);
            const size_t length = feed ? static_cast<const char*>(feed) - start : left;
            const size_t room = kMaxNamesLine + 1 - fLine.size();
            if (length >= room)
                *tooLong = true;
            fLine.append(start, length < room ? length : room);
            fPosition += length;
            if (feed) {
                fPosition++;
                break;
            }
        }
        if (!any || fBinary)
            return false;
        if (fLine.size() > kMaxNamesLine) {
            *tooLong = true;
            fLine.resize(kMaxNamesLine);
        }
        if (!*tooLong && !fLine.empty() && fLine.back() == '\r')
            fLine.pop_back();
        *line = fLine;
        return true;
    }

    // Reads the rest of the file only to see whether it holds a NUL byte.
    void Drain()
    {
        while (Refill()) { }
    }

    bool Binary() const { return fBinary; }

private:
    bool Refill()
    {
        if (fBinary)
            return false;
        fPosition = 0;
        fLimit = std::fread(fBuffer.data(), 1, fBuffer.size(), fFile);
        if (std::memchr(fBuffer.data(), '\0', fLimit))
            fBinary = true;
        return fLimit > 0 && !fBinary;
    }

    std::FILE* fFile;
    std::vector<char> fBuffer;
    std::string fLine; // the line being read, kept so that its room is reused
    size_t fPosition = 0;
    size_t fLimit = 0;
    bool fBinary = false;
};

// Notes one more of a kind of problem, and the line of the first.
void Count(int64_t* count, int64_t* firstLine, int64_t line)
{
    if ((*count)++ == 0)
        *firstLine = line;
}

// A whole field of decimal digits as a number; false for anything else.
bool ReadNumber(std::string_view field, uint64_t* value)
{
    if (field.empty() || field[0] < '0' || field[0] > '9')
        return false;
    const auto [end, error] = std::from_chars(field.data(), field.data() + field.size(), *value);
    return error == std::errc() && end == field.data() + field.size();
}

// Line 2: the catalogue's star count and size in bytes, one blank between.
bool ReadSizes(std::string_view line, uint64_t* stars, uint64_t* bytes)
{
    const size_t blank = line.find(' ');
    return blank != std::string_view::npos && ReadNumber(line.substr(0, blank), stars)
        && ReadNumber(line.substr(blank + 1), bytes);
}

// 1 to kMaxOtherName printable ASCII characters.
bool GoodName(std::string_view name)
{
    if (name.empty() || name.size() > kMaxOtherName)
        return false;
    for (const char c : name) {
        if (c < ' ' || c > '~')
            return false;
    }
    return true;
}

// The catalogue index of the first star of each system, and after the last the number of
// stars. Systems are separate heap objects, and a wait on memory for each made this one pass
// most of the reading's time: the systems some places ahead are asked for while one is counted.
std::vector<uint64_t> FirstStars(const Universe& universe)
{
    constexpr int32_t kAhead = 16;
    const int32_t systems = universe.CountItems();
    void* const* items = universe.Items();
    std::vector<uint64_t> first(size_t(systems) + 1, 0);
    for (int32_t s = 0; s < systems; s++) {
        if (s + kAhead < systems)
            __builtin_prefetch(items[s + kAhead]);
        first[size_t(s) + 1]
            = first[size_t(s)] + uint64_t(static_cast<const StarSystem*>(items[s])->CountItems());
    }
    return first;
}

// The data lines after the two of the header: each star's names filed under its system.
void ReadNameLines(NamesLines& lines, bool cut, const std::vector<uint64_t>& firstStars,
    StarNames* names, StarNamesReport* met)
{
    const auto bad = [met](int64_t line, StarNamesReport::Cause cause) {
        if (met->badLines == 0)
            met->cause = cause;
        Count(&met->badLines, &met->badLinesLine, line);
    };
    // The system of the last star named.
    int32_t system = 0;
    bool named = false; // whether a line has been kept yet
    uint64_t previous = 0; // the star index of the last line kept
    std::string_view line;
    bool tooLong = false;
    for (int64_t number = 3; lines.Next(&line, &tooLong); number++) {
        if (tooLong) {
            bad(number, StarNamesReport::kLongLine);
            continue;
        }
        const size_t tab = line.find('\t');
        uint64_t star = 0;
        if (!ReadNumber(line.substr(0, tab), &star)) {
            bad(number, StarNamesReport::kBadIndex);
            continue;
        }
        if (star >= met->stars) {
            // The stars past the limit of a catalogue read only in part are not there to name.
            if (!cut)
                bad(number, StarNamesReport::kNoSuchStar);
            continue;
        }
        if (named && star <= previous) {
            bad(number, StarNamesReport::kOutOfOrder);
            continue;
        }
        if (tab == std::string_view::npos) {
            bad(number, StarNamesReport::kNoNames);
            continue;
        }
        named = true;
        previous = star;
        while (firstStars[size_t(system) + 1] <= star)
            system++;

        std::string_view rest = line.substr(tab + 1);
        for (;;) {
            const size_t next = rest.find('\t');
            const std::string_view name = rest.substr(0, next);
            if (!GoodName(name))
                Count(&met->badNames, &met->badNamesLine, number);
            else if (!names->Add(system, name.data(), name.size()))
                met->dropped++;
            if (next == std::string_view::npos)
                break;
            rest = rest.substr(next + 1);
        }
    }
}

} // namespace

void ReadStarNames(std::FILE* file, uint64_t catalogueBytes, bool cut, Universe* universe,
    StarNamesReport* report, size_t window)
{
    StarNames* names = &universe->otherNames;
    names->Clear();
    StarNamesReport met;
    const std::vector<uint64_t> firstStars = FirstStars(*universe);
    met.stars = firstStars.back();
    met.bytes = catalogueBytes;

    NamesLines lines(file, window);
    std::string_view line;
    bool tooLong = false;
    if (!lines.Next(&line, &tooLong) || tooLong || line != kStarNamesMagic
        || !lines.Next(&line, &tooLong) || tooLong
        || !ReadSizes(line, &met.namedStars, &met.namedBytes)) {
        met.notNames = true;
        met.namedStars = met.namedBytes = 0;
    } else if (met.namedBytes != catalogueBytes
        || (cut ? met.namedStars < met.stars : met.namedStars != met.stars)) {
        met.stale = true;
    } else {
        ReadNameLines(lines, cut, firstStars, names, &met);
    }
    // A NUL byte anywhere makes it no names file, however far the reading went.
    lines.Drain();
    if (lines.Binary()) {
        // No names file: nothing of it stays.
        names->Clear();
        const StarNamesReport read = met;
        met = StarNamesReport();
        met.stars = read.stars;
        met.bytes = read.bytes;
        met.notNames = true;
    }
    names->Trim();
    if (report)
        *report = met;
}
