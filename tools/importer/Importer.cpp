// The import pipeline and its report.
#include "tools/importer/Importer.h"

#include "tools/importer/GaiaCatalogue.h"
#include "tools/importer/SourceReaders.h"

#include <algorithm>
#include <cctype>
#include <cerrno>
#include <cstring>
#include <filesystem>
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

// The white dwarfs' types a source placed on the Harvard scale, as one line of the report
// after indent; nothing when the source held no such type.
std::string WhiteDwarfLine(const ImportReport& r, const char* indent)
{
    const int64_t placed = r.whiteDwarfsFromIndex + r.whiteDwarfsFromColour;
    if (placed == 0 && r.whiteDwarfsUnplaced == 0)
        return "";
    std::ostringstream out;
    out << indent;
    if (placed > 0) {
        out << "White dwarf types placed on the Harvard scale for " << Thousands(placed)
            << " stars (from the temperature index for " << Thousands(r.whiteDwarfsFromIndex)
            << ", the B-V colour for " << Thousands(r.whiteDwarfsFromColour) << ")";
        if (r.whiteDwarfsUnplaced > 0)
            out << "; " << Thousands(r.whiteDwarfsUnplaced) << " left without a class";
    } else {
        out << "White dwarf types left without a class for " << Thousands(r.whiteDwarfsUnplaced)
            << " stars (neither a temperature index nor a B-V colour)";
    }
    out << ".\n";
    return out.str();
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
    case InputFormat::SouthernStars:
        return "Southern Stars CSV";
    case InputFormat::Gaia:
        return "Gaia DR3 and Hipparcos, binary";
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
    // Southern Stars tables: their own set of columns, identifiers and names last.
    const std::vector<std::string> columns = SplitCsvLine(lower);
    auto has = [&](const char* name) {
        for (const std::string& column : columns) {
            if (column == name)
                return true;
        }
        return false;
    };
    if (has("ra") && has("dec") && has("dist") && has("rv") && has("ids") && has("names"))
        return InputFormat::SouthernStars;
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

void CheckSomethingRead(
    const std::string& file, const std::vector<ImportStar>& stars, const ImportReport& report);

// Whether the folder holds the star files of the binary catalogue.
bool IsGaiaFolder(const std::string& folder)
{
    std::error_code error;
    for (std::filesystem::directory_iterator entry(folder, error), end; !error && entry != end;
         entry.increment(error)) {
        const std::string name = entry->path().filename().string();
        if (name.rfind("stars_", 0) == 0 && name.size() > 8 && name[6] >= '0' && name[6] <= '9'
            && name[7] == '_')
            return true;
    }
    return false;
}

// Reads the stars of file, refusing a file that is no catalogue at all.
void ReadInput(const std::string& file, InputFormat givenFormat, std::vector<ImportStar>& stars,
    ImportReport& report)
{
    struct stat st { };
    const bool found = stat(file.c_str(), &st) == 0;
    const bool folder = found && S_ISDIR(st.st_mode);
    if (folder
        && !(givenFormat == InputFormat::Gaia
            || (givenFormat == InputFormat::Guess && IsGaiaFolder(file))))
        throw ImportError(file, 0, "is a directory, not a catalogue");
    std::ifstream in;
    if (!folder) {
        in.open(file, std::ios::binary);
        if (!in)
            throw ImportError(file, 0, std::string("cannot open: ") + std::strerror(errno));
    }
    // The binary catalogue: a folder of its files, or one regular file that starts with its
    // magic (looked at through a stream of its own: a pipe cannot go back to its start).
    if (!folder && givenFormat == InputFormat::Guess && found && S_ISREG(st.st_mode)) {
        std::ifstream peek(file, std::ios::binary);
        char magic[4] = {};
        peek.read(magic, sizeof magic);
        if (IsGaiaStarFile(std::string_view(magic, static_cast<size_t>(peek.gcount()))))
            givenFormat = InputFormat::Gaia;
    }
    if (folder || givenFormat == InputFormat::Gaia) {
        report.format = FormatName(InputFormat::Gaia);
        ReadGaiaCatalogue(file, stars, report);
        CheckSomethingRead(file, stars, report);
        return;
    }
    std::string first;
    if (!std::getline(in, first) || (first.empty() && in.peek() == EOF))
        throw ImportError(file, 0, "the file is empty");
    InputFormat format = givenFormat;
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
    case InputFormat::SouthernStars:
        ReadSouthernStars(whole, file, stars, report);
        break;
    case InputFormat::Gaia:
    case InputFormat::Guess:
        break;
    }
    CheckSomethingRead(file, stars, report);
}

void CheckSomethingRead(
    const std::string& file, const std::vector<ImportStar>& stars, const ImportReport& report)
{
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
    if (stat(CatalogueTarget(options.output).c_str(), &output) != 0)
        return;
    std::vector<std::string> inputs = options.add;
    inputs.insert(inputs.end(), options.annotate.begin(), options.annotate.end());
    if (options.generate < 0)
        inputs.push_back(options.input);
    for (const std::string& file : inputs) {
        if (stat(file.c_str(), &input) == 0 && input.st_dev == output.st_dev
            && input.st_ino == output.st_ino)
            throw ImportError(file, 0,
                "is the output " + options.output + " too; write the catalogue to another file");
    }
}

// Brings the catalogues of --annotate, then those of --add, into the stars.
void Merge(const ImportOptions& options, std::vector<ImportStar>& stars, ImportResult& result)
{
    auto bringIn = [&](const std::string& file, bool adds) {
        MergeReport merge;
        merge.read.source = file;
        std::vector<ImportStar> other;
        ReadInput(file, InputFormat::Guess, other, merge.read);
        if (adds)
            AddStars(stars, std::move(other), merge);
        else
            AnnotateStars(stars, other, merge);
        result.merges.push_back(std::move(merge));
    };
    for (const std::string& file : options.annotate)
        bringIn(file, false);
    for (const std::string& file : options.add)
        bringIn(file, true);
    if (!options.add.empty() || !options.annotate.empty())
        result.lettered = LetterSharedNames(stars);
}

void Import(const ImportOptions& options, ImportResult& result)
{
    std::vector<ImportStar> stars;
    if (options.generate >= 0) {
        result.report.format = "generated";
        GenerateStars(options.generate, options.seed, stars, result.report);
    } else {
        ReadInput(options.input, options.format, stars, result.report);
    }
    Merge(options, stars, result);
    for (const ImportStar& star : stars)
        result.names[star.nameKind]++;
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
    if (r.classesFromMagnitude > 0)
        out << "Spectral class estimated from the absolute magnitude for "
            << Thousands(r.classesFromMagnitude) << " stars.\n";
    out << WhiteDwarfLine(r, "");
    for (const MergeReport& m : result.merges) {
        const ImportReport& read = m.read;
        out << (m.adds ? "Added " : "Annotated with ") << read.source << " (" << read.format
            << "): read " << Thousands(read.read) << " stars";
        if (read.Skipped() > 0) {
            out << ", skipped " << Thousands(read.Skipped()) << " (";
            bool first = true;
            for (const auto& [reason, count] : read.skipped) {
                out << (first ? "" : ", ") << Thousands(count) << " " << reason;
                first = false;
            }
            out << ")";
        }
        out << ".\n  " << Thousands(m.matched) << " matched a star already there";
        if (m.adds)
            out << " and replaced it, " << Thousands(m.added) << " added";
        else
            out << ", " << Thousands(read.read - read.Skipped() - m.matched) << " matched none";
        out << "; changed: " << Thousands(m.typesChanged) << " spectral types, "
            << Thousands(m.namesChanged) << " names.\n";
        if (read.classesFromColour > 0)
            out << "  Spectral class estimated from the B-V colour for "
                << Thousands(read.classesFromColour) << " stars.\n";
        if (read.classesFromMagnitude > 0)
            out << "  Spectral class estimated from the absolute magnitude for "
                << Thousands(read.classesFromMagnitude) << " stars.\n";
        if (read.magnitudesFromClass > 0)
            out << "  Absolute magnitude estimated from the spectral type (main sequence) for "
                << Thousands(read.magnitudesFromClass) << " stars without a V magnitude.\n";
        if (read.classesAssumed > 0)
            out << "  Neither magnitude nor usable type for " << Thousands(read.classesAssumed)
                << " stars, taken for red dwarfs (M, absolute magnitude "
                << "of an M4 dwarf).\n";
        out << WhiteDwarfLine(read, "  ");
    }
    if (result.lettered > 0)
        out << "Component letters given to " << Thousands(result.lettered)
            << " stars that shared a name.\n";
    if (!result.names.empty()) {
        static constexpr std::pair<NameKind, const char*> kKinds[] = {
            { NameKind::Proper, "common names" },
            { NameKind::Designation, "Bayer or Flamsteed designations" },
            { NameKind::Gliese, "Gliese numbers" },
            { NameKind::HenryDraper, "HD numbers" },
            { NameKind::Other, "other catalogue names" },
            { NameKind::Position, "names built from the position" },
        };
        out << "Names:";
        bool first = true;
        for (const auto& [kind, what] : kKinds) {
            const auto found = result.names.find(kind);
            if (found == result.names.end())
                continue;
            out << (first ? " " : ", ") << Thousands(found->second) << " " << what;
            first = false;
        }
        out << ".\n";
    }
    const WriteSummary& s = result.summary;
    out << "Wrote " << Thousands(s.systems) << " systems of " << Thousands(s.stars)
        << " stars, the Sun first:\n";
    for (size_t size = 1; size < s.systemsBySize.size(); size++) {
        if (s.systemsBySize[size] > 0)
            out << "  " << Thousands(s.systemsBySize[size]) << " of " << size
                << (size == 1 ? " star\n" : " stars\n");
    }
    if (!s.namesFile.empty())
        out << "Other names: " << Thousands(s.otherNames) << " for "
            << Thousands(s.starsWithOtherNames) << " stars, written to " << s.namesFile << ".\n";
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
  --format=FORMAT     kstars, hyg, csv, southern or gaia; without it the first line
                      decides, or for gaia the file's header or a folder of its files.
                      INPUT may be a pipe, such as /dev/stdin (not for gaia).
  --add=FILE          every star of FILE joins the sky with FILE's position, distance,
                      magnitude, spectral type and name; a star of INPUT that matches one
                      (see Matching) is replaced by it, so the star appears once. For a
                      catalogue better than INPUT, such as the nearest stars. May be given
                      more than once; the format is told from the first line.
  --annotate=FILE     stars of INPUT that match a star of FILE take its published spectral
                      type, and its name when that is of a kind at least as good (a common
                      name before a Bayer or Flamsteed designation, then Gliese, HD, any
                      other, the position). FILE's other stars are not added. Applied
                      before --add; may be given more than once.
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
  gaia    The star catalogue of Gaia DR3 and Hipparcos in Debian's stellarium-data
          package (usr/share/stellarium/stars/hip_gaia3/; Gaia data: ESA/Gaia/DPAC,
          CC BY-SA 3.0 IGO). INPUT is the folder holding its star files
          stars_<digit>_*.cat (all are read) or one of them; the files beside them are
          read when they are there: stars_hip_sp_*.cat (spectral types),
          common_star_names.fab (IAU names), name.fab (Bayer and Flamsteed
          designations), cross-id.cat (HD and HR numbers). A binary file: a 28-byte
          header (magic 0x835F040A, version, zone level, epoch), a star count per zone,
          then 48-byte records (Gaia source id, direction and proper motion, B-V and V,
          parallax and its error, spectral type, Hipparcos number). Stars whose parallax
          is under five times its error are skipped and counted. Positions are carried
          back from the catalogue's epoch (J2016.0) to J2000 along the proper motion.
          The name is the IAU name, else the Bayer designation, else Bayer's Latin
          letter, else the Flamsteed number, written out; else the HD number, else the
          Hipparcos number, else the Gaia designation ("Gaia DR3 2509780430229120256").
          A file that does not fit the format is refused with the byte offset and why.
  southern
          The star tables of Southern Stars Group, free for any use with credit:
          "Star data: Southern Stars Group, SSCore, SSData/Stars". Nearest.csv holds every
          known star within 10 parsecs, Brightest.csv the Bright Star catalogue. A header
          row, then RA "h m s" and Dec "+d m s" (J2000), V and B magnitudes, Dist in
          parsecs, the spectral type as published right after RV, IDs and Names separated
          by semicolons. The name is
          the fullest common name ("Proxima Centauri" of "Proxima Cen;Proxima Centauri"),
          but the bare one of a star named both with and without the letter A ("Sirius"
          of "Sirius;Sirius A"; "Sirius;Sirius B" is "Sirius B"), else the Bayer, else the
          Flamsteed designation written out, else the GJ, else the HD number. A type
          longer than 7 characters keeps its first star and its luminosity class
          ("G8III+G1III" is "G8III"). A row without V gets the absolute
          magnitude of a main-sequence star (a white dwarf for class D) of its type;
          without a type, the class follows from B-V, else from the absolute magnitude on
          the main sequence; with neither V nor type the star is taken for a red dwarf.
          Rows without a distance are skipped.

What is written:
  Position: x = d cos(dec) cos(ra), y = d sin(dec), z = d cos(dec) sin(ra), d = 1000 /
  parallax in parsecs. Absolute magnitude M = V + 5 + 5 log10(parallax in arcseconds).
  Names: the common name, else the Bayer or Flamsteed designation written out ("Alpha
  Centauri", "61 Cygni"), else one built from the position ("J210654.0+384458"); at most
  79 characters, control characters made blanks. The spectral type is written as one word
  of at most 7 characters: blanks and characters other than printable ASCII are left out
  and the rest is cut to 7 ("K2 III" is "K2III"). A missing spectral type is estimated from
  B-V when there is one, else "?". Nightdome reads a star's class from the first of the
  letters W O B A F G K M R N (either case) in its word. A white dwarf's type (D and one of
  A B C O Q Z X P H E V) without any of them, such as "DZ", "DQZ" or "DQ9P", is followed by
  a colon and the main-sequence class of the star's temperature ("DQ9P:G6"), the white
  dwarf's part cut when the whole would pass 7 characters. The temperature is 50,400 K over
  the type's temperature index, the number after its letters (DQ9: 5,600 K), else that of a
  main-sequence star of the star's B-V ("DZ" with B-V 0.55: "DZ:F9"); temperatures and
  colours become classes by the dwarf sequence of Pecaut & Mamajek (2013). With neither,
  the type stays as it is and the star has no class.
  Other names: every other name the inputs give a star (IAU, Bayer and Flamsteed in
  full and short, "Alpha Centauri", "alf Cen"; HIP, HD, HR, GJ, Gaia DR3 and the
  like), and the names of stars --add replaced or --annotate renamed, go to a file
  beside the catalogue with the extension .names ("stars.dat" -> "stars.names"):
  "nightdome names 1", then the catalogue's star count and size in bytes, then a
  line per star with other names: its place in the catalogue (the Sun is 0) and
  its names, separated by tabs. Nightdome's name queries search them too.
  Stars without a positive parallax are skipped and counted.
  An input with no star left to write is an error that says why its stars were skipped.
  Out of range is bad input: declination beyond +-90 degrees, right ascension outside
  0-24 h (kstars, hyg) or 0-360 degrees (csv), a parallax or distance placing a star beyond
  1,000,000 pc or nearer than 1 AU, a magnitude (apparent or absolute) outside -30..40.

Matching (--add, --annotate):
  A star of FILE and one of INPUT are the same star when they lie within 5 arcseconds of
  each other on the sky and their V magnitudes differ by at most 1.0; or, failing that,
  within 60 arcseconds, 0.25 magnitudes and 10% in distance (catalogues place the stars of
  close pairs differently). Both give J2000 positions. The closest pairs are taken first,
  each star in one pair at most; names are never compared. Stars of FILE without a V
  magnitude are not matched but added. After merging, stars that share a name and lie
  within a parsec of the brightest of them get component letters: a star of a southern
  table its own letter of the pair in its Comp column (the first, or the one its GJ
  number ends in: "BC" on GJ 166B, "AB" on GJ 412B), while no other star carries it
  ("Omicron2 Eridani B" and "C" beside Keid); the others the free letters brightest
  first ("61 Cygni A", "61 Cygni B"), passing over a letter another star already carries.

The default sky of the build:
  nightdome-import --format=gaia ~/.cache/nightdome/gaia \
      --annotate=data/southern-stars/Brightest.csv --add=data/southern-stars/Nearest.csv
  or, where the Gaia catalogue cannot be had, the Hipparcos catalogue of kstars-data:
  nightdome-import --format=kstars /usr/share/kstars/stars.dat \
      --annotate=data/southern-stars/Brightest.csv --add=data/southern-stars/Nearest.csv

Star systems:
  Two stars are one system when they are at most 5,000 AU apart across the line of sight
  (their angle on the sky times their mean distance) and their parallaxes agree within
  three combined errors, each star's error taken as the larger of 1 mas and 2% of its
  parallax. A star close to any member joins the system. The members are written one
  after the other, brightest first, all at the position of the brightest, so the program
  reads them as one system (for example alpha Centauri A and B, 61 Cygni A and B).
)";
}
