// Greek letters, constellation genitives and position designations.
#include "tools/importer/Designations.h"

#include "core/Constants.h"

#include <algorithm>
#include <cctype>
#include <cmath>
#include <cstdio>
#include <cstring>
#include <utility>
#include <vector>

namespace {

constexpr std::pair<const char*, const char*> kGreek[] = {
    { "alp", "Alpha" },
    { "bet", "Beta" },
    { "gam", "Gamma" },
    { "del", "Delta" },
    { "eps", "Epsilon" },
    { "zet", "Zeta" },
    { "eta", "Eta" },
    { "the", "Theta" },
    { "iot", "Iota" },
    { "kap", "Kappa" },
    { "lam", "Lambda" },
    { "omi", "Omicron" },
    { "rho", "Rho" },
    { "sig", "Sigma" },
    { "tau", "Tau" },
    { "ups", "Upsilon" },
    { "phi", "Phi" },
    { "chi", "Chi" },
    { "psi", "Psi" },
    { "ome", "Omega" },
    { "mu", "Mu" },
    { "nu", "Nu" },
    { "xi", "Xi" },
    { "pi", "Pi" },
};

// The short spellings of the Greek letters: the astronomical databases' first, then the older
// one where it differs.
constexpr std::pair<const char*, const char*> kShortGreek[] = {
    { "Alpha", "alf" },
    { "Alpha", "alp" },
    { "Beta", "bet" },
    { "Gamma", "gam" },
    { "Delta", "del" },
    { "Epsilon", "eps" },
    { "Zeta", "zet" },
    { "Eta", "eta" },
    { "Theta", "tet" },
    { "Theta", "the" },
    { "Iota", "iot" },
    { "Kappa", "kap" },
    { "Lambda", "lam" },
    { "Mu", "mu" },
    { "Nu", "nu" },
    { "Xi", "ksi" },
    { "Xi", "xi" },
    { "Omicron", "omi" },
    { "Pi", "pi" },
    { "Rho", "rho" },
    { "Sigma", "sig" },
    { "Tau", "tau" },
    { "Upsilon", "ups" },
    { "Phi", "phi" },
    { "Chi", "chi" },
    { "Psi", "psi" },
    { "Omega", "ome" },
};

constexpr std::pair<const char*, const char*> kConstellations[] = {
    { "And", "Andromedae" },
    { "Ant", "Antliae" },
    { "Aps", "Apodis" },
    { "Aqr", "Aquarii" },
    { "Aql", "Aquilae" },
    { "Ara", "Arae" },
    { "Ari", "Arietis" },
    { "Aur", "Aurigae" },
    { "Boo", "Bootis" },
    { "Cae", "Caeli" },
    { "Cam", "Camelopardalis" },
    { "Cnc", "Cancri" },
    { "CVn", "Canum Venaticorum" },
    { "CMa", "Canis Majoris" },
    { "CMi", "Canis Minoris" },
    { "Cap", "Capricorni" },
    { "Car", "Carinae" },
    { "Cas", "Cassiopeiae" },
    { "Cen", "Centauri" },
    { "Cep", "Cephei" },
    { "Cet", "Ceti" },
    { "Cha", "Chamaeleontis" },
    { "Cir", "Circini" },
    { "Col", "Columbae" },
    { "Com", "Comae Berenices" },
    { "CrA", "Coronae Australis" },
    { "CrB", "Coronae Borealis" },
    { "Crv", "Corvi" },
    { "Crt", "Crateris" },
    { "Cru", "Crucis" },
    { "Cyg", "Cygni" },
    { "Del", "Delphini" },
    { "Dor", "Doradus" },
    { "Dra", "Draconis" },
    { "Equ", "Equulei" },
    { "Eri", "Eridani" },
    { "For", "Fornacis" },
    { "Gem", "Geminorum" },
    { "Gru", "Gruis" },
    { "Her", "Herculis" },
    { "Hor", "Horologii" },
    { "Hya", "Hydrae" },
    { "Hyi", "Hydri" },
    { "Ind", "Indi" },
    { "Lac", "Lacertae" },
    { "Leo", "Leonis" },
    { "LMi", "Leonis Minoris" },
    { "Lep", "Leporis" },
    { "Lib", "Librae" },
    { "Lup", "Lupi" },
    { "Lyn", "Lyncis" },
    { "Lyr", "Lyrae" },
    { "Men", "Mensae" },
    { "Mic", "Microscopii" },
    { "Mon", "Monocerotis" },
    { "Mus", "Muscae" },
    { "Nor", "Normae" },
    { "Oct", "Octantis" },
    { "Oph", "Ophiuchi" },
    { "Ori", "Orionis" },
    { "Pav", "Pavonis" },
    { "Peg", "Pegasi" },
    { "Per", "Persei" },
    { "Phe", "Phoenicis" },
    { "Pic", "Pictoris" },
    { "Psc", "Piscium" },
    { "PsA", "Piscis Austrini" },
    { "Pup", "Puppis" },
    { "Pyx", "Pyxidis" },
    { "Ret", "Reticuli" },
    { "Sge", "Sagittae" },
    { "Sgr", "Sagittarii" },
    { "Sco", "Scorpii" },
    { "Scl", "Sculptoris" },
    { "Sct", "Scuti" },
    { "Ser", "Serpentis" },
    { "Sex", "Sextantis" },
    { "Tau", "Tauri" },
    { "Tel", "Telescopii" },
    { "Tri", "Trianguli" },
    { "TrA", "Trianguli Australis" },
    { "Tuc", "Tucanae" },
    { "UMa", "Ursae Majoris" },
    { "UMi", "Ursae Minoris" },
    { "Vel", "Velorum" },
    { "Vir", "Virginis" },
    { "Vol", "Volantis" },
    { "Vul", "Vulpeculae" },
};

bool EqualsIgnoringCase(const std::string& a, const char* b)
{
    const size_t n = std::strlen(b);
    if (a.size() != n)
        return false;
    for (size_t i = 0; i < n; i++) {
        if (std::tolower(static_cast<unsigned char>(a[i]))
            != std::tolower(static_cast<unsigned char>(b[i])))
            return false;
    }
    return true;
}

bool IsAlpha(char c)
{
    return std::isalpha(static_cast<unsigned char>(c)) != 0;
}

bool IsDigit(char c)
{
    return c >= '0' && c <= '9';
}

} // namespace

std::string ConstellationGenitive(const std::string& abbreviation)
{
    for (const auto& [abbr, genitive] : kConstellations) {
        if (abbreviation == abbr)
            return genitive;
    }
    // "CMA" or "cma" still mean Canis Major; only "CrA"/"Cra"-like pairs would be ambiguous, and
    // those differ in more than case ("CrA" and "Crt").
    for (const auto& [abbr, genitive] : kConstellations) {
        if (EqualsIgnoringCase(abbreviation, abbr))
            return genitive;
    }
    return {};
}

std::string ReadableDesignation(const std::string& designation)
{
    const std::string& s = designation;
    size_t i = 0;
    auto skipBlanks = [&] {
        while (i < s.size() && s[i] == ' ')
            i++;
    };

    skipBlanks();
    std::string flamsteed;
    while (i < s.size() && IsDigit(s[i]))
        flamsteed += s[i++];
    skipBlanks();

    std::string greek;
    for (const auto& [abbr, letter] : kGreek) {
        const size_t n = std::strlen(abbr);
        if (i + n <= s.size() && EqualsIgnoringCase(s.substr(i, n), abbr)
            && (i + n == s.size() || !IsAlpha(s[i + n])
                || std::isupper(static_cast<unsigned char>(s[i + n])))) {
            // "alpCen" has no blank; the capital of the constellation ends the letter.
            greek = letter;
            i += n;
            break;
        }
    }
    if (!greek.empty()) {
        skipBlanks();
        while (i < s.size() && IsDigit(s[i]))
            greek += s[i++];
    }
    skipBlanks();

    std::string rest = s.substr(i);
    while (!rest.empty() && rest.back() == ' ')
        rest.pop_back();
    const std::string genitive = ConstellationGenitive(rest);
    if (genitive.empty())
        return {};
    if (!greek.empty())
        return greek + " " + genitive;
    if (!flamsteed.empty())
        return flamsteed + " " + genitive;
    return {};
}

std::string PositionDesignation(double ra, double dec)
{
    constexpr double kTurn = kPI + kPI;
    // The readers check their ranges; this keeps the conversions to integers below defined
    // for any value, a declination past a pole or a right ascension that is no number.
    if (!std::isfinite(ra))
        ra = 0;
    dec = std::isnan(dec) ? 0 : std::clamp(dec, -kPI / 2, kPI / 2);
    double hours = std::fmod(ra, kTurn) / kTurn * 24.0;
    if (hours < 0)
        hours += 24.0;
    // Whole tenths of a second of time and whole arc-seconds, so that nothing rounds up to 60.
    auto tenths = static_cast<long>(std::floor(hours * 36000.0 + 0.5)) % 864000;
    const long h = tenths / 36000, m = tenths / 600 % 60, secondTenths = tenths % 600;
    const double degrees = dec * 180.0 / kPI;
    const long arcseconds = static_cast<long>(std::floor(std::fabs(degrees) * 3600.0 + 0.5));
    char text[96];
    std::snprintf(text, sizeof text, "J%02ld%02ld%02ld.%ld%c%02ld%02ld%02ld", h, m,
        secondTenths / 10, secondTenths % 10, degrees < 0 ? '-' : '+', arcseconds / 3600,
        arcseconds / 60 % 60, arcseconds % 60);
    return text;
}

std::string CleanName(const std::string& name)
{
    std::string out;
    bool blank = false;
    for (char c : name) {
        const bool control = static_cast<unsigned char>(c) < 32 || c == 127;
        if (c == ' ' || control) {
            blank = !out.empty();
            continue;
        }
        if (blank)
            out += ' ';
        blank = false;
        out += c;
    }
    if (out.size() > 79) {
        size_t cut = 79;
        // Step back over UTF-8 continuation bytes so no character is split.
        while (cut > 0 && (static_cast<unsigned char>(out[cut]) & 0xC0) == 0x80)
            cut--;
        out.resize(cut);
        while (!out.empty() && out.back() == ' ')
            out.pop_back();
    }
    return out;
}

std::string ChooseName(std::initializer_list<std::string> candidates, double ra, double dec)
{
    for (const std::string& candidate : candidates) {
        std::string name = CleanName(candidate);
        if (!name.empty())
            return name;
    }
    return CleanName(PositionDesignation(ra, dec));
}

void NameStar(ImportStar& star, std::initializer_list<NameCandidate> candidates)
{
    for (const NameCandidate& candidate : candidates) {
        std::string name = CleanName(candidate.text);
        if (!name.empty()) {
            star.name = std::move(name);
            star.nameKind = candidate.kind;
            return;
        }
    }
    star.name = CleanName(PositionDesignation(star.ra, star.dec));
    star.nameKind = NameKind::Position;
}

std::string CleanSpectralClass(const std::string& type)
{
    // The program keeps 7 characters of a class (and reads it as one blank-free word).
    constexpr size_t kMaxClass = 7;
    std::string out;
    for (char c : type) {
        if (c > ' ' && c < 127 && out.size() < kMaxClass)
            out += c;
    }
    return out;
}

std::vector<std::string> Words(const std::string& text)
{
    std::vector<std::string> words;
    size_t i = 0;
    while (i < text.size()) {
        while (i < text.size() && text[i] == ' ')
            i++;
        const size_t begin = i;
        while (i < text.size() && text[i] != ' ')
            i++;
        if (i > begin)
            words.push_back(text.substr(begin, i - begin));
    }
    return words;
}

std::string WrittenOutDesignation(const std::string& id)
{
    const std::vector<std::string> words = Words(id);
    if (words.size() < 2 || words.size() > 3)
        return {};
    const std::string genitive = ConstellationGenitive(words[1]);
    if (genitive.empty())
        return {};
    // A component letter after the constellation: "A", "B", "Aa", "Bb".
    std::string component;
    if (words.size() == 3) {
        const std::string& c = words[2];
        if (c.size() > 2 || !std::isupper(static_cast<unsigned char>(c[0]))
            || (c.size() == 2 && !std::islower(static_cast<unsigned char>(c[1]))))
            return {};
        component = " " + c;
    }

    const std::string& first = words[0];
    if (std::all_of(first.begin(), first.end(), IsDigit))
        return first + " " + genitive + component; // Flamsteed
    // Bayer's Latin letters: lower case, or the capitals A to Q (from R on, capitals name
    // variable stars).
    if (first.size() == 1
        && (std::islower(static_cast<unsigned char>(first[0]))
            || (first[0] >= 'A' && first[0] <= 'Q')))
        return first + " " + genitive + component;
    size_t letters = 0;
    while (letters < first.size() && IsAlpha(first[letters]))
        letters++;
    const std::string number = first.substr(letters);
    if (!std::all_of(number.begin(), number.end(), IsDigit))
        return {};
    for (const auto& greek : kGreek) {
        if (EqualsIgnoringCase(first.substr(0, letters), greek.second))
            return greek.second + number + " " + genitive + component;
    }
    return {};
}

std::vector<std::string> DesignationForms(const std::string& id)
{
    const std::string written = WrittenOutDesignation(id);
    if (written.empty())
        return {};
    std::vector<std::string> forms { written };
    const std::vector<std::string> words = Words(id);
    const std::string genitive = ConstellationGenitive(words[1]);
    std::string abbreviation;
    for (const auto& [abbr, name] : kConstellations) {
        if (genitive == name)
            abbreviation = abbr;
    }
    const std::string tail = " " + abbreviation + (words.size() == 3 ? " " + words[2] : "");
    // The written-out form's first word: the Greek letter and its number, a Latin letter or a
    // Flamsteed number.
    const std::string first = written.substr(0, written.find(' '));
    size_t letters = 0;
    while (letters < first.size() && IsAlpha(first[letters]))
        letters++;
    if (letters <= 1) {
        forms.push_back(first + tail);
        return forms;
    }
    for (const auto& [letter, spelling] : kShortGreek) {
        if (first.compare(0, letters, letter) == 0 && std::strlen(letter) == letters)
            forms.push_back(spelling + first.substr(letters) + tail);
    }
    return forms;
}
