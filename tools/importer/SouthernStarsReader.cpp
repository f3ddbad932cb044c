// The star tables of Southern Stars Group (SSCore's SSData/Stars): the nearest stars and the
// Bright Star catalogue, with published spectral types, identifiers and common names.
#include "core/Constants.h"
#include "tools/importer/CsvTable.h"
#include "tools/importer/Designations.h"
#include "tools/importer/SourceReaders.h"
#include "tools/importer/SpectralEstimates.h"
#include "tools/importer/StrictNumbers.h"

#include <algorithm>
#include <cctype>
#include <charconv>
#include <cmath>

namespace {

std::vector<std::string> Split(const std::string& text, char separator)
{
    std::vector<std::string> parts;
    size_t begin = 0;
    while (begin <= text.size()) {
        const size_t end = std::min(text.find(separator, begin), text.size());
        const std::string part = Trimmed(text.substr(begin, end - begin));
        if (!part.empty())
            parts.push_back(part);
        begin = end + 1;
    }
    return parts;
}

// "h m s" or "+d m s" in hours or degrees; the sign of the first part applies to the whole.
double Sexagesimal(const std::string& text, double maxFirst, const std::string& file, int64_t line,
    const char* what)
{
    const std::vector<std::string> parts = Words(text);
    if (parts.size() != 3)
        throw ImportError(file, line,
            std::string(what) + " '" + text + "' is not three numbers separated by blanks");
    const bool negative = parts[0][0] == '-';
    const double first = std::fabs(StrictNumber(parts[0], file, line, what));
    const double minutes = StrictNumber(parts[1], file, line, what);
    const double seconds = StrictNumber(parts[2], file, line, what);
    InRange(first, 0, maxFirst, file, line, what);
    InRange(minutes, 0, 59, file, line, std::string(what) + " minutes");
    InRange(seconds, 0, 60, file, line, std::string(what) + " seconds");
    const double value = first + minutes / 60 + seconds / 3600;
    return negative ? -value : value;
}

// The letters in a name: among a star's common names the one with the most is the fullest
// ("Proxima Centauri" before "Proxima Cen").
size_t Letters(const std::string& name)
{
    size_t n = 0;
    for (char c : name)
        n += std::isalpha(static_cast<unsigned char>(c)) != 0;
    return n;
}

// The star's common name: the fullest of them, but a primary listed both bare and with its
// letter ("Sirius;Sirius A") carries the bare name, the one people search for, and leaves the
// letters to its companions ("Sirius;Sirius B" stays "Sirius B").
std::string CommonName(const std::vector<std::string>& names)
{
    std::string fullest;
    for (const std::string& name : names) {
        if (std::find(names.begin(), names.end(), name + " A") != names.end())
            return name;
        if (Letters(name) > Letters(fullest))
            fullest = name;
    }
    return fullest;
}

// The name by the order of preference: a common name, a Bayer designation, a Flamsteed
// designation, the Gliese number, the HD number; else the position's.
void NameFromIds(ImportStar& star, const std::string& names, const std::string& ids)
{
    // Some common names are designations ("mu Her Aa", "alp Ps"): those count as such.
    std::string named;
    std::vector<std::string> common;
    for (const std::string& name : Split(names, ';')) {
        const std::string written = WrittenOutDesignation(name);
        if (!written.empty() && named.empty())
            named = written;
        else if (written.empty())
            common.push_back(CleanName(name));
    }
    const std::string proper = CommonName(common);
    const std::vector<std::string> identifiers = Split(ids, ';');
    std::string bayer = named, flamsteed, gliese, hd;
    for (const std::string& id : identifiers) {
        const std::string written = WrittenOutDesignation(id);
        const bool number = !id.empty() && std::isdigit(static_cast<unsigned char>(id[0]));
        if (!written.empty() && !number && bayer.empty())
            bayer = written;
        else if (!written.empty() && number && flamsteed.empty())
            flamsteed = written;
        else if (id.rfind("GJ ", 0) == 0 && gliese.empty())
            gliese = id;
        else if (id.rfind("HD ", 0) == 0 && hd.empty())
            hd = id;
    }
    NameStar(star,
        { { proper, NameKind::Proper }, { bayer, NameKind::Designation },
            { flamsteed, NameKind::Designation }, { gliese, NameKind::Gliese },
            { hd, NameKind::HenryDraper } });

    // Every name and identifier stays findable: designations in each common spelling, Gaia's
    // source ids as the astronomical databases write them.
    for (const std::string& name : Split(names, ';'))
        AddAlias(star, CleanName(name));
    for (const std::string& id : identifiers) {
        const std::vector<std::string> forms = DesignationForms(id);
        for (const std::string& form : forms)
            AddAlias(star, form);
        if (forms.empty() && id.rfind("GAIA ", 0) == 0) {
            AddAlias(star, "Gaia DR3 " + CleanName(id.substr(5)));
            uint64_t source = 0;
            const std::string digits = CleanName(id.substr(5));
            const auto [end, error]
                = std::from_chars(digits.data(), digits.data() + digits.size(), source);
            if (error == std::errc() && end == digits.data() + digits.size())
                star.gaiaId = source;
        } else if (forms.empty())
            AddAlias(star, CleanName(id));
    }
}

// The star's own component letter, 0 when the row gives none. Comp names the pair the
// double-star columns measure, mostly with the row's own component first ("BA" on Sirius B,
// "BC" and "CB" on 40 Eridani B and C); but some companions give the pair as their primary
// does ("AB" on Lalande 21258 B, "AC" on GJ 667 C). Their Gliese numbers carry their own
// letters ("GJ 412B", "GJ 667C"), so a letter of the pair that the Gliese number names wins.
// Lower-case letters name parts of a component ("Aa"): the component is the capital.
char ComponentLetter(const std::string& comp, const std::vector<std::string>& identifiers)
{
    auto isLetter = [](char c) { return c >= 'A' && c <= 'Z'; };
    if (comp.empty() || !isLetter(comp[0]))
        return 0;
    const char second = comp.size() > 1 && isLetter(comp[1]) ? comp[1] : 0;
    for (const std::string& id : identifiers) {
        const size_t n = id.size();
        if (second && id.rfind("GJ ", 0) == 0 && n > 4 && id[n - 1] == second
            && std::isdigit(static_cast<unsigned char>(id[n - 2])))
            return second;
    }
    return comp[0];
}

} // namespace

void ReadSouthernStars(
    std::istream& in, const std::string& file, std::vector<ImportStar>& stars, ImportReport& report)
{
    CsvTable table(in, file);
    const size_t ra = table.Require({ "ra" }, "right ascension (h m s)");
    const size_t dec = table.Require({ "dec" }, "declination (d m s)");
    const size_t dist = table.Require({ "dist" }, "distance (parsecs)");
    const auto v = table.Find({ "v" });
    const auto b = table.Find({ "b" });
    // The published spectral type: "SpType" in the copies the program ships; SSCore's own files
    // head it differently, but always put it right after RV.
    auto type = table.Find({ "sptype" });
    if (const auto rv = table.Find({ "rv" }); !type && rv)
        type = *rv + 1;
    const auto ids = table.Find({ "ids" });
    const auto names = table.Find({ "names" });
    const auto comp = table.Find({ "comp" });

    while (table.Next()) {
        report.read++;
        const int64_t line = table.Line();
        const double raHours = Sexagesimal(table.Text(ra), 23, file, line, "ra");
        const double decDegrees = Sexagesimal(table.Text(dec), 90, file, line, "dec");
        InRange(decDegrees, -90, 90, file, line, "dec");
        const auto distance = table.OptionalNumber(dist, "dist");
        if (!distance || !(*distance > 0)) {
            report.Skip("without a usable parallax");
            continue;
        }
        CheckedParsecs(*distance, file, line, "dist " + table.Text(dist) + " pc");

        ImportStar star;
        star.line = line;
        star.ra = raHours / 24 * (kPI + kPI);
        star.dec = decDegrees / 180 * kPI;
        star.parallax = ParsecsFromParallax(*distance); // 1000 / pc is mas, as 1000 / mas is pc
        const std::string published = ShortSpectralType(table.Text(type));
        const auto visual = table.OptionalNumber(v, "V");
        const auto blue = table.OptionalNumber(b, "B");
        const auto colour = visual && blue ? std::optional<double>(*blue - *visual) : std::nullopt;
        if (visual) {
            star.absoluteMagnitude = CheckedMagnitude(
                CheckedMagnitude(*visual, file, line, "V") + 5 - 5 * std::log10(*distance), file,
                line, "absolute magnitude");
            if (!published.empty()) {
                star.spectralClass = PublishedClass(published, colour, report);
            } else if (colour) {
                star.spectralClass = ClassFromColour(*colour);
                star.classEstimated = true;
                report.classesFromColour++;
            } else {
                star.spectralClass = TypeOfMagnitude(star.absoluteMagnitude);
                star.classEstimated = true;
                report.classesFromMagnitude++;
            }
        } else {
            // Without a visual magnitude the type tells how bright the star is; without either,
            // it is taken for what most stars this faint are, a red dwarf.
            star.measured = false;
            const auto fromType = published.empty() ? std::nullopt : MagnitudeOfType(published);
            if (fromType) {
                star.spectralClass = PublishedClass(published, colour, report);
                star.absoluteMagnitude = *fromType;
                report.magnitudesFromClass++;
            } else {
                star.spectralClass = published.empty() ? "M" : published;
                star.classEstimated = published.empty();
                star.absoluteMagnitude = *MagnitudeOfType("M4V");
                report.classesAssumed++;
            }
        }
        NameFromIds(star, table.Text(names), table.Text(ids));
        star.component = ComponentLetter(table.Text(comp), Split(table.Text(ids), ';'));
        stars.push_back(std::move(star));
    }
}
