// The two CSV inputs: the HYG database and a plain table with named columns.
#include "core/Constants.h"
#include "tools/importer/CsvTable.h"
#include "tools/importer/Designations.h"
#include "tools/importer/SourceReaders.h"
#include "tools/importer/SpectralEstimates.h"
#include "tools/importer/StrictNumbers.h"

#include <algorithm>
#include <cctype>
#include <cmath>
#include <initializer_list>
#include <map>
#include <optional>

namespace {

// The spectral type as the catalogue holds it (a white dwarf's with its Harvard class); an
// empty type is estimated from the colour index when there is one.
std::string SpectralWord(
    const std::string& type, std::optional<double> colour, ImportReport& report)
{
    const std::string word = CleanSpectralClass(type);
    if (!word.empty())
        return PublishedClass(word, colour, report);
    if (colour) {
        report.classesFromColour++;
        return ClassFromColour(*colour);
    }
    return "?";
}

} // namespace

std::vector<std::string> SplitCsvLine(const std::string& line)
{
    std::vector<std::string> fields(1);
    bool quoted = false;
    for (size_t i = 0; i < line.size(); i++) {
        const char c = line[i];
        if (quoted) {
            if (c == '"' && i + 1 < line.size() && line[i + 1] == '"') {
                fields.back() += '"';
                i++;
            } else if (c == '"') {
                quoted = false;
            } else {
                fields.back() += c;
            }
        } else if (c == '"') {
            quoted = true;
        } else if (c == ',') {
            fields.emplace_back();
        } else {
            fields.back() += c;
        }
    }
    return fields;
}

void ReadHyg(
    std::istream& in, const std::string& file, std::vector<ImportStar>& stars, ImportReport& report)
{
    CsvTable table(in, file);
    const size_t ra = table.Require({ "ra" }, "right ascension (hours)");
    const size_t dec = table.Require({ "dec" }, "declination (degrees)");
    const size_t dist = table.Require({ "dist" }, "distance (parsecs)");
    const auto absmag = table.Find({ "absmag" });
    const auto mag = table.Find({ "mag" });
    if (!absmag && !mag)
        table.Require({ "absmag", "mag" }, "magnitude");
    const auto spect = table.Find({ "spect" });
    const auto colour = table.Find({ "ci" });
    const auto proper = table.Find({ "proper" });
    const auto bf = table.Find({ "bf" });
    const auto gl = table.Find({ "gl" });
    const auto hip = table.Find({ "hip" });
    const auto hd = table.Find({ "hd" });

    while (table.Next()) {
        report.read++;
        const double distance = table.Number(dist, "dist");
        const double raHours = InRange(table.Number(ra, "ra"), 0, 24, file, table.Line(), "ra");
        const double decDegrees
            = InRange(table.Number(dec, "dec"), -90, 90, file, table.Line(), "dec");
        if (Lower(table.Text(proper)) == "sol" || distance == 0) {
            report.Skip("the Sun (always written first)");
            continue;
        }
        // HYG marks stars without a parallax, or with a dubious one, with a distance of
        // 100000 pc or more.
        if (!(distance > 0) || distance >= 100000) {
            report.Skip("without a usable parallax");
            continue;
        }
        CheckedParsecs(distance, file, table.Line(), "dist " + table.Text(dist) + " pc");
        ImportStar star;
        star.line = table.Line();
        star.ra = raHours / 24 * (kPI + kPI);
        star.dec = decDegrees / 180 * kPI;
        star.parallax = 1000.0 / distance;
        star.absoluteMagnitude = table.AbsoluteMagnitude(absmag, mag, distance);
        star.spectralClass
            = SpectralWord(table.Text(spect), table.OptionalNumber(colour, "ci"), report);

        // Catalogue numbers are names only with their catalogue's prefix.
        auto numbered = [&](const char* prefix, std::optional<size_t> column) {
            const std::string number = CleanName(table.Text(column));
            return number.empty() ? number : prefix + number;
        };
        const std::string gliese = CleanName(table.Text(gl));
        NameStar(star,
            { { table.Text(proper), NameKind::Proper },
                { ReadableDesignation(table.Text(bf)), NameKind::Designation },
                { gliese.rfind("Gl ", 0) == 0 || gliese.rfind("GJ ", 0) == 0 ? gliese : "",
                    NameKind::Gliese },
                { gliese, NameKind::Other }, { numbered("HIP ", hip), NameKind::Other },
                { numbered("HD ", hd), NameKind::HenryDraper } });
        stars.push_back(std::move(star));
    }
}

void ReadPlainCsv(
    std::istream& in, const std::string& file, std::vector<ImportStar>& stars, ImportReport& report)
{
    CsvTable table(in, file);
    const auto name = table.Find({ "name", "designation", "source_id", "id" });
    const size_t ra = table.Require({ "ra", "ra_deg" }, "right ascension (degrees)");
    const size_t dec = table.Require({ "dec", "dec_deg" }, "declination (degrees)");
    const auto parallax = table.Find({ "parallax", "plx", "parallax_mas" });
    const auto distance = table.Find({ "distance", "dist", "distance_pc" });
    if (!parallax && !distance)
        table.Require({ "parallax", "distance" }, "distance");
    const auto mag = table.Find({ "mag", "vmag", "v" });
    const auto absmag = table.Find({ "absmag", "abs_mag" });
    if (!mag && !absmag)
        table.Require({ "mag", "absmag" }, "magnitude");
    const auto spect = table.Find({ "spect", "sptype", "spectral_type", "spectral_class" });
    const auto colour = table.Find({ "bv", "b-v", "ci" });

    while (table.Next()) {
        report.read++;
        const double raDegrees = InRange(table.Number(ra, "ra"), 0, 360, file, table.Line(), "ra");
        const double decDegrees
            = InRange(table.Number(dec, "dec"), -90, 90, file, table.Line(), "dec");
        double plx = 0;
        if (const auto p = table.OptionalNumber(parallax, "parallax")) {
            plx = *p;
            if (plx > 0)
                CheckedParsecs(ParsecsFromParallax(plx), file, table.Line(),
                    "parallax " + table.Text(parallax) + " mas");
        } else if (const auto d = table.OptionalNumber(distance, "distance")) {
            if (*d > 0)
                plx = 1000.0
                    / CheckedParsecs(
                        *d, file, table.Line(), "distance " + table.Text(distance) + " pc");
        }
        if (!(plx > 0)) {
            report.Skip("without a usable parallax");
            continue;
        }
        ImportStar star;
        star.line = table.Line();
        star.ra = raDegrees / 180 * kPI;
        star.dec = decDegrees / 180 * kPI;
        star.parallax = plx;
        star.absoluteMagnitude = table.AbsoluteMagnitude(absmag, mag, ParsecsFromParallax(plx));
        star.spectralClass
            = SpectralWord(table.Text(spect), table.OptionalNumber(colour, "bv"), report);
        star.name = ChooseName({ table.Text(name) }, star.ra, star.dec);
        stars.push_back(std::move(star));
    }
}
