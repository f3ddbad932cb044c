// Fuzzing the star-list CSV reader over a small universe with shared names and shared places.
// Whatever the input, reading never fails to stop; a table read names exactly the systems it
// says it found, every row is either matched or has its line kept, and the found set, written
// and read again, comes back the same.
#include "ImportRoundTrip.h"

#include "catalog/Star.h"
#include "catalog/Universe.h"
#include "query/SystemSetCsv.h"

#include <memory>
#include <string_view>

namespace {

const Universe& FuzzUniverse()
{
    static const std::unique_ptr<Universe> universe = [] {
        auto u = std::make_unique<Universe>(20);
        const struct {
            const char* name;
            double x, y, z;
        } systems[] = {
            { "Sol", 0, 0, 0 },
            { "a", 1, 2, 3 },
            { "b", 1, 2, 3 }, // at a's place
            { "a", -1, 0.5, 1e-7 }, // a's name
            { "Smith, J.", 1e6, -1e6, 0.1 },
            { "q\"\r\n", 0.30000000000000004, 1.0 / 3, -2 },
            { "", 5, 5, 5 },
        };
        int32_t i = 0;
        for (const auto& s : systems) {
            auto* system = new StarSystem(s.name, SVector(s.x, s.y, s.z), 1, nullptr, 2);
            system->AddItem(new Star(s.name, "G2V", 4.8, 1));
            // Companions share names, but never two systems at one place (a and b): a row of
            // such a name at that place could only mean the first of them.
            system->AddItem(new Star(i++ % 2 ? "B" : "C", "M5", 12, 1));
            u->AddItem(system);
        }
        u->AddItem(new StarSystem("starless", SVector(9, 9, 9), 1, nullptr, 2));
        return u;
    }();
    return *universe;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    const Universe& universe = FuzzUniverse();
    static const SystemMatcher matcher(&universe);
    const int32_t count = universe.CountItems();
    StarSysMask found(count, true, 0);
    const std::string_view text(reinterpret_cast<const char*>(data), size);
    const SystemSetCsvResult result = SystemSetCsv::Read(text, matcher, &found);
    if (!result.ok) {
        FuzzCheck(found.CountItems(true) == 0, "a table not read left systems in the set");
        FuzzCheck(result.error.rfind("line ", 0) == 0, "an error without its line");
        return 0;
    }
    FuzzCheck(SystemSetCsv::HasUsableHeader(text), "a table read without a usable header");
    FuzzCheck(found.CountItems(true) == result.systems, "the set's size is not the count given");
    FuzzCheck(result.matchedRows + int64_t(result.unmatchedLines.size()) == result.rows,
        "a row neither matched nor reported");
    FuzzCheck(result.systems <= result.matchedRows, "more systems than matched rows");

    const std::string written = SystemSetCsv::Write(universe, found);
    StarSysMask again(count, false, 0);
    const SystemSetCsvResult back = SystemSetCsv::Read(written, matcher, &again);
    FuzzCheck(back.ok && back.unmatchedLines.empty(), "a written table does not read back");
    for (int32_t i = 0; i < count; i++)
        FuzzCheck(found.GetStateSafe(i) == again.GetStateSafe(i), "the set read back differs");
    return 0;
}
