// The name tests. Without regard to case, both the search text and each name are lower-cased
// into the two buffers made once with the query, so a run over a million systems allocates
// nothing. The lower case of a byte is the C library's tolower, asked once a run for each of
// the 256 byte values (so it follows the locale in force) and looked up in a table after that:
// a call of tolower for every byte of every name took a third of a run's time. A system also
// matches by any of the other names its stars go by (the universe's otherNames), which are
// compared byte by byte through the same table instead of being copied.
#include "query/StarNameQuery.h"

#include "catalog/Universe.h"

#include <cassert>
#include <cctype>
#include <cstdlib>
#include <cstring>

namespace {

// Copies text, its NUL included, lower-cased through lower into buffer.
void LowerCopy(char* buffer, const char* text, const unsigned char* lower)
{
    for (int32_t i = 0;; i++) {
        const char c = text[i];
        buffer[i] = static_cast<char>(lower[static_cast<unsigned char>(c)]);
        if (c == '\0')
            return;
    }
}

// The mode's test of pattern (patternLength bytes and its NUL) against name, each byte of the
// name taken through fold as it is read: the tests of the member functions below, for the
// names of the names arena, which are not copied to be lower-cased.
template <typename Fold>
bool Matches(int32_t mode, const char* pattern, int32_t patternLength, const char* name, Fold fold)
{
    switch (mode) {
    case kNameIs:
        for (int32_t k = 0; k <= patternLength; k++) {
            if (pattern[k] != fold(name[k]))
                return false;
        }
        return true;
    case kNameStartsWith:
        for (int32_t k = 0; k < patternLength; k++) {
            if (pattern[k] != fold(name[k]))
                return false;
        }
        return true;
    case kNameContains:
        for (int32_t s = 0; name[s] != '\0'; s++) {
            int32_t k = 0;
            while (k < patternLength && pattern[k] == fold(name[s + k]))
                k++;
            if (k == patternLength)
                return true;
        }
        return false;
    default:
        return false;
    }
}

// Whether any name from begin to end (NUL-terminated names one after the other) passes the
// mode's test.
template <typename Fold>
bool AnyMatches(int32_t mode, const char* pattern, int32_t patternLength, const char* begin,
    const char* end, Fold fold)
{
    for (const char* name = begin; name < end; name += std::strlen(name) + 1) {
        if (Matches(mode, pattern, patternLength, name, fold))
            return true;
    }
    return false;
}

// Whether pattern (patternLength bytes, at least one) occurs in the names from begin to end,
// each byte of the names taken through fold. The names are separated by their NULs and the
// pattern holds none, so an occurrence never runs from one name into the next: the names are
// searched as one text. Where the pattern may start is found with memchr for each of the
// `firsts` bytes (at most two) that fold to its first byte, or byte by byte when firsts is 0.
template <typename Fold>
bool BlockContains(const char* begin, const char* end, const char* pattern, int32_t patternLength,
    const unsigned char* first, int32_t firsts, Fold fold)
{
    // The rest of the pattern at s; a NUL folds to NUL and differs, so no read passes the NUL
    // that ends the last name.
    const auto restAt = [&](const char* s) {
        for (int32_t k = 1; k < patternLength; k++) {
            if (pattern[k] != fold(s[k]))
                return false;
        }
        return true;
    };
    if (firsts == 0) {
        for (const char* s = begin; s < end; s++) {
            if (fold(*s) == pattern[0] && restAt(s))
                return true;
        }
        return false;
    }
    const auto next = [end](const char* from, unsigned char byte) {
        return static_cast<const char*>(std::memchr(from, byte, size_t(end - from)));
    };
    const char* a = next(begin, first[0]);
    const char* b = firsts > 1 ? next(begin, first[1]) : nullptr;
    while (a || b) {
        const bool fromA = a && (!b || a < b);
        const char* s = fromA ? a : b;
        if (restAt(s))
            return true;
        if (fromA)
            a = next(a + 1, first[0]);
        else
            b = next(b + 1, first[1]);
    }
    return false;
}

} // namespace

StarNameQuery::StarNameQuery(Universe* universe)
    : StarSysQuery(universe)
    , nameBuffer(static_cast<char*>(std::malloc(kNameBufferSize)))
    , patternBuffer(static_cast<char*>(std::malloc(kNameBufferSize)))
    , pattern(patternBuffer)
    , candidate(nameBuffer)
    , patternLength(0)
{
    nameBuffer[0] = '\0';
    patternBuffer[0] = '\0';
    FillLowerTable();
}

StarNameQuery::~StarNameQuery()
{
    std::free(nameBuffer);
    std::free(patternBuffer);
}

void StarNameQuery::FillLowerTable()
{
    for (int32_t c = 0; c < 256; c++)
        lower[c] = static_cast<unsigned char>(std::tolower(c));
}

int32_t StarNameQuery::GetSysMask(StarSysMask* mask, void* param)
{
    const auto* p = static_cast<const NameQueryParam*>(param);
    patternLength = static_cast<int32_t>(std::strlen(p->text));
    assert(patternLength < kNameBufferSize);
    if (p->caseSensitive) {
        pattern = p->text;
    } else {
        FillLowerTable();
        LowerCopy(patternBuffer, p->text, lower);
        pattern = patternBuffer;
    }
    FindFirstBytes(p->caseSensitive);
    return StarSysQuery::GetSysMask(mask, param);
}

void StarNameQuery::FindFirstBytes(bool caseSensitive)
{
    firstByteCount = 0;
    if (patternLength == 0)
        return;
    const auto wanted = static_cast<unsigned char>(pattern[0]);
    if (caseSensitive) {
        firstBytes[firstByteCount++] = wanted;
        return;
    }
    int32_t found = 0;
    for (int32_t c = 1; c < 256; c++) {
        if (lower[c] == wanted && found++ < 2)
            firstBytes[found - 1] = static_cast<unsigned char>(c);
    }
    // More than two are searched for byte by byte.
    firstByteCount = found <= 2 ? found : 0;
}

bool StarNameQuery::Query(int32_t index, void* param)
{
    void* const* systems = Systems();
    PrefetchMembers(systems, index + 2 * kPrefetchAhead);
    PrefetchFirstStar(systems, index + kPrefetchAhead);
    const auto* p = static_cast<const NameQueryParam*>(param);
    const StarSystem* system = static_cast<const StarSystem*>(systems[index]);
    const int32_t members = system->CountItems();
    for (int32_t i = 0; i < members; i++) {
        const char* name = static_cast<const GravSystem*>(system->ItemAtFast(i))->GetName();
        if (p->caseSensitive) {
            candidate = name;
        } else {
            LowerCopy(nameBuffer, name, lower);
            candidate = nameBuffer;
        }
        bool match;
        switch (p->mode) {
        case kNameIs:
            match = Is();
            break;
        case kNameContains:
            match = Contains();
            break;
        case kNameStartsWith:
            match = StartsWith();
            break;
        default:
            return false;
        }
        if (match)
            return true;
    }
    // Then every other name the stars of the system go by.
    const StarNames::Range others = universe->otherNames.Of(index);
    if (others.begin == others.end)
        return false;
    const auto same = [](char c) { return c; };
    const auto folded
        = [this](char c) { return static_cast<char>(lower[static_cast<unsigned char>(c)]); };
    if (p->mode == kNameContains && patternLength > 0) {
        if (p->caseSensitive)
            return BlockContains(
                others.begin, others.end, pattern, patternLength, firstBytes, firstByteCount, same);
        return BlockContains(
            others.begin, others.end, pattern, patternLength, firstBytes, firstByteCount, folded);
    }
    if (p->caseSensitive)
        return AnyMatches(p->mode, pattern, patternLength, others.begin, others.end, same);
    return AnyMatches(p->mode, pattern, patternLength, others.begin, others.end, folded);
}

// The bytes up to and including the pattern's NUL agree: the whole name equals the pattern.
// A shorter name differs at its own NUL, so no byte after it is read.
bool StarNameQuery::Is() const
{
    for (int32_t k = 0; k <= patternLength; k++) {
        if (pattern[k] != candidate[k])
            return false;
    }
    return true;
}

// The first patternLength bytes agree; an empty pattern starts every name.
bool StarNameQuery::StartsWith() const
{
    for (int32_t k = 0; k < patternLength; k++) {
        if (pattern[k] != candidate[k])
            return false;
    }
    return true;
}

// The pattern is found at some start position of a non-empty name; an empty pattern is found
// in every non-empty name and in no empty one. Comparing at a start position stops at the
// first differing byte: pattern bytes are never NUL, so a window that runs past the name's end
// differs at the name's NUL and could not match anyway.
bool StarNameQuery::Contains() const
{
    for (int32_t s = 0; candidate[s] != '\0'; s++) {
        int32_t k = 0;
        while (k < patternLength && pattern[k] == candidate[s + k])
            k++;
        if (k == patternLength)
            return true;
    }
    return false;
}
