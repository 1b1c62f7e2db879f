// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "support/BenchmarkMain.h"

#include <QCoreApplication>

#include <benchmark/benchmark.h>

#include <cstring>

// Google Benchmark's command line options, after an optional --quick.
int main(int argc, char** argv)
{
    const bool quick = argc > 1 && std::strcmp(argv[1], "--quick") == 0;
    if (quick) {
        argv[1] = argv[0];
        ++argv;
        --argc;
    }
    QCoreApplication application(argc, argv);
    QCoreApplication::setApplicationName("velocor-bench");

    benchmark::Initialize(&argc, argv);
    if (benchmark::ReportUnrecognizedArguments(argc, argv))
        return 1;
    RegisterBenchmarks(quick);
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    return 0;
}
