// A set of star systems as a CSV table (RFC 4180) other programs open, and such a table back
// into a set: written one row per star, read by name or else by position. Plain C++, no Qt.
#pragma once

#include "catalog/Universe.h"
#include "query/StarSysMask.h"
#include "query/SystemMatcher.h"

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

// What reading a table found.
struct SystemSetCsvResult {
    bool ok = false;
    std::string error; // why nothing was read, beginning "line n: "; empty when ok
    int64_t rows = 0; // rows under the header
    int64_t matchedRows = 0;
    int32_t systems = 0; // distinct systems the rows name
    std::vector<int64_t> unmatchedLines; // the line each row that matched nothing starts on
};

class SystemSetCsv {
public:
    // The header row written, without its line end.
    static constexpr std::string_view kHeader
        = "Name,Spectral class,Absolute magnitude,Distance (pc),Right ascension (h),"
          "Declination (deg),x (pc),y (pc),z (pc)";
    // A table of more rows than this is refused: no universe holds that many stars.
    static constexpr int64_t kMaxRows = 4'000'000;

    // The header, then one row per star of every system of set (of universe), in index
    // order: the star's name, its class as the catalogue gives it, its absolute magnitude, then
    // the system's distance, right ascension and declination as seen from the Sun and its
    // position x, y, z in parsecs. A system without stars gets one row under its own name with
    // class and magnitude empty. CRLF after every row.
    static std::string Write(const Universe& universe, const StarSysMask& set);

    // Reads the table text into found (emptied first; a mask over matcher's universe). Columns
    // are found by their header names, in any order and case, units "(pc)" optional: a name
    // column ("Name", "Star name", "Star" or "Designation") and/or "x", "y", "z". A row names
    // the system holding a star (or itself) of its exact name, the nearest to the row's x, y, z
    // when several do; failing that, the system at the row's x, y, z. Malformed text leaves
    // found empty and result.ok false.
    static SystemSetCsvResult Read(
        std::string_view text, const SystemMatcher& matcher, StarSysMask* found);

    // Whether text starts with a header naming the columns Read needs: so plain text can be
    // told from a table without reading all of it.
    static bool HasUsableHeader(std::string_view text);

    // One short line on what reading found, for the help line, about the table called label:
    // "CSV: 998 systems from 1,000 rows; 2 rows matched nothing (lines 5, 9)", or for a table
    // not read "CSV, line 3: a quoted field is never closed".
    static std::string Describe(const SystemSetCsvResult& result, std::string_view label = "CSV");
};
