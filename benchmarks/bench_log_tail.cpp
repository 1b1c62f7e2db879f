// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// How long single entries take, down to the slowest: under several threads, and while the file is
// rotated. Google Benchmark knows no percentiles, so each call is timed here.

#include "log/LogEntrants.h"
#include "support/Measurements.h"
#include "support/ScratchFolder.h"

#include <QCoreApplication>

#include <algorithm>
#include <atomic>
#include <chrono>
#include <random>
#include <thread>

namespace {

using Clock = std::chrono::steady_clock;
using Times = std::vector<double>;

struct Contestant
{
    LogEntrantDescription description;
    Times times;
};

bool IsCompared(LogEntrantDescription const& entrant)
{
    return entrant.make != MakeFixedPartsEntrant && entrant.make != MakeTorkLogBelowLimitEntrant &&
           entrant.make != MakeTorkLogByQtMessagesEntrant;
}

Times WriteEntries(LogEntrant& log, int entries, std::atomic<bool> const& isStarted)
{
    Times times;
    times.reserve(size_t(entries));
    while (!isStarted)
        std::this_thread::yield();
    for (int entry = 0; entry < entries; ++entry) {
        const Clock::time_point before = Clock::now();
        log.write();
        times.push_back(std::chrono::duration<double, std::nano>(Clock::now() - before).count());
    }
    return times;
}

// Has `threads` threads write at the same time; the file is reopened meanwhile if asked for.
void Run(Contestant& contestant, int threads, int entries, bool reopens)
{
    const ScratchFolder folder;
    const std::unique_ptr<LogEntrant> log = contestant.description.make(folder.path());
    log->write(); // opens the file

    std::atomic<bool> isStarted{false};
    std::atomic<int> running{threads};
    std::vector<Times> times(static_cast<size_t>(threads));
    std::vector<std::thread> writers;
    for (Times& own : times) {
        writers.emplace_back([&] {
            own = WriteEntries(*log, entries / threads, isStarted);
            --running;
        });
    }
    isStarted = true;
    while (reopens && running > 0) {
        std::this_thread::sleep_for(std::chrono::milliseconds(2));
        log->reopen();
    }
    for (std::thread& writer : writers)
        writer.join();
    for (Times const& own : times)
        contestant.times.insert(contestant.times.end(), own.begin(), own.end());
}

double Percentile(Times const& sorted, double share)
{
    return sorted[std::min(sorted.size() - 1, size_t(double(sorted.size()) * share))];
}

class TailRun
{
public:
    explicit TailRun(bool quick) : m_rounds(quick ? 2 : 10), m_entries(quick ? 8000 : 32000) {}

    void compare(QString const& group, std::vector<LogEntrantDescription> const& entrants,
                 int threads, bool reopens)
    {
        std::vector<Contestant> contestants;
        for (LogEntrantDescription const& entrant : entrants)
            contestants.push_back({entrant, {}});
        for (int round = 0; round < m_rounds; ++round) {
            std::shuffle(contestants.begin(), contestants.end(), m_random);
            for (Contestant& contestant : contestants)
                Run(contestant, threads, m_entries, reopens);
        }
        for (Contestant& contestant : contestants)
            keep(group, contestant);
    }

    Measurements const& measurements() const { return m_measurements; }

private:
    void keep(QString const& group, Contestant& contestant)
    {
        Times& times = contestant.times;
        std::sort(times.begin(), times.end());
        m_measurements.addRow(group, contestant.description.name,
                              {{"p50", Percentile(times, 0.5), "ns"},
                               {"p99", Percentile(times, 0.99), "ns"},
                               {"p99.9", Percentile(times, 0.999), "ns"},
                               {"worst", times.back(), "ns"}});
    }

    int m_rounds;
    int m_entries;
    Measurements m_measurements;
    std::mt19937 m_random{std::random_device{}()};
};

} // namespace

// bench_log_tail RESULTS [--quick]
int main(int argc, char** argv)
{
    QCoreApplication application(argc, argv);
    const QStringList arguments = QCoreApplication::arguments();
    Require(arguments.size() > 1, QStringLiteral("usage: bench_log_tail RESULTS [--quick]"));

    std::vector<LogEntrantDescription> entrants = CheckedLogEntrants();
    entrants.erase(std::remove_if(entrants.begin(), entrants.end(),
                                  [](auto const& entrant) { return !IsCompared(entrant); }),
                   entrants.end());
    TailRun run(arguments.contains("--quick"));
    run.compare("single entries, 1 thread", entrants, 1, false);
    run.compare("single entries, 4 threads", entrants, 4, false);
    run.compare("single entries, 16 threads", entrants, 16, false);
    run.compare("single entries, 4 threads, file rotated meanwhile",
                {{"TorkLog", MakeTorkLogSmallEntrant},
                 {"spdlog rotating_file_sink_mt", MakeSpdlogSmallEntrant}},
                4, true);
    run.measurements().save(arguments[1]);
    return 0;
}
