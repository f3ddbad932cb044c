// Importing fuzz input, writing it, and reading it back through the program's reader.
#include "ImportRoundTrip.h"

#include "catalog/Star.h"
#include "catalog/Universe.h"
#include "tools/importer/CatalogueWriter.h"
#include "tools/importer/GaiaCatalogue.h"
#include "tools/importer/SourceReaders.h"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <memory>
#include <sstream>
#include <string>
#include <vector>

namespace {

// One record as the writer meant it: the Sun, then every system's members in order.
struct Expected {
    std::string name;
    std::string spectralClass;
    double magnitude;
    size_t system; // 0 for the Sun
};

// One record as written: its two lines, the data line cut at its blanks.
struct Written {
    std::string name;
    std::vector<std::string> fields;
};

bool Printable(const std::string& text)
{
    for (const char c : text) {
        const auto u = static_cast<unsigned char>(c);
        if (u < 0x20 || u == 0x7f)
            return false;
    }
    return true;
}

// A field the reader's "%lf" reads whole, as a finite number.
double FiniteField(const std::string& field)
{
    char* end = nullptr;
    const double value = std::strtod(field.c_str(), &end);
    FuzzCheck(!field.empty() && *end == '\0', "a number field is not one number");
    FuzzCheck(std::isfinite(value), "a number field is not finite");
    return value;
}

std::vector<Written> SplitRecords(const std::string& text)
{
    FuzzCheck(!text.empty() && text.back() == '\n', "the catalogue does not end with a line feed");
    std::vector<std::string> lines;
    size_t start = 0;
    while (start < text.size()) {
        const size_t feed = text.find('\n', start);
        lines.push_back(text.substr(start, feed - start));
        start = feed + 1;
    }
    FuzzCheck(lines.size() % 2 == 0, "the catalogue has an odd number of lines");
    std::vector<Written> records;
    for (size_t i = 0; i < lines.size(); i += 2) {
        FuzzCheck(lines[i].size() <= 79, "a name is longer than the reader keeps");
        FuzzCheck(Printable(lines[i]), "a name holds a control character");
        FuzzCheck(lines[i + 1].size() <= 500, "a data line is longer than the reader reads");
        FuzzCheck(Printable(lines[i + 1]), "a data line holds a control character");
        Written record { lines[i], {} };
        std::istringstream fields(lines[i + 1]);
        std::string field;
        while (fields >> field)
            record.fields.push_back(field);
        FuzzCheck(record.fields.size() == 5, "a data line does not hold five fields");
        records.push_back(record);
    }
    return records;
}

// What write writes to a file, as text; an exception it throws goes on to the caller.
template <typename F> std::string Captured(F write)
{
    char* buffer = nullptr;
    size_t length = 0;
    std::FILE* out = open_memstream(&buffer, &length);
    FuzzCheck(out != nullptr, "cannot open a memory stream");
    try {
        write(out);
    } catch (...) {
        std::fclose(out);
        std::free(buffer);
        throw;
    }
    std::fclose(out);
    std::string text(buffer, length);
    std::free(buffer);
    return text;
}

// The names file FormatNames writes for the records of a catalogue of catalogueBytes bytes:
// its header, then lines of increasing star index, each naming a star of the catalogue and
// holding 1-79 printable ASCII characters a name, none twice and never the star's own name.
void CheckNamesFile(
    const std::string& names, const std::vector<Written>& records, size_t catalogueBytes)
{
    const std::string header = "nightdome names 1\n" + std::to_string(records.size()) + " "
        + std::to_string(catalogueBytes) + "\n";
    FuzzCheck(names.compare(0, header.size(), header) == 0,
        "the names file's header does not match its catalogue");
    FuzzCheck(names.back() == '\n', "the names file does not end with a line feed");
    long long previous = 0;
    for (size_t start = header.size(); start < names.size();) {
        const size_t feed = names.find('\n', start);
        const std::string line = names.substr(start, feed - start);
        start = feed + 1;
        size_t tab = line.find('\t');
        FuzzCheck(tab != std::string::npos && tab > 0, "a names line without an index and a name");
        const std::string index = line.substr(0, tab);
        FuzzCheck(index.find_first_not_of("0123456789") == std::string::npos,
            "a names line's index is no number");
        const long long star = std::stoll(index);
        FuzzCheck(star > previous, "the names file's star indexes do not increase");
        FuzzCheck(static_cast<size_t>(star) < records.size(), "a names line names no star");
        previous = star;
        std::vector<std::string> seen;
        while (tab != std::string::npos) {
            const size_t next = line.find('\t', tab + 1);
            const std::string name = line.substr(tab + 1, next - tab - 1);
            tab = next;
            FuzzCheck(!name.empty() && name.size() <= 79, "another name is empty or too long");
            for (const char c : name)
                FuzzCheck(c >= ' ' && c <= '~', "another name is not printable ASCII");
            FuzzCheck(name != records[static_cast<size_t>(star)].name,
                "a star's own name is among its other names");
            FuzzCheck(std::find(seen.begin(), seen.end(), name) == seen.end(),
                "a star has another name twice");
            seen.push_back(name);
        }
    }
}

} // namespace

void FuzzCheck(bool condition, const char* message)
{
    if (condition)
        return;
    std::fprintf(stderr, "round trip: %s\n", message);
    std::abort();
}

void CheckImportRoundTrip(const uint8_t* data, size_t size, InputFormat format)
{
    std::istringstream in(std::string(reinterpret_cast<const char*>(data), size));
    std::vector<ImportStar> stars;
    ImportReport report;
    try {
        switch (format) {
        case InputFormat::KStars:
            ReadKStars(in, "fuzz", stars, report);
            break;
        case InputFormat::Hyg:
            ReadHyg(in, "fuzz", stars, report);
            break;
        case InputFormat::SouthernStars:
            ReadSouthernStars(in, "fuzz", stars, report);
            break;
        case InputFormat::Csv:
        case InputFormat::Guess:
            ReadPlainCsv(in, "fuzz", stars, report);
            break;
        case InputFormat::Gaia:
            ReadGaiaStars(std::string_view(reinterpret_cast<const char*>(data), size), "fuzz",
                GaiaLabels {}, stars, report);
            break;
        }
    } catch (const ImportError&) {
        return;
    }
    CheckStarsRoundTrip(stars);
}

void CheckStarsRoundTrip(const std::vector<ImportStar>& stars)
{
    if (stars.empty())
        return;

    const std::vector<StarGroup> systems = GroupSystems(stars);
    std::vector<Expected> expected { { "The Sun", "G2V", 4.83, 0 } };
    for (size_t s = 0; s < systems.size(); s++) {
        for (const size_t member : systems[s].members) {
            const ImportStar& star = stars[member];
            expected.push_back({ star.name, star.spectralClass, star.absoluteMagnitude, s + 1 });
        }
    }

    std::string text;
    try {
        text = Captured([&](std::FILE* out) { FormatCatalogue(out, stars, systems); });
    } catch (const ImportError&) {
        return; // the writer's last guard refused: an error message, not a bad file
    }

    // The text itself: every record as meant, every line one the reader reads whole.
    const std::vector<Written> records = SplitRecords(text);
    FuzzCheck(records.size() == expected.size(), "not every star was written once");
    for (size_t i = 0; i < records.size(); i++) {
        const Written& r = records[i];
        FuzzCheck(r.name == expected[i].name, "a name was written other than it was read");
        FuzzCheck(r.fields[0] == expected[i].spectralClass,
            "a spectral class was written other than it was read");
        FuzzCheck(r.fields[0].size() <= 7, "a spectral class is longer than the program keeps");
        char magnitude[64];
        std::snprintf(magnitude, sizeof magnitude, "%.3f", expected[i].magnitude);
        FuzzCheck(i == 0 || r.fields[1] == magnitude,
            "a magnitude was written other than it was read"); // the Sun's is "4.83"
        for (size_t f = 1; f < 5; f++)
            FiniteField(r.fields[f]);
    }

    // The other names written for the same stars.
    WriteSummary summary;
    const std::string names = Captured([&](std::FILE* out) {
        FormatNames(out, stars, systems, static_cast<int64_t>(text.size()), summary);
    });
    CheckNamesFile(names, records, text.size());

    // The program's reader on the same text: the same stars, the same systems.
    std::unique_ptr<std::FILE, int (*)(std::FILE*)> file(
        fmemopen(const_cast<char*>(text.data()), text.size(), "rb"), &std::fclose);
    FuzzCheck(file != nullptr, "cannot read the catalogue back");
    Universe universe(5000);
    ReadCatalogue(file.get(), 1000000, &universe);
    FuzzCheck(universe.CountItems() == static_cast<int32_t>(systems.size() + 1),
        "the reader sees another number of systems");
    size_t i = 0;
    for (int32_t s = 0; s < universe.CountItems(); s++) {
        const StarSystem* system = universe.SystemAt(s);
        for (int32_t k = 0; k < system->CountItems(); k++, i++) {
            FuzzCheck(i < records.size(), "the reader sees more stars than were written");
            FuzzCheck(expected[i].system == static_cast<size_t>(s),
                "a star was read into another system");
            const Star* star = system->StarAt(k);
            const Written& r = records[i];
            FuzzCheck(r.name == star->GetName(), "a name reads back otherwise");
            FuzzCheck(r.fields[0] == star->GetSpectralClassString(),
                "a spectral class reads back otherwise");
            FuzzCheck(FiniteField(r.fields[1]) == star->GetMagnitude(),
                "a magnitude reads back otherwise");
            FuzzCheck(FiniteField(r.fields[2]) == system->position.x
                    && FiniteField(r.fields[3]) == system->position.y
                    && FiniteField(r.fields[4]) == system->position.z,
                "a position reads back otherwise");
        }
    }
    FuzzCheck(i == records.size(), "the reader sees fewer stars than were written");
}
