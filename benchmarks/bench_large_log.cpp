// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The log view and the usual text tools on the same file of 1 GiB: opening and filtering it,
// following it while it grows, and the memory that it takes; and how soon the view responds, also
// with a file of 10 GiB if there is room for it. Needs a display.
//
// What takes work is reported as processor time, of all threads and of child processes: what a user
// waits for is less if it is spread over several processors. What is about response is reported as
// time.

#include "app/window/log/LogModel.h"
#include "support/LargeLog.h"
#include "support/Measurements.h"
#include "support/Processes.h"
#include "support/ScratchFolder.h"
#include "support/ShownLog.h"
#include "support/TimedLines.h"

#include <QApplication>
#include <QElapsedTimer>
#include <QFile>
#include <QStorageInfo>

#include <algorithm>
#include <array>
#include <chrono>
#include <cstdio>
#include <cstring>
#include <memory>
#include <thread>
#include <unistd.h>

using namespace Velocor;

namespace {

constexpr qint64 MiB = 1 << 20;
constexpr qint64 GiB = 1 << 30;

QString SizeText(qint64 bytes)
{
    return bytes % GiB == 0 ? QStringLiteral("%1 GiB").arg(bytes / GiB)
                            : QStringLiteral("%1 MiB").arg(bytes / MiB);
}

// A growing log, in a process of its own: bench_large_log --append FILE PER-SECOND SECONDS LINES
int AppendLines(QStringList const& arguments)
{
    const AppendedLog file(arguments[2]);
    const int perSecond = arguments[3].toInt();
    const std::chrono::microseconds pause(std::max(1000, 1000000 / perSecond));
    const int pauses = int(arguments[4].toInt() * 1000000LL / pause.count());
    LargeLog log(arguments[5].toLongLong());
    auto next = std::chrono::steady_clock::now();
    for (int i = 0; i < pauses; ++i) {
        QByteArray text;
        for (int line = 0; line < std::max(1, perSecond / 1000); ++line)
            log.Append(text);
        file.Append(text);
        next += pause;
        std::this_thread::sleep_until(next);
    }
    return 0;
}

// Opens a file in a process of its own, whose memory is not what another file has left:
// bench_large_log --open FILE SHORT-FILE
int OpenOnce(QStringList const& arguments)
{
    {
        LogModel model;
        ShownLog(&model).Open(arguments[3]); // loads fonts and the like
    }
    LogModel model;
    ShownLog view(&model);
    const double memoryBefore = OwnMemoryKiB();
    const double before = OwnProcessorTime();
    view.Open(arguments[2]);
    const double time = OwnProcessorTime() - before;
    std::printf("%d %.0f %.0f\n", model.rowCount(), time, OwnMemoryKiB() - memoryBefore);
    return 0;
}

struct Tool
{
    char const* name;
    QStringList command;
};

class LargeLogBench
{
public:
    LargeLogBench(int rounds, bool quick)
        : m_rounds(rounds), m_quick(quick), m_size(quick ? 64 * MiB : GiB),
          m_name("log of " + SizeText(m_size) + ", "), m_log(m_folder.file("large.log")),
          m_short(m_folder.file("short.log"))
    {
        m_lines = LargeLog::Write(m_log, m_size);
        m_bytes = QFile(m_log).size();
        m_shortLines = LargeLog::Write(m_short, 1);
        LogModel model;
        ShownLog(&model).Open(m_short); // loads fonts and the like
    }

    void run()
    {
        for (int round = 0; round < m_rounds; ++round) {
            open();
            openAsProgram("velocor, whole program", VELOCOR_PROGRAM);
            openAsProgram("glogg", "glogg");
            openInLnav();
            filterByText(true);
            filterByText(false);
            filterByExpression();
            follow();
            readFirstPage(m_name, m_log);
        }
        idle();
        writeUntilPainted();
        grow();
    }

    Measurements const& measurements() const { return m_measurements; }

private:
    int seconds(int full) const { return m_quick ? 1 : full; }
    QString opening() const { return m_name + "opening, processor time"; }
    QString memory() const { return m_name + "memory a line"; }

    void keepMemory(char const* name, double kiB, qint64 lines)
    {
        m_measurements.add(memory(), name, kiB * 1024 / double(lines), "bytes");
    }

    void restoreLog()
    {
        Require(QFile::resize(m_log, m_bytes), m_log + QStringLiteral(" cannot be cut"));
    }

    // Reads the file as a program without a window would.
    void readOnce(QString const& group)
    {
        const double before = OwnProcessorTime();
        QFile file(m_log);
        Require(file.open(QIODevice::ReadOnly | QIODevice::Unbuffered), file.errorString());
        QByteArray buffer(1 << 17, Qt::Uninitialized);
        while (file.read(buffer.data(), buffer.size()) > 0) {}
        keepTime(group, "floor: the file read once", OwnProcessorTime() - before);
    }

    void keepTime(QString const& group, char const* name, double time)
    {
        m_measurements.add(group, name, time, "ns");
    }

    void open()
    {
        readOnce(opening());
        const ProcessCost counted = RunToEnd({"wc", "-l", m_log});
        keepTime(opening(), "wc -l", counted.processorTime);

        const QByteArray opened =
            RunToEnd({QCoreApplication::applicationFilePath(), "--open", m_log, m_short}).output;
        const QList<QByteArray> figures = opened.trimmed().split(' ');
        Require(figures.size() == 3 && figures[0].toLongLong() == m_lines,
                QStringLiteral("the view lacks lines"));
        keepTime(opening(), "velocor, log view", figures[1].toDouble());
        keepMemory("velocor, log view", figures[2].toDouble(), m_lines);
    }

    struct Idle
    {
        double processorTime;
        double memoryKiB;
    };

    // In a new home directory, so that the program does not open the files of the last session.
    static QStringList started(ScratchFolder const& home, QString const& program,
                               QString const& file)
    {
        return {"env", "HOME=" + home.path(), program, file};
    }

    static Idle opened(QString const& program, QString const& file)
    {
        const ScratchFolder home;
        const RunningProcess process(started(home, program, file));
        process.WaitUntilIdle();
        return {process.processorTime(), process.memoryKiB()};
    }

    // Without what the program needs for a file of a mebibyte.
    void openAsProgram(char const* name, char const* program)
    {
        const Idle withShort = opened(program, m_short);
        const Idle withLarge = opened(program, m_log);
        keepTime(opening(), name, withLarge.processorTime - withShort.processorTime);
        keepMemory(name, withLarge.memoryKiB - withShort.memoryKiB, m_lines - m_shortLines);
    }

    // lnav without its screen, which reads and indexes the file and ends.
    void openInLnav()
    {
        const ScratchFolder home;
        const QStringList command{"env",    "HOME=" + home.path(), "lnav", "-n", "-q", "-c",
                                  ":goto 0"};
        keepTime(opening(), "lnav -n",
                 RunToEnd(command + QStringList(m_log)).processorTime -
                     RunToEnd(command + QStringList(m_short)).processorTime);
        keepMemory("lnav -n, at its peak",
                   RunningProcess(command + QStringList(m_log)).WaitUntilEnded() -
                       RunningProcess(command + QStringList(m_short)).WaitUntilEnded(),
                   m_lines - m_shortLines);
    }

    void filterByText(bool isExact)
    {
        const QString text = LargeLog::Text;
        QStringList options;
        if (!isExact)
            options += "-i";
        const QString group = m_name + (isExact ? "filter by text, processor time"
                                                : "filter by text in any case, processor time");
        LogFilter filter;
        filter.SetText(text, false, isExact);
        compareFilters(
            group, filter,
            {{"grep", QStringList("grep") + options + QStringList(text)},
             {"ripgrep", QStringList({"rg", "--no-config"}) + options + QStringList(text)},
             {"ugrep", QStringList({"ugrep"}) + options + QStringList(text)}});
    }

    void filterByExpression()
    {
        const QString expression = LargeLog::Expression;
        LogFilter filter;
        Require(filter.SetText(expression, true, true), expression);
        compareFilters(m_name + "filter by expression, processor time", filter,
                       {{"grep -E", {"grep", "-E", expression}},
                        {"grep -P", {"grep", "-P", expression}},
                        {"ripgrep", {"rg", "--no-config", expression}},
                        {"ugrep", {"ugrep", expression}}});
    }

    // The tools write the lines to a pipe, where they are counted.
    void compareFilters(QString const& group, LogFilter const& filter,
                        std::vector<Tool> const& tools)
    {
        readOnce(group);
        LogModel model;
        ShownLog view(&model);
        view.Open(m_log);
        const double before = OwnProcessorTime();
        model.SetFilter(filter);
        RunEventLoopUntil([&] { return !model.isReading(); });
        keepTime(group, "velocor", OwnProcessorTime() - before);

        for (Tool const& tool : tools) {
            const QStringList plain{"env", "LC_ALL=C"}; // the log is ASCII
            const ProcessCost cost = RunToEnd(plain + tool.command + QStringList(m_log));
            Require(cost.lines == model.rowCount(), QStringLiteral("%1 finds %2 lines, the view %3")
                                                        .arg(tool.name)
                                                        .arg(cost.lines)
                                                        .arg(model.rowCount()));
            keepTime(group, tool.name, cost.processorTime);
        }
    }

    static std::unique_ptr<RunningProcess> appending(QString const& file, int perSecond,
                                                     int duration, qint64 lines)
    {
        return std::make_unique<RunningProcess>(QStringList{
            QCoreApplication::applicationFilePath(), "--append", file, QString::number(perSecond),
            QString::number(duration), QString::number(lines)});
    }

    void follow()
    {
        constexpr int PerSecond = 50;
        const QString group = m_name + "following 50 lines a second, share of a processor";
        const int duration = seconds(5);
        {
            const RunningProcess tail({"tail", "-f", m_log});
            tail.WaitUntilIdle();
            const auto writer = appending(m_log, PerSecond, duration, m_lines);
            const double before = tail.processorTime();
            writer->WaitUntilEnded();
            keepShare(group, "tail -f", tail.processorTime() - before, duration);
        }
        LogModel model;
        ShownLog view(&model);
        restoreLog();
        view.Open(m_log);
        const auto writer = appending(m_log, PerSecond, duration, m_lines);
        const double before = OwnProcessorTime();
        RunEventLoopFor(duration * 1000);
        keepShare(group, "velocor", OwnProcessorTime() - before, duration);
        Require(model.rowCount() > m_lines + PerSecond * duration / 2,
                QStringLiteral("the view does not follow"));
        writer->WaitUntilEnded();
        restoreLog();
    }

    void keepShare(QString const& group, char const* name, double time, int duration)
    {
        m_measurements.add(group, name, time / (duration * 1e9) * 100, "%");
    }

    void readFirstPage(QString const& name, QString const& file)
    {
        LogModel model;
        ShownLog view(&model);
        m_measurements.add(name + "first page", "velocor", view.OpenToFirstPage(file), "ns");
    }

    // With one file open and nothing that changes it.
    void idle()
    {
        const ScratchFolder home;
        const RunningProcess process(started(home, VELOCOR_PROGRAM, m_log));
        process.WaitUntilIdle();
        const int duration = seconds(10);
        const int before = process.wakeUps();
        std::this_thread::sleep_for(std::chrono::seconds(duration));
        const double count = process.wakeUps() - before;
        m_measurements.addRow(m_name + "wake-ups while nothing happens", "velocor",
                              {{"a second", count / duration, ""}});
    }

    void writeUntilPainted()
    {
        const int count = m_quick ? 50 : 1000;
        const QString group = m_name + "a line written until it is seen";
        {
            const RunningProcess tail({"tail", "-n", "0", "-f", m_log}, RunningProcess::ToPipe);
            tail.WaitUntilIdle();
            TimedLines lines({m_log}, m_lines, count);
            std::array<char, 4096> buffer;
            size_t seen = 0;
            while (!lines.isOver()) {
                const ssize_t size = ::read(tail.output(), buffer.data(), buffer.size());
                Require(size > 0, QStringLiteral("tail ended"));
                seen += size_t(std::count(buffer.begin(), buffer.begin() + size, '\n'));
                lines.NoteArrived(seen);
            }
            m_measurements.addPercentiles(group, "tail -f, until it is in a pipe", lines.times());
        }
        restoreLog();
        LogModel model;
        ShownLog view(&model);
        view.Open(m_log);
        TimedLines lines({m_log}, m_lines, count);
        view.TimeLines(lines);
        m_measurements.addPercentiles(group, "velocor, until it is painted", lines.times());
        restoreLog();
    }

    // 10 GiB if there is room for the file and the view; otherwise as much as there is room for.
    qint64 largestSize() const
    {
        if (m_quick)
            return m_size;
        const auto memory = qint64(AvailableMemoryKiB() * 1024);
        const qint64 room = QStorageInfo(m_folder.path()).bytesAvailable();
        const qint64 size = std::min(memory / 2, room * 3 / 4) / GiB * GiB;
        return std::max(GiB, std::min(10 * GiB, size));
    }

    void grow()
    {
        QFile::remove(m_log);
        const qint64 size = largestSize();
        const QString name = "log of " + SizeText(size) + ", ";
        const qint64 lines = LargeLog::Write(m_log, size);
        for (int i = 0; i < m_rounds && size != m_size; ++i)
            readFirstPage(name, m_log);

        LogModel model;
        ShownLog view(&model);
        view.Open(m_log);
        const int duration = seconds(5);
        const auto writer = appending(m_log, 10000, duration * m_rounds, lines);
        for (int i = 0; i < m_rounds; ++i) {
            QElapsedTimer timer;
            timer.start();
            double longest = 0;
            while (timer.elapsed() < duration * 1000) {
                const qint64 before = timer.nsecsElapsed();
                QCoreApplication::processEvents();
                longest = std::max(longest, double(timer.nsecsElapsed() - before));
                // Not a busy loop, which would leave less for the threads that read.
                std::this_thread::sleep_for(std::chrono::microseconds(200));
            }
            m_measurements.add(name + "longest turn of the event loop, 10,000 lines a second",
                               "velocor", longest, "ns");
        }
        Require(model.rowCount() > lines, QStringLiteral("the view does not follow"));
    }

    const int m_rounds;
    const bool m_quick;
    const qint64 m_size;
    const QString m_name; // the start of the groups' names
    ScratchFolder m_folder;
    const QString m_log;
    const QString m_short;
    qint64 m_bytes = 0;
    qint64 m_lines = 0;
    qint64 m_shortLines = 0;
    Measurements m_measurements;
};

} // namespace

// bench_large_log RESULTS ROUNDS [--quick]
int main(int argc, char** argv)
{
    if (argc == 6 && std::strcmp(argv[1], "--append") == 0) {
        QCoreApplication application(argc, argv);
        return AppendLines(QCoreApplication::arguments());
    }
    Require(argc >= 3, QStringLiteral("usage: bench_large_log RESULTS ROUNDS [--quick]"));
    ::setenv("QT_QPA_PLATFORM", "xcb", 1);
    QApplication application(argc, argv);
    const QStringList arguments = QCoreApplication::arguments();
    if (arguments[1] == "--open")
        return OpenOnce(arguments);

    LargeLogBench bench(arguments[2].toInt(), arguments.contains("--quick"));
    bench.run();
    bench.measurements().save(arguments[1]);
    return 0;
}
