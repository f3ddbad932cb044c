// The other names of a system lie together in the names arena, each ended by its NUL, and the
// systems' names follow one another in index order. A search text holds no NUL, so an occurrence
// of it never runs from one name into the next: "contains" searches the arena as one text,
// from one occurrence to the next, while a run asks about the systems in order, and a system
// matches when the next occurrence lies among its names. Most texts users search for by number
// ("71683", "GJ 551") hold no letter, so their bytes are compared as they are, with memmem.
#include "query/OtherNameSearch.h"

#include "query/StarNameQuery.h"

#include <cstdint>
#include <cstring>

namespace {

// The mode's test of pattern (patternLength bytes and its NUL) against name, each byte of the
// name taken through fold.
template <typename Fold>
bool NameMatches(
    int32_t mode, const char* pattern, int32_t patternLength, const char* name, Fold fold)
{
    const int32_t compared = mode == kNameIs ? patternLength + 1 : patternLength;
    for (int32_t k = 0; k < compared; k++) {
        if (pattern[k] != fold(name[k]))
            return false;
    }
    return true;
}

// Whether a name from begin to end passes the "is" or "starts with" test.
template <typename Fold>
bool AnyNameMatches(int32_t mode, const char* pattern, int32_t patternLength, const char* begin,
    const char* end, Fold fold)
{
    for (const char* name = begin; name < end; name += std::strlen(name) + 1) {
        if (NameMatches(mode, pattern, patternLength, name, fold))
            return true;
    }
    return false;
}

} // namespace

void OtherNameSearch::Start(const StarNames* names, int32_t mode, const char* pattern,
    int32_t patternLength, bool caseSensitive, const unsigned char* lower)
{
    fNames = names;
    fMode = mode;
    fPattern = pattern;
    fLength = patternLength;
    fCaseSensitive = caseSensitive;
    fLower = lower;
    fSearchedFrom = nullptr;
    fNextHit = nullptr;
    fHitKnown = false;
    fAnchor = 0;
    fAnchorCount = 0;
    fExact = true;
    if (patternLength == 0)
        return;
    // For each byte of the pattern the name bytes that stand for it, and how often they occur.
    uint64_t fewest = UINT64_MAX;
    for (int32_t k = 0; k < patternLength; k++) {
        const auto wanted = static_cast<unsigned char>(pattern[k]);
        unsigned char bytes[2] = { wanted, wanted };
        int32_t found = 1;
        if (!caseSensitive) {
            found = 0;
            for (int32_t c = 1; c < 256; c++) {
                if (lower[c] != wanted)
                    continue;
                if (found < 2)
                    bytes[found] = static_cast<unsigned char>(c);
                found++;
            }
            if (found != 1 || bytes[0] != wanted)
                fExact = false;
        }
        if (found < 1 || found > 2)
            continue;
        uint64_t occurrences = 0;
        for (int32_t i = 0; i < found; i++)
            occurrences += names->ByteCount(bytes[i]);
        if (occurrences < fewest) {
            fewest = occurrences;
            fAnchor = k;
            fAnchorCount = found;
            fAnchorBytes[0] = bytes[0];
            fAnchorBytes[1] = bytes[found - 1];
        }
    }
    // memchr finds a rare byte fast and memmem a text of common ones (digits, say): measured
    // over names like a Gaia-era sky's, the anchor's hits and checks cost more than memmem once
    // its byte is more than about one name byte in 64.
    fAnchorCommon = fewest != UINT64_MAX && fewest * 64 > names->TextBytes();
}

bool OtherNameSearch::Matches(int32_t index)
{
    const StarNames::Range names = fNames->Of(index);
    if (names.begin == names.end)
        return false;
    if (fMode == kNameContains && fLength > 0)
        return Contains(names);
    if (fMode != kNameIs && fMode != kNameStartsWith) {
        // "contains" with an empty text: every name is one of at least one byte.
        return fMode == kNameContains;
    }
    if (fCaseSensitive)
        return AnyNameMatches(
            fMode, fPattern, fLength, names.begin, names.end, [](char c) { return c; });
    const unsigned char* lower = fLower;
    return AnyNameMatches(fMode, fPattern, fLength, names.begin, names.end,
        [lower](char c) { return static_cast<char>(lower[static_cast<unsigned char>(c)]); });
}

bool OtherNameSearch::Contains(StarNames::Range names)
{
    if (fHitKnown && names.begin < fSearchedFrom)
        return Find(names.begin, names.end) != nullptr; // out of order
    if (!fHitKnown || (fNextHit && fNextHit < names.begin)) {
        // The first question of the run, or after a match, or the occurrence found lies among
        // the names of a system not asked about.
        fSearchedFrom = names.begin;
        fNextHit = Find(names.begin, fNames->All().end);
        fHitKnown = true;
    }
    if (!fNextHit || fNextHit >= names.end)
        return false;
    // The search goes on after this system's names when the next system is asked about.
    fSearchedFrom = names.end;
    fHitKnown = false;
    return true;
}

const char* OtherNameSearch::Find(const char* from, const char* to) const
{
    if (fExact && fAnchorCommon) {
        return static_cast<const char*>(memmem(from, size_t(to - from), fPattern, size_t(fLength)));
    }
    if (fExact)
        return FindFolded(from, to, [](char c) { return c; });
    const unsigned char* lower = fLower;
    return FindFolded(from, to,
        [lower](char c) { return static_cast<char>(lower[static_cast<unsigned char>(c)]); });
}

// Where the pattern may occur is found with memchr for each of the bytes (at most two) that
// stand for its anchor byte, or byte by byte when no byte of it has two or fewer; the rest is
// compared there. A NUL lower-cases to NUL, which no pattern byte is, so no comparison passes
// the NUL that ends the last name, nor the one that begins a name.
template <typename Fold>
const char* OtherNameSearch::FindFolded(const char* from, const char* to, Fold fold) const
{
    // The whole pattern at s, whose anchor byte is known to match.
    const auto at = [this, fold](const char* s) {
        for (int32_t k = 0; k < fLength; k++) {
            if (k != fAnchor && fPattern[k] != fold(s[k]))
                return false;
        }
        return true;
    };
    if (fAnchorCount == 0) {
        for (const char* s = from; s < to; s++) {
            if (fold(*s) == fPattern[0] && at(s))
                return s;
        }
        return nullptr;
    }
    if (to - from <= fAnchor)
        return nullptr;
    const auto next = [to](const char* here, unsigned char byte) {
        return static_cast<const char*>(std::memchr(here, byte, size_t(to - here)));
    };
    // Hits of the anchor byte; the pattern would start fAnchor bytes before each.
    const char* a = next(from + fAnchor, fAnchorBytes[0]);
    const char* b = fAnchorCount > 1 ? next(from + fAnchor, fAnchorBytes[1]) : nullptr;
    while (a || b) {
        const bool fromA = a && (!b || a < b);
        const char* hit = fromA ? a : b;
        if (at(hit - fAnchor))
            return hit - fAnchor;
        if (fromA)
            a = next(a + 1, fAnchorBytes[0]);
        else
            b = next(b + 1, fAnchorBytes[1]);
    }
    return nullptr;
}
