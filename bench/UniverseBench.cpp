// Reading a catalogue of a million stars, and the real sky, into a Universe: time per read,
// megabytes of catalogue read per second, and the memory the universe and the reading take at
// their peak.
#include "catalog/Universe.h"
#include "platform/ExecutablePath.h"
#include "render/SpectralTables.h"

#include <benchmark/benchmark.h>

#include <cstdio>
#include <filesystem>
#include <fstream>
#include <malloc.h>
#include <random>
#include <string>
#include <sys/wait.h>
#include <unistd.h>

namespace {

// A deterministic catalogue like the real one: names, classes, magnitudes with two decimals,
// positions in parsecs with six, and about one star in eight a companion at its primary's
// position.
std::filesystem::path WriteCatalogue(int stars)
{
    const auto path = std::filesystem::temp_directory_path()
        / ("nightdome-bench-" + std::to_string(getpid()) + ".dat");
    std::FILE* out = std::fopen(path.c_str(), "w");
    std::mt19937 random(20261121);
    std::uniform_real_distribution<double> coordinate(-500, 500);
    std::uniform_real_distribution<double> magnitude(-5, 16);
    static const char* kClasses[]
        = { "O9V", "B2IV", "A0V", "F5V", "G2V", "K1III", "M4Ve", "K5", "B9.5V", "G8III" };
    double x = 0, y = 0, z = 0;
    for (int i = 0; i < stars; i++) {
        if (i == 0 || random() % 8 != 0) {
            x = coordinate(random);
            y = coordinate(random);
            z = coordinate(random);
        }
        std::fprintf(out, "HIP %d\n%s %.2f %.6f %.6f %.6f\n", 100000 + i, kClasses[random() % 10],
            magnitude(random), x, y, z);
    }
    std::fclose(out);
    return path;
}

long StatusKilobytes(const char* field)
{
    std::ifstream status("/proc/self/status");
    std::string key;
    long value = 0;
    while (status >> key) {
        if (key == field) {
            status >> value;
            return value;
        }
        status.ignore(1 << 16, '\n');
    }
    return 0;
}

// How far the resident memory of a fresh process rises above where it stood while it reads the
// catalogue: measured in a child, so that neither earlier reads nor the allocator's caches of
// this process hide anything.
double PeakGrowthMB(const std::filesystem::path& path)
{
    int channel[2];
    if (pipe(channel) != 0)
        return -1;
    const pid_t child = fork();
    if (child == 0) {
        close(channel[0]);
        // A forked process inherits its parent's heap, freed memory resident, and its peak:
        // give the memory back and start the peak afresh from here.
        malloc_trim(0);
        if (std::FILE* clear = std::fopen("/proc/self/clear_refs", "w")) {
            std::fputs("5", clear);
            std::fclose(clear);
        }
        const long before = StatusKilobytes("VmRSS:");
        const Universe universe(path.c_str(), 1000000, 5000);
        const long growth = StatusKilobytes("VmHWM:") - before;
        [[maybe_unused]] const auto written = write(channel[1], &growth, sizeof growth);
        _exit(0);
    }
    close(channel[1]);
    long growth = -1;
    [[maybe_unused]] const auto got = read(channel[0], &growth, sizeof growth);
    close(channel[0]);
    waitpid(child, nullptr, 0);
    return growth / 1024.0;
}

// Reads the catalogue at path over and over: the time of a read, its speed over the file's
// bytes, and peakMB, the growth of a fresh process that reads it once.
void ReadCatalogueRepeatedly(
    benchmark::State& state, const std::filesystem::path& path, double peakMB)
{
    ScopedSpectralTables tables;
    const double fileMB = std::filesystem::file_size(path) / 1e6;
    int64_t systems = 0;
    int64_t stars = 0;
    for (auto _ : state) {
        auto* universe = new Universe(path.c_str(), 1000000, 5000);
        state.PauseTiming();
        systems = universe->CountItems();
        stars = 0;
        for (int32_t i = 0; i < systems; i++)
            stars += universe->SystemAt(i)->CountItems();
        delete universe;
        state.ResumeTiming();
    }
    state.counters["systems"] = static_cast<double>(systems);
    state.counters["stars"] = static_cast<double>(stars);
    state.counters["peak_MB"] = peakMB;
    state.counters["file_MB"] = fileMB;
    state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * fileMB * 1e6));
}

void BM_ReadMillionStarCatalogue(benchmark::State& state)
{
    const int stars = static_cast<int>(state.range(0));
    const auto path = WriteCatalogue(stars);
    // Once, before any read of this process: the benchmark runs this function several times,
    // and later runs would find the heap of earlier ones already resident.
    static const double peakMB = PeakGrowthMB(path);
    ReadCatalogueRepeatedly(state, path, peakMB);
    std::filesystem::remove(path);
}

// The real sky the program ships, when the build has made it: beside the program, in app/.
void BM_ReadRealSky(benchmark::State& state)
{
    const auto path = ExecutableDirectory() / ".." / "app" / "stars.dat";
    if (!std::filesystem::exists(path)) {
        state.SkipWithError("no app/stars.dat in this build");
        return;
    }
    static const double peakMB = PeakGrowthMB(path);
    ReadCatalogueRepeatedly(state, path, peakMB);
}

} // namespace

BENCHMARK(BM_ReadMillionStarCatalogue)->Arg(1000000)->Unit(benchmark::kMillisecond)->MinTime(3);
BENCHMARK(BM_ReadRealSky)->Unit(benchmark::kMillisecond)->MinTime(3);

BENCHMARK_MAIN();
