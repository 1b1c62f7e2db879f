// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The cost of an entry to the thread that writes it.

#include "common/log/TorkLog.h"
#include "log/LogEntrants.h"
#include "support/BenchmarkMain.h"
#include "support/ScratchFolder.h"

#include <benchmark/benchmark.h>

#include <memory>

namespace {

void WriteEntries(benchmark::State& state, LogEntrantFactory make)
{
    // Shared by the threads of a run, which start and end the loop in sync.
    static std::unique_ptr<ScratchFolder> folder;
    static std::unique_ptr<LogEntrant> log;
    if (state.thread_index() == 0) {
        folder = std::make_unique<ScratchFolder>();
        log = make(folder->path());
    }
    for (auto _ : state)
        log->write();
    if (state.thread_index() == 0) {
        log.reset();
        folder.reset();
    }
}

void ReadClock(benchmark::State& state)
{
    for (auto _ : state)
        benchmark::DoNotOptimize(QDateTime::currentMSecsSinceEpoch());
}

void WriteSwitchedOff(benchmark::State& state)
{
    const ScratchFolder folder;
    const QString message = QString::fromStdString(LogMessage());
    TorkLog log(folder.path());
    log.setEnable(false);
    for (auto _ : state)
        log.write(TorkLog::Notification, message);
}

} // namespace

void RegisterBenchmarks(bool quick)
{
    const int entries = quick ? 12000 : 48000;
    const std::vector<LogEntrantDescription> entrants = CheckedLogEntrants();
    for (int threads : {1, 2, 4}) {
        for (LogEntrantDescription const& entrant : entrants) {
            const std::string name = std::string("entry|") + entrant.name;
            benchmark::RegisterBenchmark(name.c_str(), WriteEntries, entrant.make)
                ->Iterations(entries / threads)
                ->Threads(threads)
                ->UseRealTime();
        }
    }

    const int calls = 1000000;
    benchmark::RegisterBenchmark("off|floor: reading the clock", ReadClock)
        ->Iterations(calls)
        ->UseRealTime();
    benchmark::RegisterBenchmark("off|TorkLog", WriteSwitchedOff)->Iterations(calls)->UseRealTime();
}
