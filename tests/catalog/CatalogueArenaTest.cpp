// Stars, systems and names built in a universe's arena: what they share, how they end, and
// how little room a million of them take.
#include "TempCatalogue.h"

#include "catalog/CatalogueArena.h"
#include "catalog/Star.h"
#include "catalog/Universe.h"
#include "render/SpectralTables.h"

#include <gtest/gtest.h>

#include <cinttypes>
#include <cstdint>
#include <cstdio>
#include <fstream>
#include <memory>
#include <string>
#include <vector>

namespace {

// Reads text through a window of window bytes into universe.
void ReadThrough(const std::string& text, Universe* universe, size_t window)
{
    std::string copy = text;
    std::unique_ptr<std::FILE, int (*)(std::FILE*)> in(
        fmemopen(copy.data(), copy.size(), "rb"), &std::fclose);
    ReadCatalogue(in.get(), 1000000, universe, window);
}

} // namespace

TEST(CatalogueArena, ObjectsAndNamesLiveInItAndEndWithoutBeingDeleted)
{
    CatalogueArena arena;
    char* name = arena.Keep("Alpha Centauri AB", 14);
    EXPECT_STREQ(name, "Alpha Centauri");
    auto* system = arena.Make<StarSystem>(GravName::Kept(name), SVector(1, 2, 3), 1.5, nullptr, 2);
    auto* a = arena.Make<Star>(GravName::Kept(name), "G2V", 4.38, 1);
    auto* b = arena.Make<Star>("Alpha Centauri B", "K1V", 5.71, 1);
    // A star from the heap may join an arena's system: each ends the way it was made.
    auto* c = new Star("Proxima Centauri", "M5Ve", 15.5, 1);
    for (Star* star : { a, b, c })
        system->AddItem(star);
    EXPECT_TRUE(system->inArena && a->inArena && b->inArena);
    EXPECT_FALSE(c->inArena);
    EXPECT_EQ(system->GetName(), name);
    EXPECT_EQ(a->GetName(), name);
    EXPECT_FALSE(system->ownsName);
    EXPECT_STREQ(b->GetName(), "Alpha Centauri B");
    EXPECT_TRUE(b->ownsName);
    EXPECT_EQ(reinterpret_cast<uintptr_t>(system) % alignof(StarSystem), 0u);
    EXPECT_EQ(reinterpret_cast<uintptr_t>(b) % alignof(Star), 0u);
    EXPECT_EQ(b->GetID(), a->GetID() + 1);
    EXPECT_EQ(system->StarAt(2)->GetSpectralClass()->harvardClass, kClassM);
    // Its members, the heap star's storage and the copied name are released here; the leak
    // checker of the sanitizer build would notice otherwise.
    GravSystem::Destroy(system);
}

TEST(CatalogueArena, ManyObjectsFillBlockAfterBlock)
{
    CatalogueArena arena;
    std::vector<Star*> stars;
    for (int i = 0; i < 100000; i++) {
        char* name = arena.Keep("Star", 1 + i % 4);
        stars.push_back(arena.Make<Star>(GravName::Kept(name), "K", double(i), 1));
    }
    EXPECT_GT(arena.Reserved(), 100000 * sizeof(Star));
    EXPECT_LT(arena.Reserved(), 100000 * (sizeof(Star) + 16) + (size_t(8) << 20));
    for (int i = 0; i < 100000; i += 997) {
        EXPECT_EQ(stars[i]->GetMagnitude(), i);
        EXPECT_EQ(std::string(stars[i]->GetName()), std::string("Star").substr(0, 1 + i % 4));
    }
    for (Star* star : stars)
        GravSystem::Destroy(star);
}

namespace {

// The kilobytes of large pages in the mapping of this process that holds address, from
// /proc/self/smaps; -1 when no mapping holds it.
long LargePageKilobytesAt(const void* address)
{
    std::ifstream smaps("/proc/self/smaps");
    const auto at = reinterpret_cast<uintptr_t>(address);
    bool inside = false;
    std::string line;
    while (std::getline(smaps, line)) {
        uintptr_t from = 0, to = 0;
        if (std::sscanf(line.c_str(), "%" SCNxPTR "-%" SCNxPTR " ", &from, &to) == 2
            && line.find(':') > line.find(' ')) {
            inside = from <= at && at < to;
            continue;
        }
        long kilobytes = 0;
        if (inside && std::sscanf(line.c_str(), "AnonHugePages: %ld kB", &kilobytes) == 1)
            return kilobytes;
    }
    return -1;
}

} // namespace

TEST(CatalogueArena, LargeBlocksAreMappedInLargePages)
{
    // A million stars are forty blocks of 4 MiB: in pages of 4 KiB the system would fault
    // them in forty thousand times, a third of the time the whole reading takes.
    std::ifstream setting("/sys/kernel/mm/transparent_hugepage/enabled");
    std::string modes;
    std::getline(setting, modes);
    if (modes.empty() || modes.find("[never]") != std::string::npos)
        GTEST_SKIP() << "this system maps no large pages";
    CatalogueArena arena;
    std::vector<Star*> stars;
    while (arena.Reserved() < (size_t(8) << 20))
        stars.push_back(arena.Make<Star>("", "K", 0.0, 1));
    EXPECT_GE(LargePageKilobytesAt(stars.back()), 2048);
    for (Star* star : stars)
        GravSystem::Destroy(star);
}

TEST(CatalogueArena, AStarOrSystemTakesEightyBytesAndItsNameOnlyItsOwnLength)
{
    // A million stars in about 875,000 systems, as the benchmark's catalogue holds, must fit
    // in 200 MB with their names and the universe's list: 80 bytes each, not the 152 of an
    // inline 80-character name buffer.
    EXPECT_LE(sizeof(Star), 80u);
    EXPECT_LE(sizeof(StarSystem), 80u);
}

namespace {

class CatalogueReadTest : public ::testing::Test {
protected:
    ScopedSpectralTables tables;
};

} // namespace

TEST_F(CatalogueReadTest, ASystemSharesItsPrimarysNameAndRenamingOneLeavesTheOther)
{
    const TempCatalogue file("Sirius A\nA1V 1.42 -0.5 -0.7 2.5\n"
                             "Sirius B\nDA2 11.18 -0.5 -0.7 2.5\n"
                             "Procyon A\nF5IV-V 2.66 -0.9 1.0 3.3\n");
    Universe u(file.PathString().c_str(), 1000000, 5000);
    ASSERT_EQ(u.CountItems(), 2);
    StarSystem* sirius = u.SystemAt(0);
    EXPECT_EQ(sirius->GetName(), sirius->StarAt(0)->GetName());
    EXPECT_STREQ(sirius->StarAt(1)->GetName(), "Sirius B");
    EXPECT_TRUE(sirius->inArena);
    sirius->SetName("The Dog Star");
    EXPECT_STREQ(sirius->GetName(), "The Dog Star");
    EXPECT_STREQ(sirius->StarAt(0)->GetName(), "Sirius A");
    EXPECT_STREQ(u.SystemAt(1)->GetName(), "Procyon A");
}

TEST_F(CatalogueReadTest, ARecordAcrossTheWindowsEdgeAtEveryByteReadsWhole)
{
    // The record under test starts one byte later each time, so that the edge of the reading
    // window falls at every byte of it, in windows smaller and larger than a record.
    const std::string record = "Gliese 581\nM3V 11.560 -1.234567 -6.060606 0.001000\n";
    for (size_t window : { size_t(1), size_t(13), size_t(64), size_t(1000), size_t(4096) }) {
        for (size_t shift = 0; shift <= record.size() + 8; shift++) {
            const std::string text = std::string(1 + shift, 'P') + "\nG2V 4.83 1 1 1\n" + record
                + "Last\nK0 5 7 7 7\n";
            Universe u(5000);
            ReadThrough(text, &u, window);
            ASSERT_EQ(u.CountItems(), 3) << window << " " << shift;
            const StarSystem* s = u.SystemAt(1);
            EXPECT_STREQ(s->GetName(), "Gliese 581") << window << " " << shift;
            EXPECT_EQ(s->StarAt(0)->magnitude, 11.56) << window << " " << shift;
            EXPECT_EQ(s->position.x, -1.234567) << window << " " << shift;
            EXPECT_EQ(s->position.y, -6.060606) << window << " " << shift;
            EXPECT_EQ(s->position.z, 0.001) << window << " " << shift;
            EXPECT_STREQ(s->StarAt(0)->GetSpectralClassString(), "M3V");
            EXPECT_STREQ(u.SystemAt(2)->GetName(), "Last");
        }
    }
}

TEST_F(CatalogueReadTest, RepeatedClassesAndMagnitudesReadAsEachOnItsOwn)
{
    // Classes and magnitudes that come back again and again, more different ones than any
    // small memory of them holds, mixed with long class texts and ones that differ only past
    // their seventh character, read as if each were the first.
    std::vector<std::string> classes = { "G2V", "K1III", "sdB5", "M4.5Ve", "DA2", "K1IIIbCN0.5",
        "K1IIIbCN1.5", "A", "B+", "G12", "wn7" };
    for (const char letter : std::string("OBAFGKM"))
        for (int tenths = 0; tenths < 100; tenths += 5)
            for (const char* luminosity : { "V", "III" })
                classes.push_back(letter + std::to_string(tenths / 10) + "."
                    + std::to_string(tenths % 10) + luminosity);
    const int count = 6000;
    std::string text;
    for (int i = 0; i < count; i++) {
        text += "S" + std::to_string(i) + "\n" + classes[(i * 7919) % classes.size()] + " "
            + std::to_string((i % 7) * 1.25 - 3) + " " + std::to_string(i) + " 0 0\n";
    }
    Universe u(5000);
    ReadThrough(text, &u, kCatalogueWindow);
    ASSERT_EQ(u.CountItems(), count);
    for (int i = 0; i < count; i++) {
        const StarSystem* s = u.SystemAt(i);
        const Star* star = s->StarAt(0);
        const SpectralClass expected(classes[(i * 7919) % classes.size()].c_str());
        ASSERT_STREQ(star->GetSpectralClassString(), expected.GetSCString()) << i;
        ASSERT_EQ(star->spectralClass.harvardClass, expected.harvardClass) << i;
        ASSERT_EQ(star->spectralClass.decimalClass, expected.decimalClass) << i;
        ASSERT_EQ(star->magnitude, (i % 7) * 1.25 - 3) << i;
        ASSERT_EQ(s->luminosity, SolarLuminosity(star->magnitude)) << i;
        ASSERT_EQ(s->colorTable, SpectralTableFor(expected.harvardClass)) << i;
    }
}

TEST(CatalogueArena, GeneratedSystemsAreBuiltInTheArenaAndShareOneEmptyName)
{
    // A generated million must not cost a million small allocations for empty names.
    const std::unique_ptr<Universe> u(
        Universe::Generate(3000, kMediumDensity, 500, Random(1, 4096, 150889, 714025)));
    ASSERT_EQ(u->CountItems(), 3000);
    const char* shared = u->SystemAt(0)->GetName();
    for (int32_t i = 0; i < u->CountItems(); i++) {
        const StarSystem* s = u->SystemAt(i);
        EXPECT_TRUE(s->inArena) << i;
        EXPECT_FALSE(s->ownsName) << i;
        EXPECT_EQ(s->GetName(), shared) << i;
    }
    EXPECT_STREQ(shared, "");
    EXPECT_GE(u->Arena()->Reserved(), 3000 * sizeof(StarSystem));
}

TEST_F(CatalogueReadTest, ASmallCatalogueTakesASmallBlockAndAMillionFewLargeOnes)
{
    // Tests and tools read many small catalogues: each must not claim megabytes.
    const TempCatalogue file("Sol\nG2V 4.83 0 0 0\nAlpha Centauri A\nG2V 4.38 -0.5 -0.4 -1.2\n");
    const Universe u(file.PathString().c_str(), 1000000, 5000);
    ASSERT_EQ(u.CountItems(), 2);
    EXPECT_LE(const_cast<Universe&>(u).Arena()->Reserved(), size_t(64) << 10);

    CatalogueArena arena;
    for (int i = 0; i < 200000; i++)
        GravSystem::Destroy(arena.Make<StarSystem>("", SVector(i, 0, 0), 1.0, nullptr, 1));
    // 16 MB of systems in blocks that double up to 4 MiB: no more than a block's worth over.
    EXPECT_GE(arena.Reserved(), 200000 * sizeof(StarSystem));
    EXPECT_LE(arena.Reserved(), 200000 * sizeof(StarSystem) + (size_t(4) << 20));
}
