// The main of a benchmark of widgets: an offscreen QApplication (unless QT_QPA_PLATFORM names
// another platform) with the program's resources loaded, around Google Benchmark's own main.
#pragma once

#include "resources/ResourceData.h"

#include <QApplication>
#include <benchmark/benchmark.h>

// Runs registerAll(), which registers the benchmarks made at run time, then every benchmark
// the command line selects. Answers main's exit status.
template <typename Register> int RunWidgetBenchmarks(int argc, char** argv, Register registerAll)
{
    if (qEnvironmentVariableIsEmpty("QT_QPA_PLATFORM"))
        qputenv("QT_QPA_PLATFORM", "offscreen");
    QApplication application(argc, argv);
    InitResources();
    registerAll();
    benchmark::Initialize(&argc, argv);
    if (benchmark::ReportUnrecognizedArguments(argc, argv))
        return 1;
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    return 0;
}
