// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The cost of an entry when entries are rare, and everything cached between them is cold or out of
// date: one per millisecond, and one per second.
//
// Google Benchmark cannot pace calls, so they are timed here; the results use its format.

#include "log/LogEntrants.h"
#include "support/Measurements.h"
#include "support/ScratchFolder.h"

#include <QCoreApplication>

#include <algorithm>
#include <chrono>
#include <random>
#include <thread>

namespace {

using Clock = std::chrono::steady_clock;

struct Runner
{
    char const* name;
    std::unique_ptr<ScratchFolder> folder;
    std::unique_ptr<LogEntrant> log;
};

// Qt has a single message handler, which the two entrants that use it would take from each other if
// both existed at the same time.
bool NeedsMessageHandler(LogEntrantDescription const& entrant)
{
    return entrant.make == MakeQtHandlerEntrant || entrant.make == MakeTorkLogByQtMessagesEntrant ||
           entrant.make == MakeTorkLogBelowLimitEntrant;
}

double NanosecondsOfOneEntry(LogEntrant& log)
{
    const Clock::time_point before = Clock::now();
    log.write();
    return std::chrono::duration<double, std::nano>(Clock::now() - before).count();
}

class PacedRun
{
public:
    PacedRun()
    {
        for (LogEntrantDescription const& entrant : CheckedLogEntrants()) {
            if (NeedsMessageHandler(entrant))
                continue;
            auto folder = std::make_unique<ScratchFolder>();
            auto log = entrant.make(folder->path());
            m_runners.push_back({entrant.name, std::move(folder), std::move(log)});
        }
    }

    // In each round every entrant writes a series of entries, one per millisecond. The first of the
    // series follows a pause and is left out.
    void onePerMillisecond(int rounds)
    {
        const int entries = 50;
        for (int round = 0; round < rounds; ++round) {
            shuffle();
            for (Runner& runner : m_runners) {
                Clock::time_point next = Clock::now();
                for (int entry = 0; entry <= entries; ++entry) {
                    std::this_thread::sleep_until(next += std::chrono::milliseconds(1));
                    const double nanoseconds = NanosecondsOfOneEntry(*runner.log);
                    if (entry > 0)
                        keep("paced, one per millisecond", runner, nanoseconds);
                }
            }
        }
    }

    // Every second each entrant writes one entry, spread over the second, always in the same order
    // so that a second passes between two entries of each.
    void onePerSecond(int seconds)
    {
        shuffle();
        const auto step = std::chrono::microseconds(1000000 / m_runners.size());
        Clock::time_point next = Clock::now();
        for (int second = 0; second <= seconds; ++second) {
            for (Runner& runner : m_runners) {
                std::this_thread::sleep_until(next += step);
                const double nanoseconds = NanosecondsOfOneEntry(*runner.log);
                if (second > 0)
                    keep("paced, one per second", runner, nanoseconds);
            }
        }
    }

    Measurements const& measurements() const { return m_measurements; }

private:
    void shuffle() { std::shuffle(m_runners.begin(), m_runners.end(), m_random); }

    void keep(QString const& group, Runner const& runner, double nanoseconds)
    {
        m_measurements.add(group, runner.name, nanoseconds, "ns");
    }

    std::vector<Runner> m_runners;
    Measurements m_measurements;
    std::mt19937 m_random{std::random_device{}()};
};

} // namespace

// bench_log_paced RESULTS [--quick]
int main(int argc, char** argv)
{
    QCoreApplication application(argc, argv);
    const QStringList arguments = QCoreApplication::arguments();
    Require(arguments.size() > 1, QStringLiteral("usage: bench_log_paced RESULTS [--quick]"));
    const bool quick = arguments.contains("--quick");

    PacedRun run;
    run.onePerMillisecond(quick ? 4 : 20);
    run.onePerSecond(quick ? 8 : 40);

    run.measurements().save(arguments[1]);
    return 0;
}
