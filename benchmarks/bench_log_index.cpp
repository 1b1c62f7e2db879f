// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// What the index of a log file costs for each line, without reading the file: the part of opening
// a file that no larger buffer and no faster disk helps.

#include "app/logfile/LogIndex.h"
#include "support/BenchmarkMain.h"
#include "support/LargeLog.h"
#include "support/ScratchFolder.h"

#include <benchmark/benchmark.h>

#include <cstring>

using namespace Velocor;

namespace {

struct Log
{
    QByteArray bytes;
    qint64 lines = 0;
};

constexpr int SliceSize = 1 << 17; // as much as LogScanner reads at once

void IndexLog(benchmark::State& state, Log const& log)
{
    for (auto _ : state) {
        LogIndex index;
        index.Begin();
        for (int at = 0; at < log.bytes.size(); at += SliceSize) {
            const int count = std::min(SliceSize, log.bytes.size() - at);
            Require(index.Feed(log.bytes.constData() + at, count),
                    QStringLiteral("the index knows lines of a file that it has never seen"));
        }
        index.End();
        Require(qint64(index.size()) == log.lines && index.isOneRun() == false,
                QStringLiteral("the index has other lines than the file"));
    }
    state.counters["units"] = double(log.lines);
}

void FindLineEnds(benchmark::State& state, Log const& log)
{
    for (auto _ : state) {
        qint64 lines = 0;
        char const* at = log.bytes.constData();
        char const* const end = at + log.bytes.size();
        while (auto const* found =
                   static_cast<char const*>(std::memchr(at, '\n', size_t(end - at)))) {
            ++lines;
            at = found + 1;
        }
        Require(lines == log.lines, QStringLiteral("the file has other lines than were written"));
    }
    state.counters["units"] = double(log.lines);
}

} // namespace

void RegisterBenchmarks(bool quick)
{
    static Log log;
    LargeLog maker;
    const int size = (quick ? 20 : 100) * 1000 * 1000;
    log.bytes.reserve(size + 1000);
    while (log.bytes.size() < size)
        maker.Append(log.bytes);
    log.lines = maker.lines();

    benchmark::RegisterBenchmark("index of a log in memory|floor: line ends found", FindLineEnds,
                                 log)
        ->Iterations(1)
        ->UseRealTime();
    benchmark::RegisterBenchmark("index of a log in memory|velocor: line ends, times, severities",
                                 IndexLog, log)
        ->Iterations(1)
        ->UseRealTime();
}
