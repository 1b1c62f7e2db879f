// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// velocor-log and the usual text tools: filtering a log by an expression, and merging logs by time.
// Each writes to a pipe, where the lines are counted.

#include "support/LargeLog.h"
#include "support/Measurements.h"
#include "support/Processes.h"
#include "support/ScratchFolder.h"

#include <QCoreApplication>
#include <QElapsedTimer>
#include <QFile>

#include <array>
#include <random>

namespace {

constexpr qint64 MiB = 1 << 20;
constexpr size_t MergedLogs = 4;

class TerminalBench
{
public:
    explicit TerminalBench(bool isQuick)
        : m_bytes(isQuick ? 64 * MiB : 1024 * MiB), m_rounds(isQuick ? 3 : 7)
    {}

    void run()
    {
        filter();
        merge();
    }

    Measurements const& measurements() const { return m_measurements; }

private:
    struct Tool
    {
        char const* name;
        QStringList command;
    };

    void filter()
    {
        const ScratchFolder folder;
        const QString log = folder.file(QStringLiteral("large.log"));
        LargeLog::Write(log, m_bytes);
        const QString expression = LargeLog::Expression;
        compare(QStringLiteral("filter by expression in a terminal"),
                {{"velocor-log", {VELOCOR_LOG, "--match", expression, log}},
                 {"grep -P", {"grep", "-P", expression, log}}});
    }

    void merge()
    {
        const ScratchFolder folder;
        const QStringList logs = writeLogs(folder);
        compare(QStringLiteral("merge logs in a terminal"),
                {{"velocor-log", QStringList({VELOCOR_LOG, "--merge"}) + logs},
                 {"sort -m", QStringList({"sort", "-m"}) + logs}});
    }

    // Lines by the same clock, each in one of the files.
    QStringList writeLogs(ScratchFolder const& folder) const
    {
        QStringList names;
        std::array<QFile, MergedLogs> files;
        for (QFile& file : files) {
            names.append(folder.file(QStringLiteral("program%1.log").arg(names.size())));
            file.setFileName(names.last());
            Require(file.open(QIODevice::WriteOnly), file.errorString());
        }
        LargeLog log;
        std::mt19937 random{20260303};
        QByteArray text;
        for (qint64 written = 0; written < m_bytes; written += text.size()) {
            text.resize(0);
            log.Append(text);
            QFile& file = files[random() % MergedLogs];
            Require(file.write(text) == text.size(), file.errorString());
        }
        return names;
    }

    // In turns, so that a busy moment does not hit only one of them.
    void compare(QString const& group, std::vector<Tool> const& tools)
    {
        qint64 lines = -1;
        for (int round = 0; round < m_rounds; ++round) {
            for (Tool const& tool : tools) {
                QElapsedTimer timer;
                timer.start();
                const ProcessCost cost = RunToEnd(tool.command);
                m_measurements.add(group, tool.name, double(timer.nsecsElapsed()), "ns",
                                   cost.processorTime);
                lines = lines < 0 ? cost.lines : lines;
                Require(cost.lines == lines && lines > 0,
                        QString::fromLatin1(tool.name) + " prints other lines");
            }
        }
    }

    qint64 m_bytes;
    int m_rounds;
    Measurements m_measurements;
};

} // namespace

int main(int argc, char** argv)
{
    const QCoreApplication application(argc, argv);
    const QStringList arguments = QCoreApplication::arguments();
    Require(arguments.size() >= 2, QStringLiteral("usage: bench_terminal RESULTS [--quick]"));
    TerminalBench bench(arguments.contains(QStringLiteral("--quick")));
    bench.run();
    bench.measurements().save(arguments[1]);
    return 0;
}
