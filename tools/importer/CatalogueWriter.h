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
    int64_t leftoversRemoved = 0; // temporary files of killed imports found beside it
    std::string namesFile; // where the stars' other names went
    int64_t starsWithOtherNames = 0;
    int64_t otherNames = 0;
};

// The file of other names that goes with a catalogue: its name with the extension replaced by
// ".names" ("stars.dat" -> "stars.names"), or ".names" appended to a name without one.
std::string NamesFileOf(const std::string& catalogue);

// Writes the stars' other names (ImportStar::aliases, less each star's own name and the names
// that are not printable ASCII) in the order FormatCatalogue writes the stars, for a catalogue
// of catalogueBytes bytes:
//   "nightdome names 1"
//   "<stars in the catalogue> <catalogueBytes>"
//   "<star index>\t<name>\t<name>..." for each star with other names, the Sun being star 0.
// Counts what it wrote into summary.
void FormatNames(std::FILE* out, const std::vector<ImportStar>& stars,
    const std::vector<StarGroup>& systems, int64_t catalogueBytes, WriteSummary& summary);

// Writes the catalogue's text to out: "The Sun" first, then every system with its stars at the
// position of its primary. Every record reads back to the same star: names and classes are
// cleaned as the readers clean them, and a magnitude or position outside the ranges of
// StrictNumbers.h throws ImportError (naming the star's line) rather than be written. Leaves
// checking out for errors to the caller.
WriteSummary FormatCatalogue(
    std::FILE* out, const std::vector<ImportStar>& stars, const std::vector<StarGroup>& systems);

// The file a catalogue written to path replaces: path itself, or the file its symbolic links
// lead to (which need not exist yet). Throws ImportError when that is anything but a regular
// file: a directory, a device, a named pipe.
std::string CatalogueTarget(const std::string& path);

// Writes the catalogue to path, or through its symbolic links to the file they lead to. The
// text goes to a locked temporary file "<file>.importing-XXXXXX" beside that file, which
// replaces it only when all is written and takes over its permissions (0644 for a new file), so
// a failed run never leaves a partial catalogue. SIGINT, SIGTERM and SIGHUP remove the
// temporary file before the process dies of them; the unlocked leftovers of killed imports
// beside the file are removed first. Then the other names go to NamesFileOf(path) the same
// way. Throws ImportError when it cannot write.
WriteSummary WriteCatalogue(const std::string& path, const std::vector<ImportStar>& stars,
    const std::vector<StarGroup>& systems);
