// The other names of a universe's stars (catalogue numbers, Bayer and Flamsteed designations,
// survey designations), kept by system so that a name search can look at every name of a
// system's stars. A star's own shown name stays in the star: these are only ever searched.
//
// A million systems with several names each would cost a string object and a heap block per
// name if kept one by one; here every name lives in one arena, each followed by its NUL, a
// system's names one after the other, and one 32-bit end offset per system says where its
// names stop.
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <vector>

class Universe;

class StarNames {
public:
    // The names of one system: NUL-terminated names packed one after the other from begin to
    // end (begin == end when the system has none).
    struct Range {
        const char* begin;
        const char* end;
    };

    // Adds name (1 or more bytes, no NUL among them) to the names of system. Systems are filled
    // in increasing order: a name for a system before the last one filled is refused, as are an
    // empty name and a name that would carry the arena past what 32-bit offsets reach. True when
    // it was kept.
    bool Add(int32_t system, const char* name, size_t length);

    // Gives back the room the arena and the offsets grew into beyond what they hold.
    void Trim();
    void Clear();

    Range Of(int32_t system) const
    {
        if (system < 0 || size_t(system) >= fEnd.size())
            return { nullptr, nullptr };
        const char* text = fText.data();
        return { text + (system == 0 ? 0 : fEnd[system - 1]), text + fEnd[system] };
    }

    // Every system's names, in system order.
    Range All() const { return { fText.data(), fText.data() + fText.size() }; }

    // How many times byte occurs in the names held: searches look first for the pattern's
    // rarest byte.
    uint64_t ByteCount(unsigned char byte) const { return fByteCount[byte]; }

    bool Empty() const { return fText.empty(); }
    int64_t Count() const { return fCount; } // names held
    size_t TextBytes() const { return fText.size(); } // the arena, NULs included
    // Heap bytes held, capacity included.
    size_t Bytes() const { return fText.capacity() + fEnd.capacity() * sizeof(uint32_t); }

private:
    std::vector<char> fText; // every name and its NUL, in system order
    std::vector<uint32_t> fEnd; // per system from 0: where its names end in fText
    int64_t fCount = 0;
    uint64_t fByteCount[256] = {};
};

// What reading a names file met that a well-made one does not hold. Lines are the file's own,
// counted from 1.
struct StarNamesReport {
    // The first line is not "nightdome names 1", line 2 is not two numbers, or the file holds a
    // NUL byte: it is no names file this program reads, and nothing of it was kept.
    bool notNames = false;

    // Line 2 names another catalogue than the one read (its star count or its size in bytes
    // differ): the file is stale, and nothing of it was kept.
    bool stale = false;
    uint64_t namedStars = 0, namedBytes = 0; // what line 2 says
    uint64_t stars = 0, bytes = 0; // what the catalogue read holds

    // Lines dropped whole, and what was wrong with the first of them.
    enum Cause {
        kBadIndex, // the star index is not a number
        kNoSuchStar, // the catalogue has no star of that index
        kOutOfOrder, // the index does not come after the one of the line before
        kNoNames, // no name follows the index
        kLongLine, // longer than kMaxNamesLine characters
    };
    int64_t badLines = 0;
    int64_t badLinesLine = 0;
    Cause cause = kBadIndex;

    // Names dropped from lines otherwise kept: empty, longer than 79 characters, or holding a
    // character that is not printable ASCII; and the line of the first.
    int64_t badNames = 0;
    int64_t badNamesLine = 0;

    // Names beyond what the program holds (4 GiB of names), dropped.
    int64_t dropped = 0;

    bool Clean() const
    {
        return !notNames && !stale && badLines == 0 && badNames == 0 && dropped == 0;
    }
    bool operator==(const StarNamesReport&) const = default;
};

// The first line of every names file.
inline constexpr char kStarNamesMagic[] = "nightdome names 1";
// A line of a names file is read up to this many characters: some thousand names for one star,
// far more than any star has.
inline constexpr size_t kMaxNamesLine = size_t(1) << 16;
// A name holds at most this many characters.
inline constexpr size_t kMaxOtherName = 79;

// Reads a names file from file, from where it stands, into universe->otherNames, replacing
// what was there: for each star the catalogue lines gave universe, by its 0-based position in
// the catalogue. catalogueBytes is the size of the catalogue file read, which line 2 must
// name, as it must name the number of stars universe holds; when the catalogue was read only up
// to a limit (cut), line 2 must name at least that many stars and names of the stars not read
// are passed over. What the reading met goes to report when one is given. window is the size of
// each read (tests and fuzzing make it small).
void ReadStarNames(std::FILE* file, uint64_t catalogueBytes, bool cut, Universe* universe,
    StarNamesReport* report = nullptr, size_t window = size_t(1) << 20);
