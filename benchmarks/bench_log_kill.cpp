// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// What is lost if a program is killed while it writes entries: those whose call has returned, but
// which are not in the file. Beside it the time that a call took, as this is what the time is for.

#include "log/LogEntrants.h"
#include "support/Measurements.h"
#include "support/ScratchFolder.h"

#include <QCoreApplication>

#include <algorithm>
#include <atomic>
#include <chrono>
#include <csignal>
#include <random>
#include <sys/mman.h>
#include <sys/wait.h>
#include <thread>
#include <unistd.h>

namespace {

using Clock = std::chrono::steady_clock;

// Shared with the process that is killed.
struct Progress
{
    std::atomic<int> returned{0};
    std::atomic<long> nanoseconds{0}; // since the first entry
};

struct Contestant
{
    LogEntrantDescription description;
    int lost;
    int mostLost;
    std::vector<double> times;
};

bool IsCompared(LogEntrantDescription const& entrant)
{
    return entrant.make != MakeFloorEntrant && entrant.make != MakeFixedPartsEntrant &&
           entrant.make != MakeTorkLogBelowLimitEntrant &&
           entrant.make != MakeSpdlogRotatingEntrant; // what was rotated is not in one file
}

[[noreturn]] void WriteForever(LogEntrant& log, Progress& progress)
{
    const Clock::time_point begin = Clock::now();
    for (;;) {
        log.write();
        progress.nanoseconds = std::chrono::nanoseconds(Clock::now() - begin).count();
        ++progress.returned;
    }
}

void KillOnce(Contestant& contestant, std::chrono::microseconds life)
{
    void* const memory = ::mmap(nullptr, sizeof(Progress), PROT_READ | PROT_WRITE,
                                MAP_SHARED | MAP_ANONYMOUS, -1, 0);
    Require(memory != MAP_FAILED, QStringLiteral("no shared memory"));
    auto* const progress = new (memory) Progress;
    const ScratchFolder folder;
    const pid_t child = ::fork();
    if (child == 0)
        WriteForever(*contestant.description.make(folder.path()), *progress);

    while (progress->returned == 0)
        std::this_thread::yield();
    std::this_thread::sleep_for(life);
    ::kill(child, SIGKILL);
    ::waitpid(child, nullptr, 0);
    const int lost = std::max(0, int(progress->returned) - EntriesIn(folder.path()));
    contestant.lost += lost;
    contestant.mostLost = std::max(contestant.mostLost, lost);
    contestant.times.push_back(double(progress->nanoseconds) / progress->returned);
    ::munmap(memory, sizeof(Progress));
}

double Median(std::vector<double>& values)
{
    std::sort(values.begin(), values.end());
    return values[values.size() / 2];
}

} // namespace

// bench_log_kill RESULTS [--quick]
int main(int argc, char** argv)
{
    QCoreApplication application(argc, argv);
    const QStringList arguments = QCoreApplication::arguments();
    Require(arguments.size() > 1, QStringLiteral("usage: bench_log_kill RESULTS [--quick]"));
    const int kills = arguments.contains("--quick") ? 10 : 50;

    std::vector<Contestant> contestants;
    for (LogEntrantDescription const& entrant : CheckedLogEntrants()) {
        if (IsCompared(entrant))
            contestants.push_back({entrant, 0, 0, {}});
    }
    contestants.push_back({{"spdlog async_logger", MakeSpdlogAsyncEntrant}, 0, 0, {}});

    std::mt19937 random{std::random_device{}()};
    for (int round = 0; round < kills; ++round) {
        std::shuffle(contestants.begin(), contestants.end(), random);
        for (Contestant& contestant : contestants)
            KillOnce(contestant, std::chrono::microseconds(2000 + random() % 20000));
    }

    Measurements measurements;
    for (Contestant& contestant : contestants) {
        measurements.addRow("entries lost when the program is killed", contestant.description.name,
                            {{"time of an entry", Median(contestant.times), "ns"},
                             {"kills", double(kills), ""},
                             {"lost in all", double(contestant.lost), ""},
                             {"most in one kill", double(contestant.mostLost), ""}});
    }
    measurements.save(arguments[1]);
    return 0;
}
