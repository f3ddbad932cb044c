// The import pipeline and its report.
#include "tools/importer/Importer.h"

#include "tools/importer/SourceReaders.h"

#include <algorithm>
#include <cctype>
#include <cstring>
#include <fstream>
#include <sstream>

namespace {

std::string Thousands(int64_t n)
{
    std::string digits = std::to_string(n < 0 ? -n : n), out;
    for (size_t i = 0; i < digits.size(); i++) {
        if (i > 0 && (digits.size() - i) % 3 == 0)
            out += ',';
        out += digits[i];
    }
    return n < 0 ? "-" + out : out;
}

const char* FormatName(InputFormat format)
{
    switch (format) {
    case InputFormat::KStars:
        return "kstars";
    case InputFormat::Hyg:
        return "HYG";
    case InputFormat::Csv:
        return "plain CSV";
    case InputFormat::Guess:
        break;
    }
    return "unknown";
}

} // namespace

InputFormat GuessFormat(const std::string& firstLine)
{
    if (!firstLine.empty() && firstLine[0] == '#')
        return InputFormat::KStars;
    if (firstLine.size() >= 58 && std::isdigit(static_cast<unsigned char>(firstLine[0]))
        && firstLine[9] == ' ' && (firstLine[10] == '+' || firstLine[10] == '-'))
        return InputFormat::KStars;
    std::string lower = firstLine;
    for (char& c : lower)
        c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
    if (lower.find("hip") != std::string::npos && lower.find("dist") != std::string::npos
        && lower.find("absmag") != std::string::npos)
        return InputFormat::Hyg;
    if (lower.find(',') != std::string::npos)
        return InputFormat::Csv;
    return InputFormat::Guess;
}

ImportResult RunImport(const ImportOptions& options)
{
    ImportResult result;
    std::vector<ImportStar> stars;
    if (options.generate >= 0) {
        result.report.source = "synthetic catalogue, seed " + std::to_string(options.seed);
        result.report.format = "generated";
        GenerateStars(options.generate, options.seed, stars, result.report);
    } else {
        const std::string& file = options.input;
        std::ifstream in(file, std::ios::binary);
        if (!in)
            throw ImportError(file, 0, std::string("cannot open: ") + std::strerror(errno));
        std::string first;
        if (!std::getline(in, first) || (first.empty() && in.peek() == EOF))
            throw ImportError(file, 0, "the file is empty");
        in.clear();
        in.seekg(0);
        InputFormat format = options.format;
        if (format == InputFormat::Guess)
            format = GuessFormat(first);
        if (format == InputFormat::Guess)
            throw ImportError(
                file, 1, "cannot tell the format from the first line; name it with --format");
        result.report.source = file;
        result.report.format = FormatName(format);
        switch (format) {
        case InputFormat::KStars:
            ReadKStars(in, file, stars, result.report);
            break;
        case InputFormat::Hyg:
            ReadHyg(in, file, stars, result.report);
            break;
        case InputFormat::Csv:
            ReadPlainCsv(in, file, stars, result.report);
            break;
        case InputFormat::Guess:
            break;
        }
        if (result.report.read == 0)
            throw ImportError(file, 0, "no stars in the file");
    }
    result.summary = WriteCatalogue(options.output, stars, GroupSystems(stars));
    return result;
}

std::string DescribeImport(const ImportResult& result)
{
    const ImportReport& r = result.report;
    std::ostringstream out;
    out << "Read " << Thousands(r.read) << " stars from " << r.source << " (" << r.format << ").\n";
    out << "Skipped " << Thousands(r.Skipped()) << (r.skipped.empty() ? "." : ":") << "\n";
    for (const auto& [reason, count] : r.skipped)
        out << "  " << Thousands(count) << " " << reason << "\n";
    if (r.classesFromColour > 0)
        out << "Spectral class estimated from the B-V colour for " << Thousands(r.classesFromColour)
            << " stars.\n";
    const WriteSummary& s = result.summary;
    out << "Wrote " << Thousands(s.systems) << " systems of " << Thousands(s.stars)
        << " stars, the Sun first:\n";
    for (size_t size = 1; size < s.systemsBySize.size(); size++) {
        if (s.systemsBySize[size] > 0)
            out << "  " << Thousands(s.systemsBySize[size]) << " of " << size
                << (size == 1 ? " star\n" : " stars\n");
    }
    return out.str();
}

std::string ImporterHelp()
{
    return R"(Usage: nightdome-import [options] INPUT
       nightdome-import --generate=COUNT [--seed=N] [options]

Writes a star catalogue for Nightdome ("stars.dat": two lines a star, the name, then
"class absolute-magnitude x y z" in parsecs, the Sun first at 0 0 0).

Options:
  -o, --output=FILE   the catalogue to write (default: stars.dat). It is written to a
                      temporary file beside it and replaces it only when all went well.
  --format=FORMAT     kstars, hyg or csv; without it the first line decides.
  --generate=COUNT    write a synthetic catalogue of COUNT stars instead (for benchmarks).
  --seed=N            seed of the synthetic catalogue (default 1); the same seed gives the
                      same catalogue.
  -q, --quiet         print nothing but errors.
  -h, --help          this text.

Input formats:
  kstars  The Hipparcos-derived catalogue of Debian's kstars-data package
          (/usr/share/kstars/stars.dat). Lines starting with '#' are comments; the others
          have fixed columns: right ascension hhmmss.ss, declination +ddmmss.s, proper
          motions, parallax in milliarcseconds (characters 39-45), V magnitude (46-51),
          B-V (52-56), a two-character spectral type (57-58), flags, then
          ", designation, common name".
  hyg     The HYG database CSV: a header row, then ra in hours, dec in degrees, dist in
          parsecs (100000 means unknown), mag, absmag, spect, ci, proper, bf, gl, hip, hd.
          Its own row for the Sun is left out; the Sun is always written first.
  csv     Any CSV with a header row naming its columns: name, ra and dec in degrees,
          parallax in milliarcseconds or distance in parsecs, mag (apparent V) or absmag,
          and optionally spect and bv. Suits extracts from Gaia and other surveys.

What is written:
  Position: x = d cos(dec) cos(ra), y = d sin(dec), z = d cos(dec) sin(ra), d = 1000 /
  parallax in parsecs. Absolute magnitude M = V + 5 + 5 log10(parallax in arcseconds).
  Names: the common name, else the Bayer or Flamsteed designation written out ("Alpha
  Centauri", "61 Cygni"), else one built from the position ("J210654.0+384458"); at most
  79 characters, control characters made blanks. The spectral type is written as one word
  of at most 7 characters: blanks and characters other than printable ASCII are left out
  and the rest is cut to 7 ("K2 III" is "K2III"). A missing spectral type is estimated from
  B-V when there is one, else "?". Stars without a positive parallax are skipped and counted.
  Out of range is bad input: declination beyond +-90 degrees, right ascension outside
  0-24 h (kstars, hyg) or 0-360 degrees (csv), a parallax or distance placing a star beyond
  1,000,000 pc or nearer than 1 AU, a magnitude (apparent or absolute) outside -30..40.

Star systems:
  Two stars are one system when they are at most 5,000 AU apart across the line of sight
  (their angle on the sky times their mean distance) and their parallaxes agree within
  three combined errors, each star's error taken as the larger of 1 mas and 2% of its
  parallax. A star close to any member joins the system. The members are written one
  after the other, brightest first, all at the position of the brightest, so the program
  reads them as one system (for example alpha Centauri A and B, 61 Cygni A and B).
)";
}
