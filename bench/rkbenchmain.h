#pragma once

#include "app/rkapp.h"

#include <QApplication>

#include <benchmark/benchmark.h>

// main() for a benchmark program that needs the host core: a QApplication (offscreen when there is
// no display and the program draws nothing), the RkApp, then the benchmarks given on the command
// line.
#define RK_BENCHMARK_MAIN(needsDisplay)                                                            \
    int main(int argc, char** argv)                                                                \
    {                                                                                              \
        if (!(needsDisplay) && qEnvironmentVariableIsEmpty("DISPLAY"))                             \
            qputenv("QT_QPA_PLATFORM", "offscreen");                                               \
        QApplication app(argc, argv);                                                              \
        RkApp core;                                                                                \
        benchmark::Initialize(&argc, argv);                                                        \
        if (benchmark::ReportUnrecognizedArguments(argc, argv))                                    \
            return 1;                                                                              \
        benchmark::RunSpecifiedBenchmarks();                                                       \
        benchmark::Shutdown();                                                                     \
        return 0;                                                                                  \
    }
