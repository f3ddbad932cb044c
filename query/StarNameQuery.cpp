// The name tests. Without regard to case, both the search text and each name are lower-cased
// into the two buffers made once with the query, so a run over a million systems allocates
// nothing. The lower case of a byte is the C library's tolower, asked once a run for each of
// the 256 byte values (so it follows the locale in force) and looked up in a table after that:
// a call of tolower for every byte of every name took a third of a run's time. A system also
// matches by any of the other names its stars go by (the universe's otherNames), which
// OtherNameSearch compares through the same table instead of copying them.
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
    otherNameSearch.Start(&universe->otherNames, kNameIs, pattern, 0, false, lower);
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
    otherNameSearch.Start(
        &universe->otherNames, p->mode, pattern, patternLength, p->caseSensitive, lower);
    return StarSysQuery::GetSysMask(mask, param);
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
    return otherNameSearch.Matches(index);
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
