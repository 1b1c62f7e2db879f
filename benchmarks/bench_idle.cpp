// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// How often the program wakes up while nothing happens, beside a window in which nothing is.

#include "support/Measurements.h"
#include "support/ScratchFolder.h"

#include <QCoreApplication>
#include <QDir>
#include <QProcess>

#include <chrono>
#include <thread>

namespace {

// The times that the threads of a process gave up the processor by themselves: each is followed by
// a wake-up.
int WakeUps(qint64 process)
{
    int count = 0;
    const QString tasks = QStringLiteral("/proc/%1/task/").arg(process);
    const QStringList threads = QDir(tasks).entryList(QDir::Dirs | QDir::NoDotAndDotDot);
    for (QString const& thread : threads) {
        const QByteArray key = "\nvoluntary_ctxt_switches:";
        const QByteArray status = ReadAll(tasks + thread + "/status");
        const int start = status.indexOf(key) + key.size();
        count += status.mid(start, status.indexOf('\n', start) - start).trimmed().toInt();
    }
    return count;
}

double WakeUpsPerSecond(QString const& program, int seconds)
{
    QProcess process;
    process.start(program, QStringList());
    Require(process.waitForStarted(), program + QStringLiteral(" does not start"));
    std::this_thread::sleep_for(std::chrono::seconds(3));
    const int before = WakeUps(process.processId());
    std::this_thread::sleep_for(std::chrono::seconds(seconds));
    const int count = WakeUps(process.processId()) - before;
    Require(process.state() == QProcess::Running, program + QStringLiteral(" ended by itself"));
    process.kill();
    process.waitForFinished();
    return double(count) / seconds;
}

} // namespace

// bench_idle RESULTS REPETITIONS
int main(int argc, char** argv)
{
    QCoreApplication application(argc, argv);
    const QStringList arguments = QCoreApplication::arguments();
    Require(arguments.size() > 2, QStringLiteral("usage: bench_idle RESULTS REPETITIONS"));
    const int seconds = arguments[2].toInt();

    Measurements measurements;
    const auto measure = [&](char const* name, char const* program) {
        measurements.addRow(
            "wake-ups of the idle program", name,
            {{"a second", WakeUpsPerSecond(QString::fromLocal8Bit(program), seconds), ""}});
    };
    measure("empty window, no OpenGL", VELOCOR_EMPTY_WINDOW);
    measure("velocor", VELOCOR_PROGRAM);
    measurements.save(arguments[1]);
    return 0;
}
