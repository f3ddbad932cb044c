// Frame times for measuring the running program: when the environment variable
// NIGHTDOME_FRAME_LOG names a file, every chart appends a line for each frame its render loop
// starts ("render") and each time its window is painted ("paint"): the event, the chart (an
// address, to tell several apart) and the microseconds since the first line. bench/running-chart.sh
// reads it. Without the variable nothing is written and a note costs one test.
#pragma once

#include <chrono>
#include <cstdio>
#include <cstdlib>

class FrameLog {
public:
    static void Note(const char* event, const void* chart)
    {
        static FrameLog log;
        if (!log.fFile)
            return;
        const auto us = std::chrono::duration_cast<std::chrono::microseconds>(
            std::chrono::steady_clock::now() - log.fStart)
                            .count();
        // One call a line: the C library keeps lines from two threads whole.
        std::fprintf(log.fFile, "%s %p %lld\n", event, chart, static_cast<long long>(us));
    }

private:
    FrameLog()
    {
        if (const char* path = std::getenv("NIGHTDOME_FRAME_LOG"); path && *path) {
            fFile = std::fopen(path, "w");
            // Written line by line: the program may be ended by a signal.
            if (fFile)
                std::setvbuf(fFile, nullptr, _IOLBF, 0);
        }
    }
    ~FrameLog()
    {
        if (fFile)
            std::fclose(fFile);
    }

    std::FILE* fFile = nullptr;
    const std::chrono::steady_clock::time_point fStart = std::chrono::steady_clock::now();
};
