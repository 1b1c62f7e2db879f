// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "support/Processes.h"

#include "support/ScratchFolder.h"

#include <QDir>

#include <algorithm>
#include <array>
#include <chrono>
#include <csignal>
#include <ctime>
#include <fcntl.h>
#include <malloc.h>
#include <spawn.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <thread>
#include <unistd.h>
#include <vector>

namespace {

double TimeOf(rusage const& usage)
{
    return 1e9 * double(usage.ru_utime.tv_sec + usage.ru_stime.tv_sec) +
           1e3 * double(usage.ru_utime.tv_usec + usage.ru_stime.tv_usec);
}

// A value of a file such as /proc/self/status; 0 if there is none.
double ValueOf(QString const& fileName, QByteArray const& key)
{
    const QByteArray text = '\n' + ReadAll(fileName);
    const int start = text.indexOf('\n' + key + ':');
    return start < 0 ? 0
                     : text.mid(start + key.size() + 2, 30).simplified().split(' ')[0].toDouble();
}

// Starts a program. Its output goes to a pipe, of which this is the end to read, or is dropped.
pid_t Start(QStringList const& command, int* pipeEnd)
{
    int ends[2] = {-1, -1};
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    if (pipeEnd) {
        Require(::pipe2(ends, O_CLOEXEC) == 0, QStringLiteral("no pipe"));
        posix_spawn_file_actions_adddup2(&actions, ends[1], STDOUT_FILENO);
    } else {
        posix_spawn_file_actions_addopen(&actions, STDOUT_FILENO, "/dev/null", O_WRONLY, 0);
    }
    posix_spawn_file_actions_addopen(&actions, STDIN_FILENO, "/dev/null", O_RDONLY, 0);
    posix_spawn_file_actions_addopen(&actions, STDERR_FILENO, "/dev/null", O_WRONLY, 0);

    std::vector<QByteArray> texts;
    for (QString const& argument : command)
        texts.push_back(argument.toLocal8Bit());
    std::vector<char*> arguments;
    for (QByteArray& text : texts)
        arguments.push_back(text.data());
    arguments.push_back(nullptr);
    pid_t process = -1;
    const int failed =
        ::posix_spawnp(&process, arguments[0], &actions, nullptr, arguments.data(), ::environ);
    posix_spawn_file_actions_destroy(&actions);
    Require(failed == 0, command.first() + QStringLiteral(" does not start"));
    if (pipeEnd) {
        ::close(ends[1]);
        *pipeEnd = ends[0];
    }
    return process;
}

} // namespace

double OwnProcessorTime()
{
    rusage usage = {};
    ::getrusage(RUSAGE_SELF, &usage);
    return TimeOf(usage);
}

double OwnMemoryKiB()
{
    ::malloc_trim(0); // memory that was already freed is not in use
    return ValueOf(QStringLiteral("/proc/self/status"), "VmRSS");
}

double AvailableMemoryKiB()
{
    return ValueOf(QStringLiteral("/proc/meminfo"), "MemAvailable");
}

ProcessCost RunToEnd(QStringList const& command)
{
    ProcessCost cost;
    int output = -1;
    const pid_t process = Start(command, &output);
    std::vector<char> buffer(1 << 16);
    ssize_t count = 0;
    while ((count = ::read(output, buffer.data(), buffer.size())) > 0) {
        cost.lines += std::count(buffer.begin(), buffer.begin() + count, '\n');
        if (cost.output.isEmpty())
            cost.output.append(buffer.data(), int(count));
    }
    ::close(output);

    rusage usage = {};
    int status = 0;
    ::wait4(process, &status, 0, &usage);
    Require(WIFEXITED(status) && WEXITSTATUS(status) == 0,
            command.join(' ') + QStringLiteral(" failed"));
    cost.processorTime = TimeOf(usage);
    return cost;
}

RunningProcess::RunningProcess(QStringList const& command, Output output)
    : m_name(command.join(' ')), m_process(Start(command, output == ToPipe ? &m_output : nullptr))
{}

RunningProcess::~RunningProcess()
{
    if (m_process > 0) {
        ::kill(m_process, SIGKILL);
        ::waitpid(m_process, nullptr, 0);
    }
    if (m_output >= 0)
        ::close(m_output);
}

void RunningProcess::WaitUntilIdle() const
{
    constexpr int Part = 250;                    // milliseconds
    constexpr double Little = 0.02 * 1e6 * Part; // nanoseconds, two percent
    double before = processorTime();
    for (int idle = 0; idle < 1000 / Part;) {
        std::this_thread::sleep_for(std::chrono::milliseconds(Part));
        const double now = processorTime();
        idle = now - before < Little ? idle + 1 : 0;
        before = now;
    }
    Require(::waitpid(m_process, nullptr, WNOHANG) == 0, m_name + QStringLiteral(" ended"));
}

// Not from wait4(): its peak includes that of the process that started this one.
double RunningProcess::WaitUntilEnded()
{
    double peak = 0;
    int status = 0;
    while (::waitpid(m_process, &status, WNOHANG) == 0) {
        peak = std::max(peak, ValueOf(folder() + "status", "VmHWM"));
        std::this_thread::sleep_for(std::chrono::milliseconds(5));
    }
    m_process = -1;
    Require(WIFEXITED(status) && WEXITSTATUS(status) == 0, m_name + QStringLiteral(" failed"));
    return peak;
}

double RunningProcess::processorTime() const
{
    clockid_t clock = 0;
    timespec time = {};
    Require(::clock_getcpuclockid(m_process, &clock) == 0 && ::clock_gettime(clock, &time) == 0,
            m_name + QStringLiteral(" does not run"));
    return 1e9 * double(time.tv_sec) + double(time.tv_nsec);
}

QString RunningProcess::folder() const
{
    return QStringLiteral("/proc/%1/").arg(m_process);
}

double RunningProcess::memoryKiB() const
{
    return ValueOf(folder() + "status", "VmRSS");
}

int RunningProcess::wakeUps() const
{
    int count = 0;
    const QString tasks = folder() + "task/";
    const QStringList threads = QDir(tasks).entryList(QDir::Dirs | QDir::NoDotAndDotDot);
    for (QString const& thread : threads)
        count += int(ValueOf(tasks + thread + "/status", "voluntary_ctxt_switches"));
    return count;
}
