// Writing the program's catalogue: two lines a star, the Sun first, each system's stars one
// after the other at the position of its primary.
#pragma once

#include "tools/importer/ImportStar.h"
#include "tools/importer/SystemGrouping.h"

#include <cstdio>
#include <string>
#include <vector>

struct WriteSummary {
    int64_t systems = 0; // the Sun included
    int64_t stars = 0; // the Sun included
    std::vector<int64_t> systemsBySize; // [n] = systems of n stars
};

// Writes the catalogue's text to out: "The Sun" first, then every system with its stars at the
// position of its primary. Every record reads back to the same star: names and classes are
// cleaned as the readers clean them, and a magnitude or position outside the ranges of
// StrictNumbers.h throws ImportError (naming the star's line) rather than be written. Leaves
// checking out for errors to the caller.
WriteSummary FormatCatalogue(
    std::FILE* out, const std::vector<ImportStar>& stars, const std::vector<StarGroup>& systems);

// Writes the catalogue to path. The text goes to a temporary file beside path that replaces
// path only when all is written, so a failed run never leaves a partial catalogue. Throws
// ImportError when it cannot write.
WriteSummary WriteCatalogue(const std::string& path, const std::vector<ImportStar>& stars,
    const std::vector<StarGroup>& systems);
