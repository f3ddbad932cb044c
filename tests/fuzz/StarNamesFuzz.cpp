// Fuzzing the reader of the names file beside a catalogue. The names are read for a fixed
// catalogue of seven stars in five systems, 98 bytes long; the first byte of an input picks the
// size of the reading window and, in its top bit, whether the catalogue was read only up to its
// first three stars; the rest is the names file. Whatever the window, the names kept and what
// the reading reports are those a window holding the whole input gives; every name kept is 1 to
// 79 printable ASCII characters; a file that is stale or no names file keeps nothing.
#include "ImportRoundTrip.h"

#include "catalog/StarNames.h"
#include "catalog/Universe.h"

#include <cstdio>
#include <cstring>
#include <memory>
#include <string>

namespace {

using File = std::unique_ptr<std::FILE, int (*)(std::FILE*)>;

// Seven stars; the second and third, and the fifth and sixth, share their places.
constexpr char kCatalogue[] = "A\nG2V 4 0 0 0\nB\nG2V 4 1 0 0\nC\nK1V 5 1 0 0\nD\nM5V 9 2 0 0\n"
                              "E\nM5V 9 3 0 0\nF\nM5V 9 3 0 0\nG\nM5V 9 4 0 0\n";
static_assert(sizeof kCatalogue - 1 == 98);

void ReadUniverse(Universe* universe, int32_t maxStars)
{
    std::string text = kCatalogue;
    File file(fmemopen(text.data(), text.size(), "rb"), &std::fclose);
    FuzzCheck(file != nullptr, "cannot open the catalogue as a file");
    ReadCatalogue(file.get(), maxStars, universe);
}

StarNamesReport Read(std::string& text, size_t window, bool cut, Universe* universe)
{
    File file(fmemopen(text.data(), text.size(), "rb"), &std::fclose);
    FuzzCheck(file != nullptr, "cannot open the input as a file");
    StarNamesReport report;
    ReadStarNames(file.get(), sizeof kCatalogue - 1, cut, universe, &report, window);
    return report;
}

// Every name of universe, each after its system's number.
std::string AllNames(const Universe& universe)
{
    std::string all;
    int64_t count = 0;
    for (int32_t s = 0; s <= universe.CountItems(); s++) {
        const StarNames::Range range = universe.otherNames.Of(s);
        FuzzCheck(range.begin <= range.end, "a system's names end before they begin");
        FuzzCheck(range.begin == range.end || range.end[-1] == '\0', "names run on past their end");
        for (const char* name = range.begin; name < range.end; name += std::strlen(name) + 1) {
            const size_t length = std::strlen(name);
            FuzzCheck(length >= 1 && length <= kMaxOtherName, "a name of a wrong length is kept");
            for (size_t i = 0; i < length; i++)
                FuzzCheck(name[i] >= ' ' && name[i] <= '~', "a name holds a bad character");
            all += std::to_string(s) + ":" + name + "\n";
            count++;
        }
    }
    FuzzCheck(count == universe.otherNames.Count(), "the names counted are not the names held");
    return all;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    if (size < 1)
        return 0;
    const size_t window = 1 + size_t(data[0] & 0x7f) * 5;
    const bool cut = (data[0] & 0x80) != 0;
    std::string text(reinterpret_cast<const char*>(data) + 1, size - 1);

    Universe small(5000), whole(5000);
    ReadUniverse(&small, cut ? 3 : 1000000);
    ReadUniverse(&whole, cut ? 3 : 1000000);
    const StarNamesReport smallReport = Read(text, window, cut, &small);
    const StarNamesReport wholeReport = Read(text, text.size() + 1, cut, &whole);
    FuzzCheck(smallReport == wholeReport, "the window changes what the reading reports");
    const std::string names = AllNames(whole);
    FuzzCheck(AllNames(small) == names, "the window changes the names kept");
    FuzzCheck(!(wholeReport.notNames || wholeReport.stale) || names.empty(),
        "a stale file or one that is no names file leaves names behind");
    FuzzCheck(!wholeReport.notNames || !wholeReport.stale, "a file both stale and no names file");
    FuzzCheck(std::memchr(text.data(), '\0', text.size()) == nullptr || wholeReport.notNames,
        "a NUL byte is missed");
    return 0;
}
