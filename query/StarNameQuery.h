// Finds systems by the names of their members, and by the other names those stars go by: whole
// name, part of a name or its start, with or without regard to case.
#pragma once

#include "core/MessageCodes.h"
#include "query/OtherNameSearch.h"
#include "query/StarSysQuery.h"

// Name modes.
enum : int32_t {
    kNameIs = 0,
    kNameContains = 1,
    kNameStartsWith = 2,
};

struct NameQueryParam {
    int32_t mode; // name mode; any other value matches nothing
    const char* text; // NUL-terminated, shorter than kNameBufferSize; not owned
    bool caseSensitive;
};

class StarNameQuery final : public StarSysQuery {
public:
    static constexpr uint32_t kType = kNameQueryType;
    // Bytes of each lower-casing buffer, the terminating NUL included. Nothing checks lengths:
    // names hold at most 80 bytes and search texts must stay below this size.
    static constexpr int32_t kNameBufferSize = 1024;

    explicit StarNameQuery(Universe* universe);
    ~StarNameQuery() override;

    int32_t GetSysMask(StarSysMask* mask, void* param) override; // param: NameQueryParam*
    uint32_t QueryType() const override { return kType; }
    bool Query(int32_t index, void* param) override;

    char* nameBuffer; // a member's name lower-cased; owned, from malloc
    char* patternBuffer; // the search text lower-cased; owned, from malloc
    const char* pattern; // the text searched for: the caller's text or patternBuffer
    const char* candidate; // the name being tested: a member's own name or nameBuffer
    int32_t patternLength; // bytes of pattern before its NUL

private:
    bool Is() const;
    bool Contains() const;
    bool StartsWith() const;
    void FillLowerTable(); // asks tolower, in the locale in force now, for every byte value

    unsigned char lower[256]; // tolower of every byte value: made with the query, and again by
                              // each run without regard to case
    OtherNameSearch otherNameSearch; // through the universe's otherNames, for the run
};
