// One import from start to end: read a catalogue (or generate one), group the stars into
// systems, write the program's catalogue, and describe what was done.
#pragma once

#include "tools/importer/CatalogueMerge.h"
#include "tools/importer/CatalogueWriter.h"
#include "tools/importer/ImportStar.h"

#include <map>
#include <string>
#include <vector>

enum class InputFormat { Guess, KStars, Hyg, Csv, SouthernStars, Gaia };

struct ImportOptions {
    InputFormat format = InputFormat::Guess;
    std::string input; // the catalogue to read; unused when generating
    std::string output = "stars.dat";
    int64_t generate = -1; // a synthetic catalogue of this many stars instead of input
    uint64_t seed = 1;
    // Catalogues whose stars all join the input's, replacing the stars they match (--add).
    std::vector<std::string> add;
    // Catalogues whose types and names go to the input's stars they match (--annotate).
    std::vector<std::string> annotate;
};

struct ImportResult {
    ImportReport report;
    WriteSummary summary;
    std::vector<MergeReport> merges; // the annotating catalogues first, then the added ones
    int64_t lettered = 0; // names given component letters
    std::map<NameKind, int64_t> names; // the stars written (the Sun aside) by kind of name
};

// Throws ImportError for bad input or output, for an input that is the output itself, for an
// input with no star left to write and for too little memory; the output file is then as it
// was.
ImportResult RunImport(const ImportOptions& options);

// The format of a catalogue from its first line: '#' comments or fixed columns mean kstars, a
// header with "hip", "dist" and "absmag" means HYG, another header with commas a plain CSV.
InputFormat GuessFormat(const std::string& firstLine);

// What was read, skipped (by reason) and written (systems by number of members).
std::string DescribeImport(const ImportResult& result);

// The help text of the command.
std::string ImporterHelp();
