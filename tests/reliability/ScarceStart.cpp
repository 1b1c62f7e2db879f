// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// A library to be preloaded, with ScarceMemory.cpp, into an unchanged program (LD_PRELOAD): an
// allocation of its start fails, and when it is waiting for its user it is asked to quit.
//
//     SCARCE_STEP    which allocation; 0: none
//     SCARCE_LASTS   set: and all later ones
//     SCARCE_REPORT  the file for the result: "count NUMBER", if it came to wait, after "reached"
//     if
//                    an allocation had failed; "crash LIBRARY", if it crashed; "endless LIBRARY",
//                    if it does not come to an end

#include "reliability/CrashSite.h"
#include "reliability/ScarceMemory.h"
#include "support/NextFunction.h"

#include <array>
#include <atomic>
#include <climits>
#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fcntl.h>
#include <poll.h>
#include <string>
#include <sys/resource.h>
#include <sys/syscall.h>
#include <sys/time.h>
#include <unistd.h>

namespace {

// Kept here, because later the environment may be out of reach.
std::array<char, PATH_MAX> s_report;
std::atomic<bool> s_isWaiting{false};

void Report(char const* what, char const* more)
{
    std::array<char, PATH_MAX> line = {};
    const int length = std::snprintf(line.data(), line.size(), "%s %s\n", what, more);
    const int file = ::open(s_report.data(), O_WRONLY | O_CREAT | O_APPEND, 0666);
    if (file < 0 || ::write(file, line.data(), static_cast<size_t>(length)) != length)
        std::abort();
    ::close(file);
}

void NoteCrash(int signal)
{
    ScarceMemory::mend();
    Report("crash", CrashSite::file());
    std::signal(signal, SIG_DFL);
    std::raise(signal);
}

void NoteEndlessness(int)
{
    ScarceMemory::mend();
    Report("endless", CrashSite::file());
    std::raise(SIGKILL);
}

__attribute__((constructor)) void Begin()
{
    const char* const step = std::getenv("SCARCE_STEP");
    const char* const report = std::getenv("SCARCE_REPORT");
    if (!step || !report)
        return;
    std::snprintf(s_report.data(), s_report.size(), "%s", report);
    const rlimit none = {0, 0};
    setrlimit(RLIMIT_CORE, &none);
    for (const int signal : {SIGSEGV, SIGBUS, SIGTRAP, SIGFPE, SIGILL})
        std::signal(signal, NoteCrash);
    // A start takes a small part of a second of the processor's time, however busy it is.
    std::signal(SIGPROF, NoteEndlessness);
    const itimerval second = {{0, 0}, {1, 0}};
    setitimer(ITIMER_PROF, &second, nullptr);
    const bool lasts = std::getenv("SCARCE_LASTS") != nullptr;
    unsetenv("LD_PRELOAD"); // no program that it starts
    ScarceMemory::failAt(std::atol(step), lasts ? ScarceMemory::FromThereOn : ScarceMemory::Once);
}

// The first time that the main thread has nothing to do.
void NoteWait()
{
    if (!s_report[0] || s_isWaiting || ::getpid() != ::syscall(SYS_gettid))
        return;
    s_isWaiting = true;
    ScarceMemory::mend();
    if (ScarceMemory::reached())
        Report("reached", "");
    Report("count", std::to_string(ScarceMemory::count()).c_str());
    ::kill(::getpid(), SIGTERM);
}

} // namespace

extern "C" {

int poll(pollfd* files, nfds_t count, int limit)
{
    ORIGINAL(poll);
    if (limit != 0)
        NoteWait();
    return original(files, count, limit);
}

int ppoll(pollfd* files, nfds_t count, timespec const* limit, sigset_t const* mask)
{
    ORIGINAL(ppoll);
    if (!limit || limit->tv_sec != 0 || limit->tv_nsec != 0)
        NoteWait();
    return original(files, count, limit, mask);
}

} // extern "C"
