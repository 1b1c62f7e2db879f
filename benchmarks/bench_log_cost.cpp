// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// What an entry asks of the system and of the heap: the system calls and allocations of the thread
// that writes it, counted from outside and by the allocator.

#include "log/LogEntrants.h"
#include "support/Measurements.h"
#include "support/ScratchFolder.h"

#include <QCoreApplication>

#include <atomic>
#include <csignal>
#include <sys/mman.h>
#include <sys/ptrace.h>
#include <sys/wait.h>
#include <unistd.h>

// The C library's own, under the names that it has for whoever replaces them.
extern "C" {
void* __libc_malloc(size_t size);
void* __libc_calloc(size_t count, size_t size);
void* __libc_realloc(void* memory, size_t size);

static thread_local long t_allocations = 0;

void* malloc(size_t size)
{
    ++t_allocations;
    return __libc_malloc(size);
}

void* calloc(size_t count, size_t size)
{
    ++t_allocations;
    return __libc_calloc(count, size);
}

void* realloc(void* memory, size_t size)
{
    ++t_allocations;
    return __libc_realloc(memory, size);
}
}

namespace {

constexpr int Entries = 1000;

struct Cost
{
    double systemCalls;
    double allocations;
};

// Stops for the parent before and after the entries.
[[noreturn]] void WriteTraced(LogEntrant& log, long* allocations)
{
    for (int entry = 0; entry < 100; ++entry)
        log.write(); // opens the file, and fills what is kept
    ::ptrace(PTRACE_TRACEME, 0, nullptr, nullptr);
    std::raise(SIGSTOP);
    const long before = t_allocations;
    for (int entry = 0; entry < Entries; ++entry)
        log.write();
    *allocations = t_allocations - before;
    std::raise(SIGSTOP);
    ::_exit(0);
}

// Continues the child until it stops by itself, and counts its system calls.
int SystemCallsUntilStop(pid_t child)
{
    int stops = 0;
    for (;;) {
        ::ptrace(PTRACE_SYSCALL, child, nullptr, nullptr);
        int status = 0;
        Require(::waitpid(child, &status, 0) == child && WIFSTOPPED(status),
                QStringLiteral("a process ended while it was counted"));
        if (WSTOPSIG(status) == SIGSTOP)
            return stops / 2; // one stop at the beginning of each call, one at its end
        ++stops;
    }
}

Cost CostOf(LogEntrantDescription const& entrant)
{
    auto* const allocations = static_cast<long*>(
        ::mmap(nullptr, sizeof(long), PROT_READ | PROT_WRITE, MAP_SHARED | MAP_ANONYMOUS, -1, 0));
    Require(allocations != MAP_FAILED, QStringLiteral("no shared memory"));
    const ScratchFolder folder;
    const pid_t child = ::fork();
    if (child == 0) {
        const std::unique_ptr<LogEntrant> log = entrant.make(folder.path());
        WriteTraced(*log, allocations);
    }
    int status = 0;
    Require(::waitpid(child, &status, 0) == child && WIFSTOPPED(status),
            QStringLiteral("%1 was not traced").arg(QLatin1String(entrant.name)));
    const int calls = SystemCallsUntilStop(child);
    ::kill(child, SIGKILL);
    ::waitpid(child, nullptr, 0);
    const Cost cost = {double(calls) / Entries, double(*allocations) / Entries};
    ::munmap(allocations, sizeof(long));
    return cost;
}

} // namespace

// bench_log_cost RESULTS [--quick]
int main(int argc, char** argv)
{
    QCoreApplication application(argc, argv);
    const QStringList arguments = QCoreApplication::arguments();
    Require(arguments.size() > 1, QStringLiteral("usage: bench_log_cost RESULTS [--quick]"));

    Measurements measurements;
    for (LogEntrantDescription const& entrant : CheckedLogEntrants()) {
        const Cost cost = CostOf(entrant);
        measurements.addRow(
            "what an entry needs", entrant.name,
            {{"system calls", cost.systemCalls, ""}, {"allocations", cost.allocations, ""}});
    }
    measurements.save(arguments[1]);
    return 0;
}
