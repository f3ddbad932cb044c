// The import pipeline and its report.
#include "tools/importer/Importer.h"

#include "tools/importer/SourceReaders.h"

#include <algorithm>
#include <cctype>
#include <cerrno>
#include <cstring>
#include <fstream>
#include <new>
#include <sstream>
#include <streambuf>
#include <sys/stat.h>

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

namespace {

// The input after its first line has been read to tell the format: that line again, then the
// rest of the stream. A pipe cannot seek back to its start, so the readers get this instead.
class ReplayingBuffer : public std::streambuf {
public:
    ReplayingBuffer(std::string head, std::streambuf* rest)
        : fHead(std::move(head))
        , fRest(rest)
    {
        setg(fHead.data(), fHead.data(), fHead.data() + fHead.size());
    }

protected:
    int_type underflow() override
    {
        if (gptr() < egptr())
            return traits_type::to_int_type(*gptr());
        const std::streamsize got = fRest->sgetn(fBuffer, sizeof fBuffer);
        if (got <= 0)
            return traits_type::eof();
        setg(fBuffer, fBuffer, fBuffer + got);
        return traits_type::to_int_type(*gptr());
    }

private:
    std::string fHead;
    std::streambuf* fRest; // not owned
    char fBuffer[1 << 16];
};

// Reads the stars of options.input, refusing a file that is no catalogue at all.
void ReadInput(const ImportOptions& options, std::vector<ImportStar>& stars, ImportReport& report)
{
    const std::string& file = options.input;
    struct stat st;
    if (stat(file.c_str(), &st) == 0 && S_ISDIR(st.st_mode))
        throw ImportError(file, 0, "is a directory, not a catalogue");
    std::ifstream in(file, std::ios::binary);
    if (!in)
        throw ImportError(file, 0, std::string("cannot open: ") + std::strerror(errno));
    std::string first;
    if (!std::getline(in, first) || (first.empty() && in.peek() == EOF))
        throw ImportError(file, 0, "the file is empty");
    InputFormat format = options.format;
    if (format == InputFormat::Guess)
        format = GuessFormat(first);
    if (format == InputFormat::Guess)
        throw ImportError(
            file, 1, "cannot tell the format from the first line; name it with --format");
    report.format = FormatName(format);

    if (!in.eof())
        first += '\n';
    ReplayingBuffer replay(std::move(first), in.rdbuf());
    std::istream whole(&replay);
    switch (format) {
    case InputFormat::KStars:
        ReadKStars(whole, file, stars, report);
        break;
    case InputFormat::Hyg:
        ReadHyg(whole, file, stars, report);
        break;
    case InputFormat::Csv:
        ReadPlainCsv(whole, file, stars, report);
        break;
    case InputFormat::Guess:
        break;
    }
    if (report.read == 0)
        throw ImportError(file, 0, "no stars in the file");
    if (stars.empty()) {
        std::string reasons;
        for (const auto& [reason, count] : report.skipped)
            reasons += (reasons.empty() ? "" : ", ") + Thousands(count) + " " + reason;
        throw ImportError(file, 0,
            "no star to write: all " + Thousands(report.read) + " stars read were skipped ("
                + reasons + ")");
    }
}

// Refuses to import a catalogue onto itself, however the two names reach it.
void CheckInputIsNotOutput(const ImportOptions& options)
{
    struct stat input, output;
    if (options.generate < 0 && stat(options.input.c_str(), &input) == 0
        && stat(CatalogueTarget(options.output).c_str(), &output) == 0
        && input.st_dev == output.st_dev && input.st_ino == output.st_ino)
        throw ImportError(options.input, 0,
            "is the output " + options.output + " too; write the catalogue to another file");
}

void Import(const ImportOptions& options, ImportResult& result)
{
    std::vector<ImportStar> stars;
    if (options.generate >= 0) {
        result.report.format = "generated";
        GenerateStars(options.generate, options.seed, stars, result.report);
    } else {
        ReadInput(options, stars, result.report);
    }
    result.summary = WriteCatalogue(options.output, stars, GroupSystems(stars));
}

} // namespace

ImportResult RunImport(const ImportOptions& options)
{
    // Before anything is read: a catalogue the output cannot replace is refused at once.
    CatalogueTarget(options.output);
    CheckInputIsNotOutput(options);

    ImportResult result;
    result.report.source = options.generate >= 0
        ? "synthetic catalogue, seed " + std::to_string(options.seed)
        : options.input;
    try {
        Import(options, result);
    } catch (const std::bad_alloc&) {
        // The stars are freed by now, so the message has memory to be made in.
        const int64_t wanted = options.generate >= 0 ? options.generate : result.report.read;
        throw ImportError(
            result.report.source, 0, "not enough memory for " + Thousands(wanted) + " stars");
    }
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
    if (s.leftoversRemoved > 0)
        out << "Removed " << Thousands(s.leftoversRemoved)
            << (s.leftoversRemoved == 1 ? " temporary file" : " temporary files")
            << " left beside the catalogue by killed imports.\n";
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
                      temporary file FILE.importing-XXXXXX beside it and replaces it only
                      when all went well, keeping its permissions (a new file gets
                      rw-r--r--). A symbolic link is followed: the file it leads to is
                      replaced. A directory, device or named pipe is refused, and so is the
                      input catalogue itself, which an import must not overwrite.
                      Ctrl-C, SIGTERM and SIGHUP remove the temporary file; the one a
                      killed import leaves is removed by the next import into the folder.
  --format=FORMAT     kstars, hyg or csv; without it the first line decides. INPUT may be
                      a pipe, such as /dev/stdin.
  --generate=COUNT    write a synthetic catalogue of COUNT stars instead (for benchmarks),
                      from 1 to 100,000,000: more would not fit in a desktop's memory.
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
  An input with no star left to write is an error that says why its stars were skipped.
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
