// The Gaia DR3 and Hipparcos star files and their labels.
#include "tools/importer/GaiaCatalogue.h"

#include "core/Constants.h"
#include "tools/importer/Designations.h"
#include "tools/importer/SourceReaders.h"
#include "tools/importer/SpectralEstimates.h"
#include "tools/importer/StrictNumbers.h"

#include <algorithm>
#include <cerrno>
#include <cmath>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <optional>
#include <sstream>

namespace {

namespace fs = std::filesystem;

// Little-endian numbers at an offset the caller has checked.
template <typename T> T Little(std::string_view bytes, size_t at)
{
    using Unsigned = std::make_unsigned_t<T>;
    Unsigned value = 0;
    for (size_t i = 0; i < sizeof(T); i++)
        value |= static_cast<Unsigned>(static_cast<unsigned char>(bytes[at + i])) << (8 * i);
    return static_cast<T>(value);
}

float LittleFloat(std::string_view bytes, size_t at)
{
    const uint32_t bits = Little<uint32_t>(bytes, at);
    float value;
    std::memcpy(&value, &bits, sizeof value);
    return value;
}

[[noreturn]] void Refuse(const std::string& file, size_t offset, const std::string& reason)
{
    throw ImportError(file, 0, "at byte " + std::to_string(offset) + ": " + reason);
}

// The Julian date of J2000.0 and the length of a Julian year in days.
constexpr double kJ2000 = 2451545.0;
constexpr double kJulianYear = 365.25;
constexpr double kRadiansPerMicroarcsecond = kPI / 180 / 3600 / 1e6;

// The Greek letters of name.fab, in UTF-8, as WrittenOutDesignation spells them.
constexpr std::pair<const char*, const char*> kGreekLetters[] = {
    { "α", "alpha" },
    { "β", "beta" },
    { "γ", "gamma" },
    { "δ", "delta" },
    { "ε", "epsilon" },
    { "ζ", "zeta" },
    { "η", "eta" },
    { "θ", "theta" },
    { "ι", "iota" },
    { "κ", "kappa" },
    { "λ", "lambda" },
    { "μ", "mu" },
    { "ν", "nu" },
    { "ξ", "xi" },
    { "ο", "omicron" },
    { "π", "pi" },
    { "ρ", "rho" },
    { "σ", "sigma" },
    { "τ", "tau" },
    { "υ", "upsilon" },
    { "φ", "phi" },
    { "χ", "chi" },
    { "ψ", "psi" },
    { "ω", "omega" },
};

// "α1_Cen_A" -> "alpha1 Cen A": Greek letters spelled out, underscores made blanks.
std::string SpelledDesignation(std::string_view text)
{
    std::string out;
    for (size_t i = 0; i < text.size();) {
        bool greek = false;
        for (const auto& [letter, spelled] : kGreekLetters) {
            const size_t n = std::strlen(letter);
            if (text.compare(i, n, letter) == 0) {
                out += spelled;
                i += n;
                greek = true;
                break;
            }
        }
        if (!greek)
            out += text[i] == '_' ? ' ' : text[i];
        i += greek ? 0 : 1;
    }
    return out;
}

std::string_view Trimmed(std::string_view s)
{
    while (!s.empty() && (s.front() == ' ' || s.front() == '\t'))
        s.remove_prefix(1);
    while (!s.empty() && (s.back() == ' ' || s.back() == '\t' || s.back() == '\r'))
        s.remove_suffix(1);
    return s;
}

// Calls f(line, number) for each line of text that is neither blank nor a '#' comment.
template <typename F> void ForEachLine(std::string_view text, F f)
{
    int64_t number = 0;
    while (!text.empty()) {
        const size_t end = std::min(text.find('\n'), text.size());
        const std::string_view line = Trimmed(text.substr(0, end));
        text.remove_prefix(std::min(end + 1, text.size()));
        number++;
        if (!line.empty() && line.front() != '#')
            f(line, number);
    }
}

// The number before the '|' of a line of a .fab file.
uint64_t FabNumber(
    std::string_view line, size_t bar, const std::string& file, int64_t number, const char* what)
{
    const std::string_view digits = Trimmed(line.substr(0, bar));
    uint64_t value = 0;
    if (digits.empty() || digits.size() > 19
        || !std::all_of(digits.begin(), digits.end(), [](char c) { return c >= '0' && c <= '9'; }))
        throw ImportError(file, number, std::string("no ") + what + " before the '|'");
    for (char c : digits)
        value = value * 10 + static_cast<uint64_t>(c - '0');
    return value;
}

std::string ComponentSuffix(int component)
{
    return component >= 2 ? std::string(" ") + static_cast<char>('A' + component - 1) : "";
}

// The file's bytes whole.
std::string Slurp(const fs::path& path)
{
    std::ifstream in(path, std::ios::binary);
    if (!in)
        throw ImportError(path.string(), 0, std::string("cannot open: ") + std::strerror(errno));
    std::ostringstream bytes;
    bytes << in.rdbuf();
    if (in.bad())
        throw ImportError(path.string(), 0, "read error");
    return std::move(bytes).str();
}

bool StartsWith(const std::string& s, const char* prefix)
{
    return s.rfind(prefix, 0) == 0;
}

} // namespace

bool IsGaiaStarFile(std::string_view bytes)
{
    return bytes.size() >= 4 && Little<uint32_t>(bytes, 0) == kGaiaMagic;
}

std::string GaiaDesignation(uint64_t sourceId)
{
    return "Gaia DR3 " + std::to_string(sourceId);
}

void ReadGaiaSpectralTypes(std::string_view text, GaiaLabels& labels)
{
    labels.spectralTypes.clear();
    while (true) {
        const size_t end = text.find('\n');
        labels.spectralTypes.emplace_back(Trimmed(text.substr(0, end)));
        if (end == std::string_view::npos)
            break;
        text.remove_prefix(end + 1);
    }
}

void ReadGaiaIauNames(std::string_view text, const std::string& file, GaiaLabels& labels)
{
    ForEachLine(text, [&](std::string_view line, int64_t number) {
        const size_t bar = line.find('|');
        const size_t open = line.find("_(\"", bar == std::string_view::npos ? 0 : bar);
        const size_t close = open == std::string_view::npos ? open : line.find("\")", open + 3);
        if (bar == std::string_view::npos || close == std::string_view::npos)
            throw ImportError(file, number, "not a line 'number|_(\"name\")'");
        const uint64_t hip = FabNumber(line, bar, file, number, "Hipparcos number");
        const std::string name = CleanName(std::string(line.substr(open + 3, close - open - 3)));
        if (hip > 0 && hip <= UINT32_MAX && !name.empty())
            labels.iauNames.emplace(static_cast<uint32_t>(hip), name);
    });
}

void ReadGaiaDesignations(std::string_view text, const std::string& file, GaiaLabels& labels)
{
    ForEachLine(text, [&](std::string_view line, int64_t number) {
        const size_t bar = line.find('|');
        if (bar == std::string_view::npos)
            throw ImportError(file, number, "not a line 'number|designation'");
        const uint64_t id = FabNumber(line, bar, file, number, "star number");
        const std::string spelled = CleanName(SpelledDesignation(Trimmed(line.substr(bar + 1))));
        if (!spelled.empty())
            labels.designations.emplace(id, spelled);
    });
}

void ReadGaiaCrossIds(std::string_view bytes, const std::string& file, GaiaLabels& labels)
{
    constexpr size_t kRecord = 21;
    if (bytes.size() % kRecord != 0)
        Refuse(file, bytes.size() - bytes.size() % kRecord,
            "a cross-identification cut short (records are 21 bytes)");
    for (size_t at = 0; at < bytes.size(); at += kRecord) {
        const uint64_t id = Little<uint64_t>(bytes, at);
        const uint8_t component = static_cast<uint8_t>(bytes[at + 8]);
        GaiaLabels::CrossId cross;
        cross.hd = Little<uint32_t>(bytes, at + 13);
        cross.hr = Little<uint32_t>(bytes, at + 17);
        if (id > 0 && id < (UINT64_MAX >> 5) && component < 32 && (cross.hd || cross.hr))
            labels.crossIds.emplace(id * 32 + component, cross);
    }
}

namespace {

// One record as the file holds it.
struct GaiaRecord {
    uint64_t sourceId;
    double direction[3]; // unit vector at the file's epoch
    double motion[3]; // microarcseconds a year
    double bv, v; // magnitudes
    double parallax; // milliarcseconds
    // The parallax and its error in units of 0.01 mas, whole numbers, for comparing them
    // without rounding.
    uint32_t parallaxHundredths, errorHundredths;
    int spectralLine;
    uint32_t hip;
    int component;
};

GaiaRecord Decode(std::string_view bytes, size_t at)
{
    GaiaRecord r;
    r.sourceId = Little<uint64_t>(bytes, at);
    for (int i = 0; i < 3; i++) {
        r.direction[i] = Little<int32_t>(bytes, at + 8 + 4 * i) / 2e9;
        r.motion[i] = Little<int32_t>(bytes, at + 20 + 4 * i);
    }
    r.bv = Little<int16_t>(bytes, at + 32) / 1000.0;
    r.v = Little<int16_t>(bytes, at + 34) / 1000.0;
    r.parallax = Little<uint16_t>(bytes, at + 36) * 0.02;
    r.parallaxHundredths = 2u * Little<uint16_t>(bytes, at + 36);
    r.errorHundredths = Little<uint16_t>(bytes, at + 38);
    r.spectralLine = Little<uint16_t>(bytes, at + 42);
    const uint32_t hipAndComponent = static_cast<unsigned char>(bytes[at + 45])
        | static_cast<unsigned char>(bytes[at + 46]) << 8
        | static_cast<unsigned char>(bytes[at + 47]) << 16;
    r.hip = hipAndComponent >> 5;
    r.component = static_cast<int>(hipAndComponent & 31);
    return r;
}

// Names the star and gives it its other names, from the labels.
void Label(ImportStar& star, const GaiaRecord& r, const GaiaLabels& labels)
{
    const std::string suffix = ComponentSuffix(r.component);
    std::string iau;
    if (r.hip > 0) {
        const auto found = labels.iauNames.find(r.hip);
        if (found != labels.iauNames.end())
            iau = found->second + suffix;
    }
    // Bayer designations before Latin letters before Flamsteed numbers.
    std::string bayer, latin, flamsteed;
    auto designations = [&](uint64_t id) {
        const auto [begin, end] = labels.designations.equal_range(id);
        for (auto it = begin; it != end; ++it) {
            std::string spelled = it->second;
            if (!suffix.empty() && Words(spelled).size() == 2)
                spelled += suffix;
            const std::vector<std::string> forms = DesignationForms(spelled);
            if (forms.empty()) {
                AddAlias(star, spelled); // a variable star's name, "R And"
                continue;
            }
            for (const std::string& form : forms)
                AddAlias(star, form);
            const char first = spelled[0];
            std::string& kind = first >= '0' && first <= '9' ? flamsteed
                : Words(spelled)[0].size() == 1              ? latin
                                                             : bayer;
            if (kind.empty())
                kind = forms.front();
        }
    };
    if (r.hip > 0)
        designations(r.hip);
    if (r.sourceId > 0)
        designations(r.sourceId);

    std::string hd, hr;
    auto crossIds = [&](uint64_t id) {
        if (!hd.empty() || !hr.empty() || id >= (UINT64_MAX >> 5))
            return;
        auto found = labels.crossIds.find(id * 32 + static_cast<uint64_t>(r.component));
        if (found == labels.crossIds.end())
            found = labels.crossIds.find(id * 32);
        if (found == labels.crossIds.end())
            return;
        if (found->second.hd)
            hd = "HD " + std::to_string(found->second.hd);
        if (found->second.hr)
            hr = "HR " + std::to_string(found->second.hr);
    };
    if (r.hip > 0)
        crossIds(r.hip);
    if (r.sourceId > 0)
        crossIds(r.sourceId);
    const std::string hip = r.hip > 0 ? "HIP " + std::to_string(r.hip) : "";
    const std::string gaia = r.sourceId > 0 ? GaiaDesignation(r.sourceId) : "";
    for (const std::string& name : { iau, hd, hr, hip, gaia })
        AddAlias(star, name);
    NameStar(star,
        { { iau, NameKind::Proper }, { bayer, NameKind::Designation },
            { latin, NameKind::Designation }, { flamsteed, NameKind::Designation },
            { hd, NameKind::HenryDraper }, { hip, NameKind::Other }, { gaia, NameKind::Other } });
}

} // namespace

void ReadGaiaStars(std::string_view bytes, const std::string& file, const GaiaLabels& labels,
    std::vector<ImportStar>& stars, ImportReport& report)
{
    if (bytes.size() < kGaiaHeaderBytes)
        Refuse(file, bytes.size(),
            "the file ends within its header (" + std::to_string(kGaiaHeaderBytes) + " bytes)");
    if (!IsGaiaStarFile(bytes))
        Refuse(file, 0, "not a Gaia star file (wrong magic number)");
    const int32_t type = Little<int32_t>(bytes, 4), major = Little<int32_t>(bytes, 8);
    const int32_t level = Little<int32_t>(bytes, 16);
    const double epoch = LittleFloat(bytes, 24);
    if (type != 0)
        Refuse(file, 4, "data type " + std::to_string(type) + ", only stars (0) are read");
    if (major != 0)
        Refuse(file, 8, "format version " + std::to_string(major) + ", only version 0 is read");
    if (level < 0 || level > kGaiaMaxLevel)
        Refuse(file, 16,
            "zone level " + std::to_string(level) + ", not 0 to " + std::to_string(kGaiaMaxLevel));
    // Julian dates from 1900 to 2100.
    if (!(epoch >= 2415020 && epoch <= 2488070))
        Refuse(file, 24, "the epoch is no Julian date of 1900 to 2100");
    const double years = (epoch - kJ2000) / kJulianYear;

    const size_t zones = 20 * (size_t { 1 } << (2 * level)) + 1;
    const size_t countsEnd = kGaiaHeaderBytes + 4 * zones;
    if (countsEnd > bytes.size())
        Refuse(file, bytes.size(),
            "the file ends within its table of " + std::to_string(zones) + " zone counts");
    // At most 20 * 4^12 + 1 counts, each under 2^31: the total cannot overflow.
    uint64_t total = 0;
    const size_t room = (bytes.size() - countsEnd) / kGaiaRecordBytes;
    size_t overrun = 0; // the count that takes the total past the room, 0 while none has
    for (size_t z = 0; z < zones; z++) {
        const int32_t count = Little<int32_t>(bytes, kGaiaHeaderBytes + 4 * z);
        if (count < 0)
            Refuse(file, kGaiaHeaderBytes + 4 * z,
                "zone " + std::to_string(z) + " holds " + std::to_string(count) + " stars");
        total += static_cast<uint64_t>(count);
        if (total > room && overrun == 0)
            overrun = kGaiaHeaderBytes + 4 * z;
    }
    if (total > room && (bytes.size() - countsEnd) % kGaiaRecordBytes != 0)
        Refuse(file, countsEnd + room * kGaiaRecordBytes,
            "the file ends within star " + std::to_string(room + 1) + " of the "
                + std::to_string(total) + " its zone counts name");
    if (total > room)
        Refuse(file, overrun,
            "the zone counts name " + std::to_string(total) + " stars, the file holds "
                + std::to_string(room));
    const size_t end = countsEnd + total * kGaiaRecordBytes;
    if (end != bytes.size())
        Refuse(file, end,
            std::to_string(bytes.size() - end) + " bytes after the last star the counts name"
                + ((bytes.size() - end) % kGaiaRecordBytes ? " (a truncated star)" : ""));

    stars.reserve(stars.size() + total);
    for (size_t i = 0; i < total; i++) {
        const size_t at = countsEnd + i * kGaiaRecordBytes;
        const GaiaRecord r = Decode(bytes, at);
        report.read++;
        const double norm = std::hypot(r.direction[0], r.direction[1], r.direction[2]);
        if (!(std::abs(norm - 1) < 1e-3))
            Refuse(file, at + 8, "the star's direction is no unit vector");
        if (r.parallax <= 0) {
            report.Skip("without a parallax");
            continue;
        }
        // In whole hundredths of a milliarcsecond: 1.70 mas is five times 0.34 mas, though
        // 85 * 0.02 falls short of 5 * (34 * 0.01) in floating point.
        if (r.parallaxHundredths < kGaiaParallaxSigmas * r.errorHundredths) {
            report.Skip("with a parallax under five times its error");
            continue;
        }
        ImportStar star;
        star.line = static_cast<int64_t>(i) + 1;
        // Back from the file's epoch to J2000 along the proper motion.
        double d[3];
        for (int k = 0; k < 3; k++)
            d[k] = r.direction[k] / norm - years * r.motion[k] * kRadiansPerMicroarcsecond;
        const double n = std::hypot(d[0], d[1], d[2]);
        star.ra = std::atan2(d[1], d[0]);
        if (star.ra < 0)
            star.ra += 2 * kPI;
        // A negative angle smaller than half the spacing of doubles near a turn rounds up to the
        // turn itself.
        if (star.ra >= 2 * kPI)
            star.ra = 0;
        star.dec = std::asin(std::clamp(d[2] / n, -1.0, 1.0));
        star.parallax = r.parallax;
        star.gaiaId = r.sourceId;
        star.absoluteMagnitude = r.v + 5 + 5 * std::log10(r.parallax / 1000);
        if (!(star.absoluteMagnitude >= kMinMagnitude && star.absoluteMagnitude <= kMaxMagnitude))
            Refuse(file, at + 34, "an absolute magnitude out of range");
        star.component
            = r.component >= 1 && r.component <= 26 ? static_cast<char>('A' + r.component - 1) : 0;

        const std::string published = r.spectralLine > 0
                && static_cast<size_t>(r.spectralLine) < labels.spectralTypes.size()
            ? CleanSpectralClass(
                ShortSpectralType(labels.spectralTypes[static_cast<size_t>(r.spectralLine)]))
            : "";
        if (!published.empty()) {
            star.spectralClass = PublishedClass(published, r.bv, report);
        } else {
            star.spectralClass = ClassFromColour(r.bv);
            star.classEstimated = true;
            report.classesFromColour++;
        }
        Label(star, r, labels);
        stars.push_back(std::move(star));
    }
}

void ReadGaiaCatalogue(
    const std::string& path, std::vector<ImportStar>& stars, ImportReport& report)
{
    std::error_code error;
    const bool folder = fs::is_directory(path, error);
    const fs::path dir = folder ? fs::path(path) : fs::path(path).parent_path();
    std::vector<fs::path> starFiles;
    fs::path types;
    for (fs::directory_iterator entry(dir.empty() ? fs::path(".") : dir, error), end;
         !error && entry != end; entry.increment(error)) {
        const std::string name = entry->path().filename().string();
        if (StartsWith(name, "stars_hip_sp_") && entry->path().extension() == ".cat")
            types = entry->path();
        else if (folder && name.size() > 8 && StartsWith(name, "stars_") && name[6] >= '0'
            && name[6] <= '9' && name[7] == '_' && entry->path().extension() == ".cat")
            starFiles.push_back(entry->path());
    }
    if (!folder)
        starFiles.push_back(path);
    if (starFiles.empty())
        throw ImportError(path, 0, "holds no star files (stars_<digit>_*.cat)");
    std::sort(starFiles.begin(), starFiles.end());

    GaiaLabels labels;
    if (!types.empty())
        ReadGaiaSpectralTypes(Slurp(types), labels);
    const fs::path iau = dir / "common_star_names.fab", designations = dir / "name.fab",
                   crossIds = dir / "cross-id.cat";
    if (fs::exists(iau, error))
        ReadGaiaIauNames(Slurp(iau), iau.string(), labels);
    if (fs::exists(designations, error))
        ReadGaiaDesignations(Slurp(designations), designations.string(), labels);
    if (fs::exists(crossIds, error))
        ReadGaiaCrossIds(Slurp(crossIds), crossIds.string(), labels);
    for (const fs::path& file : starFiles)
        ReadGaiaStars(Slurp(file), file.string(), labels, stars, report);
}
