// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// How long the log view makes its user wait, with a large log and with one a tenth of its size:
// opening the file, the longest time without a response meanwhile, scrolling a page, applying a
// filter; and the memory it takes. Needs a display.
//
// Google Benchmark has no event loop, so the waits are timed here; the results use its format.

#include "app/window/log/LogModel.h"
#include "app/window/log/LogView.h"
#include "support/ScratchFolder.h"

#include <QApplication>
#include <QElapsedTimer>
#include <QFile>
#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>
#include <QScrollBar>

#include <functional>

#include <malloc.h>

using namespace Velocor;

namespace {

constexpr int LargeLog = 1000000; // lines
constexpr int LineLength = 100;   // bytes, the line end included
constexpr int PagesScrolled = 100;

void WriteLog(QString const& fileName, int lines)
{
    static char const* const Severities[] = {"Trace", "Debug", "Info", "Trace", "Warning"};
    QFile file(fileName);
    Require(file.open(QIODevice::WriteOnly), file.errorString());
    for (int i = 0; i < lines; ++i) {
        QByteArray line =
            "2026-03-03 " + QTime(0, 0).addMSecs(i * 80).toString("hh:mm:ss.zzz").toLatin1();
        line += QByteArray(" ") + Severities[i % 5] + " entry " + QByteArray::number(i) + ' ';
        file.write(line.leftJustified(LineLength - 1, 'm') + '\n');
    }
    Require(file.flush(), file.errorString());
}

double MemoryInKiB()
{
    ::malloc_trim(0); // memory that was already freed is not the view's
    QFile status(QStringLiteral("/proc/self/status"));
    Require(status.open(QIODevice::ReadOnly), status.errorString());
    const QByteArray text = status.readAll();
    return text.mid(text.indexOf("VmRSS:") + 6, 15).trimmed().split(' ').first().toDouble();
}

class WindowBench
{
public:
    // Fonts, the style and the like are loaded with the first view of any program.
    void warmUp()
    {
        measure(1000);
        m_measurements = QJsonArray();
    }

    void measure(int lines)
    {
        m_group = QStringLiteral("log of %1 MB, %L2 lines").arg(lines / 10000).arg(lines);
        ScratchFolder folder;
        WriteLog(folder.file("large.log"), lines);
        keep("floor: the file read once", timeOf([&] { ReadAll(folder.file("large.log")); }));

        const double memoryBefore = MemoryInKiB();
        LogModel model;
        LogView view(&model);
        view.resize(1080, 680);
        view.show();
        open(model, folder.file("large.log"), lines);
        scroll(view);
        filter(model, "filter by text", QStringLiteral("entry 999"), false);
        filter(model, "filter by regular expression", QStringLiteral("entry \\d+77 "), true);
        m_group.prepend(QStringLiteral("memory of a "));
        keep("view and model", MemoryInKiB() - memoryBefore, "KiB");
    }

    QJsonObject result() const { return {{"benchmarks", m_measurements}}; }

private:
    static double timeOf(std::function<void()> const& work)
    {
        QElapsedTimer time;
        time.start();
        work();
        return double(time.nsecsElapsed());
    }

    // Runs the event loop until everything is shown; returns its longest iteration.
    static double longestTurnUntil(std::function<bool()> const& isDone)
    {
        double longest = 0;
        while (!isDone())
            longest = std::max(longest, timeOf([] { QCoreApplication::processEvents(); }));
        return longest;
    }

    void open(LogModel& model, QString const& fileName, int lines)
    {
        double longest = 0;
        const double whole = timeOf([&] {
            model.Open(fileName, LogLineParser(), false);
            longest = longestTurnUntil([&] { return model.rowCount() >= lines; });
        });
        keep("open, until every line is available", whole);
        keep("longest moment without a response", longest);
    }

    void scroll(LogView& view)
    {
        QScrollBar* bar = view.verticalScrollBar();
        for (int page = 0; page < PagesScrolled; ++page) {
            const double time = timeOf([&] {
                bar->setValue(
                    int(qint64(bar->maximum()) * (page * 37 % PagesScrolled) / PagesScrolled));
                view.viewport()->repaint();
            });
            keep("scroll to a random page", time);
        }
    }

    void filter(LogModel& model, char const* what, QString const& text, bool isExpression)
    {
        LogFilter filter;
        filter.SetText(text, isExpression, false);
        const int before = model.rowCount();
        const double time = timeOf([&] {
            model.SetFilter(filter);
            longestTurnUntil([&] { return model.rowCount() != before && !model.isReading(); });
        });
        keep(what, time);
        model.SetFilter(LogFilter());
        longestTurnUntil([&] { return model.rowCount() == before; });
    }

    void keep(char const* name, double value, char const* unit = "ns")
    {
        m_measurements.append(QJsonObject{{"name", m_group + '|' + QLatin1String(name)},
                                          {"run_type", "iteration"},
                                          {"threads", 1},
                                          {"iterations", 1},
                                          {"real_time", value},
                                          {"time_unit", unit}});
    }

    QString m_group;
    QJsonArray m_measurements;
};

} // namespace

// bench_window RESULTS ROUNDS
int main(int argc, char** argv)
{
    Require(argc >= 3, QStringLiteral("usage: bench_window RESULTS ROUNDS"));
    ::setenv("QT_QPA_PLATFORM", "xcb", 1);
    QApplication application(argc, argv);

    WindowBench bench;
    bench.warmUp();
    const int rounds = std::atoi(argv[2]);
    for (int round = 0; round < rounds; ++round) {
        bench.measure(LargeLog / 10);
        bench.measure(LargeLog);
    }

    QFile file(QString::fromLocal8Bit(argv[1]));
    Require(file.open(QIODevice::WriteOnly), file.errorString());
    file.write(QJsonDocument(bench.result()).toJson());
    return 0;
}
