// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// How often the program wakes up while nothing happens, beside a window in which nothing is.

#include "support/Measurements.h"
#include "support/Processes.h"
#include "support/ScratchFolder.h"

#include <QCoreApplication>

#include <chrono>
#include <thread>

namespace {

double WakeUpsPerSecond(QString const& program, int seconds)
{
    const RunningProcess process({program});
    std::this_thread::sleep_for(std::chrono::seconds(3));
    const int before = process.wakeUps();
    std::this_thread::sleep_for(std::chrono::seconds(seconds));
    return double(process.wakeUps() - before) / seconds;
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
