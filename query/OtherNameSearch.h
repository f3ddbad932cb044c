// The name query's search through the other names of the stars (the universe's otherNames):
// whole name, start of a name or part of one, with the query's rules on case.
#pragma once

#include "catalog/StarNames.h"

#include <cstdint>

class OtherNameSearch {
public:
    // Readies a run over names for pattern (patternLength bytes and its NUL; not copied) in the
    // name mode given. Without regard to case the pattern is already lower-cased through lower
    // (256 bytes, not copied), and each byte of a name goes through it as it is read.
    void Start(const StarNames* names, int32_t mode, const char* pattern, int32_t patternLength,
        bool caseSensitive, const unsigned char* lower);

    // Whether one of the other names of the system at index passes the run's test. Asked in
    // increasing order of index, as a run does, "contains" costs one search through all the
    // names of the universe; asked out of order it searches the system's names alone.
    bool Matches(int32_t index);

private:
    // Where the pattern first occurs from from on, before to; null when it does not.
    const char* Find(const char* from, const char* to) const;
    template <typename Fold>
    const char* FindFolded(const char* from, const char* to, Fold fold) const;
    bool Contains(StarNames::Range names);

    const StarNames* fNames = nullptr; // not owned
    int32_t fMode = 0;
    const char* fPattern = "";
    int32_t fLength = 0;
    bool fCaseSensitive = false;
    const unsigned char* fLower = nullptr;
    // The pattern's anchor: the position of the byte looked for first, chosen as the one whose
    // name bytes (those that lower-case to it, or the byte itself with regard to case) are
    // fewest in the names, and those bytes. fAnchorCount is 0 when more than two bytes
    // lower-case to every byte of the pattern. fExact is set when no byte of the pattern has
    // another that lower-cases to it, so that the pattern is compared byte for byte (and searched
    // for with memmem when its anchor is common).
    int32_t fAnchor = 0;
    unsigned char fAnchorBytes[2] = {};
    int32_t fAnchorCount = 0;
    bool fAnchorCommon = false; // the anchor's bytes are common in the names
    bool fExact = false;
    // "contains" over a run: the names searched from fSearchedFrom up to the end, and the first
    // occurrence found there (null for none) when fHitKnown.
    const char* fSearchedFrom = nullptr;
    const char* fNextHit = nullptr;
    bool fHitKnown = false;
};
