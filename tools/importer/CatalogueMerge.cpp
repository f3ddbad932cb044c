// Cross-matching catalogues by position and brightness.
#include "tools/importer/CatalogueMerge.h"

#include "tools/importer/Designations.h"
#include "tools/importer/SystemGrouping.h"

#include <algorithm>
#include <cctype>
#include <cmath>
#include <map>
#include <set>
#include <tuple>
#include <unordered_map>

namespace {

constexpr double kArcsecPerRadian = 206264.806247;
// How far apart stars that share a name may lie to be taken for components of one star.
constexpr double kComponentParsecs = 1.0;

double Separation(const ImportStar& a, const ImportStar& b)
{
    // The haversine formula keeps its precision at the arc-seconds that matter here.
    const double sinDec = std::sin((b.dec - a.dec) / 2), sinRa = std::sin((b.ra - a.ra) / 2);
    const double h = sinDec * sinDec + std::cos(a.dec) * std::cos(b.dec) * sinRa * sinRa;
    return 2 * std::asin(std::min(1.0, std::sqrt(h))) * kArcsecPerRadian;
}

// A name that ends in a component letter: "Sirius B", "xi UMa Bb", "GJ 65A".
bool EndsInComponent(const std::string& name)
{
    const size_t n = name.size();
    if (n >= 2 && name[n - 1] >= 'A' && name[n - 1] <= 'H'
        && std::isdigit(static_cast<unsigned char>(name[n - 2])))
        return true;
    const size_t blank = name.rfind(' ');
    if (blank == std::string::npos || blank + 1 >= name.size() || name.size() - blank > 3)
        return false;
    const std::string last = name.substr(blank + 1);
    return std::isupper(static_cast<unsigned char>(last[0]))
        && (last.size() == 1 || std::islower(static_cast<unsigned char>(last[1])));
}

// The names base + " " + letter for components brightest first, each with its own published
// letter (0 for none); false when there are not enough free letters. A letter another star
// already carries is passed over: a primary that keeps its bare name ("Sirius") beside a star
// of the base catalogue of that name has its companion "Sirius B" in the sky already. A star's
// own letter is kept while it is free, so that the two companions of 40 Eridani, which share
// "Omicron2 Eridani" beside the primary's common name, are B and C as astronomers call them,
// not A and B; the others take the free letters in order.
bool ComponentNames(const std::string& base, const std::vector<char>& own,
    const std::set<std::string>& taken, std::vector<std::string>* names)
{
    names->assign(own.size(), std::string());
    std::set<std::string> given;
    for (size_t k = 0; k < own.size(); k++) {
        if (own[k] < 'A' || own[k] > 'Z')
            continue;
        std::string candidate = base + " " + own[k];
        if (!taken.count(candidate) && given.insert(candidate).second)
            (*names)[k] = std::move(candidate);
    }
    char letter = 'A';
    for (std::string& name : *names) {
        while (name.empty()) {
            if (letter > 'Z')
                return false;
            std::string candidate = base + " " + letter++;
            if (!taken.count(candidate) && given.insert(candidate).second)
                name = std::move(candidate);
        }
    }
    return true;
}

} // namespace

double ApparentMagnitude(const ImportStar& star)
{
    return star.absoluteMagnitude - 5 + 5 * std::log10(ParsecsFromParallax(star.parallax));
}

std::vector<std::pair<size_t, size_t>> MatchStars(
    const std::vector<ImportStar>& first, const std::vector<ImportStar>& second)
{
    // The first catalogue in order of declination, searched in a band around each star.
    std::vector<size_t> byDec;
    for (size_t i = 0; i < first.size(); i++) {
        if (first[i].measured)
            byDec.push_back(i);
    }
    std::sort(byDec.begin(), byDec.end(),
        [&](size_t a, size_t b) { return std::tie(first[a].dec, a) < std::tie(first[b].dec, b); });

    // (tier, score, second, first): tier -1 the same Gaia source, 0 the close rule, 1 the wide
    // one.
    std::vector<std::tuple<int, double, size_t, size_t>> candidates;
    std::unordered_map<uint64_t, size_t> byGaiaId;
    for (size_t i = 0; i < first.size(); i++) {
        if (first[i].gaiaId != 0)
            byGaiaId.emplace(first[i].gaiaId, i);
    }
    for (size_t s = 0; s < second.size(); s++) {
        const auto found = second[s].gaiaId != 0 ? byGaiaId.find(second[s].gaiaId) : byGaiaId.end();
        if (found != byGaiaId.end())
            candidates.emplace_back(-1, 0.0, s, found->second);
    }
    const double band = kWideMatchArcsec / kArcsecPerRadian;
    for (size_t s = 0; s < second.size(); s++) {
        const ImportStar& star = second[s];
        if (!star.measured)
            continue;
        const double magnitude = ApparentMagnitude(star);
        const double distance = ParsecsFromParallax(star.parallax);
        auto it = std::lower_bound(byDec.begin(), byDec.end(), star.dec - band,
            [&](size_t i, double dec) { return first[i].dec < dec; });
        for (; it != byDec.end() && first[*it].dec <= star.dec + band; ++it) {
            const ImportStar& other = first[*it];
            const double angle = Separation(star, other);
            const double dm = std::fabs(ApparentMagnitude(other) - magnitude);
            if (angle <= kMatchArcsec && dm <= kMatchMagnitudes)
                candidates.emplace_back(0, angle / kMatchArcsec + dm / kMatchMagnitudes, s, *it);
            else if (angle <= kWideMatchArcsec && dm <= kWideMatchMagnitudes
                && std::fabs(ParsecsFromParallax(other.parallax) - distance)
                    <= kWideMatchDistance * distance)
                candidates.emplace_back(
                    1, angle / kWideMatchArcsec + dm / kWideMatchMagnitudes, s, *it);
        }
    }
    std::sort(candidates.begin(), candidates.end());
    std::vector<bool> secondTaken(second.size()), firstTaken(first.size());
    std::vector<std::pair<size_t, size_t>> pairs;
    for (const auto& [tier, score, s, f] : candidates) {
        if (secondTaken[s] || firstTaken[f])
            continue;
        secondTaken[s] = firstTaken[f] = true;
        pairs.emplace_back(s, f);
    }
    std::sort(pairs.begin(), pairs.end());
    return pairs;
}

void AddStars(std::vector<ImportStar>& stars, std::vector<ImportStar> extra, MergeReport& report)
{
    report.adds = true;
    std::vector<bool> matched(extra.size());
    for (const auto& [e, s] : MatchStars(stars, extra)) {
        report.matched++;
        report.typesChanged += stars[s].spectralClass != extra[e].spectralClass;
        report.namesChanged += stars[s].name != extra[e].name;
        // The star replaced keeps being findable by every name it had.
        ImportStar replaced = std::move(stars[s]);
        stars[s] = extra[e];
        AddAlias(stars[s], replaced.name);
        AddAliases(stars[s], replaced.aliases);
        matched[e] = true;
    }
    for (size_t e = 0; e < extra.size(); e++) {
        if (!matched[e]) {
            stars.push_back(std::move(extra[e]));
            report.added++;
        }
    }
}

void AnnotateStars(
    std::vector<ImportStar>& stars, const std::vector<ImportStar>& labels, MergeReport& report)
{
    for (const auto& [l, s] : MatchStars(stars, labels)) {
        ImportStar& star = stars[s];
        const ImportStar& label = labels[l];
        report.matched++;
        if (!label.classEstimated && star.spectralClass != label.spectralClass) {
            star.spectralClass = label.spectralClass;
            star.classEstimated = false;
            report.typesChanged++;
        }
        AddAliases(star, label.aliases);
        if (label.nameKind <= star.nameKind) {
            report.namesChanged += star.name != label.name;
            AddAlias(star, star.name);
            star.name = label.name;
            star.nameKind = label.nameKind;
            // The table's letter for the star goes with the name the table gave it.
            star.component = label.component;
        }
    }
}

int64_t LetterSharedNames(std::vector<ImportStar>& stars)
{
    std::map<std::string, std::vector<size_t>> byName;
    std::set<std::string> taken;
    for (size_t i = 0; i < stars.size(); i++) {
        if (stars[i].nameKind != NameKind::Position && !EndsInComponent(stars[i].name))
            byName[stars[i].name].push_back(i);
        taken.insert(stars[i].name);
    }
    int64_t lettered = 0;
    for (auto& [name, members] : byName) {
        // 26 letters; a name shared more widely is no component name and stays as it is.
        if (members.size() < 2 || members.size() > 26)
            continue;
        std::stable_sort(members.begin(), members.end(), [&](size_t a, size_t b) {
            return ApparentMagnitude(stars[a]) < ApparentMagnitude(stars[b]);
        });
        // Components lie together; stars far apart that share an old name ("Atik") are
        // different stars and keep it.
        double x0, y0, z0;
        CartesianPosition(stars[members[0]], &x0, &y0, &z0);
        const bool together = std::all_of(members.begin(), members.end(), [&](size_t i) {
            double x, y, z;
            CartesianPosition(stars[i], &x, &y, &z);
            return std::hypot(x - x0, y - y0, z - z0) <= kComponentParsecs;
        });
        if (!together)
            continue;
        // Room for the letter within the 79 characters, never cutting a UTF-8 character.
        std::string base = name;
        if (base.size() > 77) {
            base.resize(77);
            while (!base.empty() && (base.back() & 0x80))
                base.pop_back();
        }
        std::vector<char> own;
        for (size_t i : members)
            own.push_back(stars[i].component);
        std::vector<std::string> names;
        if (!ComponentNames(base, own, taken, &names))
            continue;
        for (size_t k = 0; k < members.size(); k++) {
            taken.insert(names[k]);
            AddAlias(stars[members[k]], stars[members[k]].name);
            stars[members[k]].name = std::move(names[k]);
            lettered++;
        }
    }
    return lettered;
}
