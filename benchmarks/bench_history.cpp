// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The log view with several files as one: a log of twenty files next to one file with the same
// lines, ten logs that are followed at the same time, and the strip of time. Needs a display.

#include "app/window/log/ActivityStrip.h"
#include "app/window/log/LogSearch.h"
#include "support/LargeLog.h"
#include "support/Measurements.h"
#include "support/Processes.h"
#include "support/ScratchFolder.h"
#include "support/ShownLog.h"
#include "support/TimedLines.h"

#include <QApplication>
#include <QElapsedTimer>
#include <QFile>
#include <QKeyEvent>

#include <cstdio>
#include <vector>

using namespace Velocor;

namespace {

constexpr qint64 MiB = 1 << 20;
constexpr int FileCount = 20;
constexpr int ProgramCount = 10;

// Writes the same lines to one file and to twenty, the newest of which is the log itself.
qint64 WriteLogs(QString const& one, QString const& log, qint64 bytes)
{
    LargeLog lines;
    QFile all(one);
    Require(all.open(QIODevice::WriteOnly | QIODevice::Unbuffered), all.errorString());
    for (int number = FileCount - 1; number >= 0; --number) {
        QFile file(number > 0 ? log + '.' + QString::number(number) : log);
        Require(file.open(QIODevice::WriteOnly | QIODevice::Unbuffered), file.errorString());
        QByteArray text;
        for (qint64 written = 0; written < bytes / FileCount; written += text.size()) {
            text.resize(0);
            while (text.size() < MiB)
                lines.Append(text);
            Require(file.write(text) == text.size(), file.errorString());
            Require(all.write(text) == text.size(), all.errorString());
        }
    }
    return lines.lines();
}

// Opens a log in a process of its own, whose memory is not what another one has left:
// bench_history --open LOG all|one
int OpenOnce(QStringList const& arguments)
{
    LogModel model;
    ShownLog view(&model);
    const double before = OwnMemoryKiB();
    view.Open(arguments[2], arguments[3] == QLatin1String("all"));
    std::printf("%d %.0f\n", model.rowCount(), OwnMemoryKiB() - before);
    return 0;
}

void Press(QWidget& widget, int key, QString const& text = QString())
{
    QKeyEvent press(QEvent::KeyPress, key, Qt::NoModifier, text);
    QCoreApplication::sendEvent(&widget, &press);
}

class HistoryBench
{
public:
    HistoryBench(int rounds, bool isQuick)
        : m_rounds(rounds), m_isQuick(isQuick), m_one(m_folder.file("one.log")),
          m_log(m_folder.file("log.log")),
          m_lines(WriteLogs(m_one, m_log, (isQuick ? 64 : 1024) * MiB))
    {}

    void run()
    {
        for (int round = 0; round < m_rounds; ++round) {
            read("one file", m_one, false);
            read("20 files", m_log, true);
        }
        zoom();
        QFile::remove(m_one);
        follow();
    }

    Measurements const& measurements() const { return m_measurements; }

private:
    void keep(char const* group, char const* name, QElapsedTimer const& timer)
    {
        m_measurements.add(group, name, double(timer.nsecsElapsed()), "ns");
    }

    void read(char const* name, QString const& log, bool isAll)
    {
        LogModel model;
        ShownLog view(&model);
        QElapsedTimer timer;
        timer.start();
        view.Open(log, isAll);
        keep("20 files as one, open", name, timer);
        require(model.rowCount());

        LogFilter filter;
        filter.SetText(LargeLog::Text, false, true);
        LogSearch search(&model);
        timer.start();
        search.SetText(filter);
        RunEventLoopUntil([&] { return search.isComplete(); });
        keep("20 files as one, find a text", name, timer);
        Require(!search.hits()->empty(), QStringLiteral("nothing is found"));
        search.SetText(LogFilter());

        timer.start();
        model.SetFilter(filter);
        RunEventLoopUntil([&] { return !model.isReading(); });
        keep("20 files as one, filter by text", name, timer);
        Require(model.rowCount() > 1 && model.rowCount() < m_lines / 100,
                QStringLiteral("the filter shows the wrong lines"));
        readMemory(name, log, isAll);
    }

    // Those of several files have headings.
    void require(int rows) const
    {
        Require(rows >= m_lines && rows <= m_lines + FileCount,
                QStringLiteral("%1 lines have %2 rows").arg(m_lines).arg(rows));
    }

    void readMemory(char const* name, QString const& log, bool isAll)
    {
        const QByteArray opened = RunToEnd({QCoreApplication::applicationFilePath(), "--open", log,
                                            isAll ? "all" : "one"})
                                      .output;
        const QList<QByteArray> figures = opened.trimmed().split(' ');
        Require(figures.size() == 2, QStringLiteral("the view did not open"));
        require(figures[0].toInt());
        m_measurements.add("20 files as one, memory a line", name,
                           figures[1].toDouble() * 1024 / double(m_lines), "bytes");
    }

    // A key zooms in on the middle of the strip, another one out again.
    void zoom()
    {
        LogModel model;
        ShownLog view(&model);
        view.Open(m_log, true);
        ActivityStrip strip(&model, &view);
        strip.resize(view.width(), strip.sizeHint().height());
        bool isShown = false;
        QObject::connect(&strip, &ActivityStrip::shown, [&] { isShown = true; });
        const auto wait = [&] {
            RunEventLoopUntil([&] { return isShown; });
            strip.repaint();
        };
        strip.SetShown(true);
        wait();
        for (int bar = 0; bar < int(strip.activity().bars.size()) / 2; ++bar)
            Press(strip, Qt::Key_Right);
        std::vector<double> times;
        for (int i = 0; i < (m_isQuick ? 5 : 50); ++i) {
            for (const bool isIn : {true, true, true, true, false, false, false, false}) {
                const qint64 before = strip.activity().to - strip.activity().from;
                isShown = false;
                QElapsedTimer timer;
                timer.start();
                Press(strip, isIn ? Qt::Key_Plus : Qt::Key_Minus, isIn ? "+" : "-");
                wait();
                times.push_back(double(timer.nsecsElapsed()));
                const qint64 after = strip.activity().to - strip.activity().from;
                Require(isIn ? after < before : after > before,
                        QStringLiteral("the strip does not zoom"));
            }
        }
        m_measurements.addPercentiles("strip of time over 20 files as one", "a change of zoom",
                                      times);
    }

    void follow()
    {
        QList<ProgramLog> logs;
        QStringList names;
        qint64 lines = 0;
        for (int program = 0; program < ProgramCount; ++program) {
            const QString name = QStringLiteral("program%1").arg(program);
            names.append(m_folder.file(name + ".log"));
            logs.append({name, names.last()});
            lines = LargeLog::Write(names.last(), (m_isQuick ? 1 : 10) * MiB);
        }
        LogModel model;
        ShownLog view(&model);
        view.Open(logs);
        Require(model.rowCount() == lines * ProgramCount, QStringLiteral("the view lacks lines"));
        TimedLines timed(names, lines, m_isQuick ? 50 : 1000);
        view.TimeLines(timed);
        m_measurements.addPercentiles("10 programs followed, a line written until it is seen",
                                      "velocor", timed.times());
    }

    const int m_rounds;
    const bool m_isQuick;
    ScratchFolder m_folder;
    const QString m_one;
    const QString m_log;
    const qint64 m_lines;
    Measurements m_measurements;
};

} // namespace

// bench_history RESULTS ROUNDS [--quick]
int main(int argc, char** argv)
{
    Require(argc >= 3, QStringLiteral("usage: bench_history RESULTS ROUNDS [--quick]"));
    ::setenv("QT_QPA_PLATFORM", "xcb", 1);
    QApplication application(argc, argv);
    const QStringList arguments = QCoreApplication::arguments();
    if (arguments[1] == "--open")
        return OpenOnce(arguments);

    HistoryBench bench(arguments[2].toInt(), arguments.contains("--quick"));
    bench.run();
    bench.measurements().save(arguments[1]);
    return 0;
}
