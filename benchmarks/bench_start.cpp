// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Whole processes, from exec to the first paint event of the first window; the program and a bare
// window alternate. Needs a display.
//
// Google Benchmark measures within a process, so the starts are timed here; the results use its
// format.

#include "support/Measurements.h"
#include "support/ScratchFolder.h"

#include <algorithm>
#include <array>
#include <cstdio>
#include <ctime>
#include <random>
#include <spawn.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

namespace {

struct Program
{
    char const* name;
    std::string path;
};

struct Start
{
    double nanoseconds;
    double processorNanoseconds;
    double peakKiB;
};

long long NowInNanoseconds()
{
    timespec now = {};
    clock_gettime(CLOCK_MONOTONIC, &now);
    return now.tv_sec * 1000000000LL + now.tv_nsec;
}

double Nanoseconds(timeval const& time)
{
    return double(time.tv_sec) * 1e9 + double(time.tv_usec) * 1e3;
}

std::string ReadToEnd(int descriptor)
{
    std::string text;
    std::array<char, 256> buffer = {};
    ssize_t count = 0;
    while ((count = ::read(descriptor, buffer.data(), buffer.size())) > 0)
        text.append(buffer.data(), size_t(count));
    return text;
}

// Starts the program, which reports when its window got its paint event, and exits.
Start StartOnce(Program const& program)
{
    int ends[2] = {};
    Require(::pipe(ends) == 0, QStringLiteral("no pipe"));
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    posix_spawn_file_actions_adddup2(&actions, ends[1], STDOUT_FILENO);
    posix_spawn_file_actions_addclose(&actions, ends[0]);
    posix_spawn_file_actions_addclose(&actions, ends[1]);

    std::string path = program.path;
    char* arguments[] = {path.data(), nullptr};
    pid_t child = 0;
    const long long begin = NowInNanoseconds();
    const int failed = ::posix_spawn(&child, path.c_str(), &actions, nullptr, arguments, ::environ);
    Require(failed == 0, QStringLiteral("%1 does not start").arg(program.name));
    ::close(ends[1]);
    const std::string reported = ReadToEnd(ends[0]);
    ::close(ends[0]);
    rusage usage = {};
    ::wait4(child, nullptr, 0, &usage);
    posix_spawn_file_actions_destroy(&actions);

    long long painted = 0;
    long peak = 0;
    Require(std::sscanf(reported.c_str(), "%lld %ld", &painted, &peak) == 2,
            QStringLiteral("%1 showed no window").arg(program.name));
    return {double(painted - begin), Nanoseconds(usage.ru_utime) + Nanoseconds(usage.ru_stime),
            double(peak)};
}

} // namespace

// bench_start RESULTS ROUNDS
int main(int argc, char** argv)
{
    Require(argc >= 3, QStringLiteral("usage: bench_start RESULTS ROUNDS"));
    ::setenv("QT_QPA_PLATFORM", "xcb", 1);
    ::setenv("QT_PLUGIN_PATH", VELOCOR_PROBE_PLUGINS, 1);
    ::setenv("QT_QPA_GENERIC_PLUGINS", "startprobe", 1);

    std::array<Program, 4> programs = {
        Program{"floor: bare QMainWindow", VELOCOR_BARE_WINDOW},
        Program{"empty window, no OpenGL", VELOCOR_EMPTY_WINDOW},
        Program{"window of labels, no OpenGL", VELOCOR_LABEL_WINDOW},
        Program{"velocor", VELOCOR_PROGRAM},
    };
    std::mt19937 random{std::random_device{}()};
    Measurements measurements;
    const int rounds = std::atoi(argv[2]);
    for (int round = 0; round <= rounds; ++round) {
        std::shuffle(programs.begin(), programs.end(), random);
        for (Program const& program : programs) {
            const Start start = StartOnce(program);
            if (round == 0) // not yet in the file cache, and creates the log's settings
                continue;
            measurements.add("start, time", program.name, start.nanoseconds, "ns",
                             start.processorNanoseconds);
            measurements.add("start, peak memory", program.name, start.peakKiB, "KiB");
        }
    }
    measurements.save(QString::fromLocal8Bit(argv[1]));
    return 0;
}
