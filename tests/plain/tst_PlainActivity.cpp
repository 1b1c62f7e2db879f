// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Compares how many entries of a log there are by time with a look at the time of every row, for
// logs with equal stamps, lines without a stamp and pauses, filtered or not, while they grow, are
// zoomed and start again.

#include "app/logfile/ActivityCounter.h"
#include "app/logfile/LogIndex.h"
#include "plain/Program.h"
#include "support/DemoLog.h"
#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QtTest>

#include <vector>

using namespace Velocor;

class tst_PlainActivity : public QObject
{
    Q_OBJECT

private slots:
    void bars();
};

namespace {

class Bars : public Program::Pair
{
public:
    Bars()
    {
        QObject::connect(&m_counter, &ActivityCounter::counted,
                         [this](Activity const& activity) { m_activity = activity; });
    }

    void perform(Program::Draws& draws)
    {
        m_draws = &draws;
        const int kind = draws.below(16);
        if (kind < 8)
            append();
        else if (kind < 10)
            startAgain();
        else if (kind < 13)
            filter();
        compare();
    }

    void finish() {} // every step compares

private:
    void append()
    {
        const int count = 1 + (m_draws->once(6) ? m_draws->below(3000) : m_draws->below(40));
        tell("append # lines", count);
        for (int i = 0; i < count; ++i)
            addLine();
    }

    void addLine()
    {
        static char const* const severities[] = {"Trace",   "Trace", "Notification",
                                                 "Warning", "Error", "Fatal"};
        if (m_draws->once(9)) {
            m_log += m_draws->once(2) ? "continued\n" : "\n";
            return;
        }
        m_time += m_draws->once(50) ? m_draws->below(100000) : m_draws->below(3) * 20;
        const QTime time = QTime(0, 0).addMSecs(m_time);
        m_log += DemoLog::entry(time.toString("HH:mm:ss.zzz"), m_draws->oneOf(severities),
                                QString::number(m_draws->below(10)));
    }

    void startAgain()
    {
        tell("start again");
        m_log.clear();
        m_time = m_draws->below(100000);
        append();
    }

    void filter()
    {
        m_filter = LogFilter();
        const int kind = m_draws->below(3);
        tell("filter #", kind);
        if (kind > 0)
            m_filter.SetText("3", false, false);
        m_filter.SetContext(kind == 2 ? 1 : 0);
    }

    // The time of each row, from that row or the ones before it.
    std::vector<qint64> times(LogRows const& rows) const
    {
        std::vector<qint64> all(rows.size(), -1);
        const LogLineParser parser;
        qint64 first = -1;
        qint64 last = -1;
        for (size_t row = 0; row < rows.size(); ++row) {
            const auto start = static_cast<int>(rows.start(row));
            const QByteArray line = m_log.mid(start, m_log.indexOf('\n', start) - start);
            const qint64 key = parser.Find(line.constData(), line.size()).timeKey;
            last = key >= 0 ? key : last;
            first = first < 0 ? key : first;
            all[row] = last;
        }
        std::replace(all.begin(), all.end(), qint64(-1), first);
        return all;
    }

    // All of the log in one file, or its start in older ones.
    LogSource write()
    {
        if (m_draws->once(2)) {
            same("written", TestFiles::write(m_path, m_log), true);
            return m_path;
        }
        auto older = std::make_shared<OlderLogFiles>();
        int start = 0;
        for (int file = 0; file < 2; ++file) {
            const int end = m_log.indexOf('\n', start + m_draws->below(m_log.size() - start + 1));
            const QString path = m_path + '.' + QString::number(file);
            same("written", TestFiles::write(path, m_log.mid(start, end + 1 - start)), true);
            auto opened = std::make_shared<QFile>(path);
            same("opened", opened->open(QIODevice::ReadOnly | QIODevice::Unbuffered), true);
            older->Add(path, opened, opened->size(), QByteArray());
            start += static_cast<int>(opened->size());
        }
        tell("older files with # bytes", start);
        same("written", TestFiles::write(m_path, m_log.mid(start)), true);
        return {m_path, older};
    }

    void compare()
    {
        const LogSource source = write();
        LogIndex index(LogLineParser(), m_filter, true);
        index.Begin();
        index.Feed(m_log.constData(), m_log.size());
        index.End();
        // The counter recognizes those that are the same.
        if (m_rows && !m_draws->once(3))
            m_rows = std::make_shared<LogRows>(index.Rows(m_filter, LogRows()));
        else
            m_rows = std::make_shared<LogRows>(index.Rows(m_filter));
        const std::vector<qint64> all = times(*m_rows);

        ActivityRequest request;
        request.number = ++m_number;
        request.source = source;
        request.rows = m_rows;
        request.parts = 1 + m_draws->below(m_draws->once(4) ? 500 : 20);
        if (m_draws->once(2)) {
            request.from = (all.empty() ? 0 : all.front()) + m_draws->below(100000) - 20000;
            request.to = request.from + 1 + m_draws->below(200000);
        }
        tell("# bars of # rows", request.parts, static_cast<int>(m_rows->size()));
        m_counter.SetCurrentRequest(m_number);
        m_activity = Activity();
        m_counter.Count(request);
        same("answered", m_activity.number, m_number);
        const bool isTimed = !all.empty() && all.front() >= 0;
        same("state", m_activity.state == Activity::Known, isTimed);
        if (isTimed)
            compareBars(all, request);
    }

    void compareBars(std::vector<qint64> const& all, ActivityRequest const& request)
    {
        const qint64 from = request.from < 0 ? all.front() : request.from;
        const qint64 to = request.from < 0 ? all.back() + 1 : request.to;
        same("from", m_activity.from, from);
        same("to", m_activity.to, to);
        std::vector<Activity::Bar> plain(static_cast<size_t>(request.parts));
        for (size_t row = 0; row < all.size(); ++row) {
            if (all[row] < from || all[row] >= to)
                continue;
            Activity::Bar& bar =
                plain[static_cast<size_t>((all[row] - from) * request.parts / (to - from))];
            if (bar.start < 0)
                bar.start = m_rows->start(row);
            if (!(m_rows->mark(row) & LogRows::Continued))
                ++bar.counts[m_rows->severity(row)];
        }
        same("bars", text(m_activity.bars), text(plain));
        for (int bar = 0; bar < request.parts; ++bar) {
            const qint64 time = m_activity.TimeOf(bar);
            same("time of a bar", (time - from) * request.parts / (to - from) >= bar, true);
            same("time before a bar",
                 (time - 1 - from) * request.parts / (to - from) < bar || time == from, true);
        }
    }

    static QString text(std::vector<Activity::Bar> const& bars)
    {
        QString all;
        for (Activity::Bar const& bar : bars) {
            for (const size_t count : bar.counts)
                all += QString::number(count) + ' ';
            all += QString::number(bar.start) + '\n';
        }
        return all;
    }

    QTemporaryDir m_folder;
    const QString m_path = m_folder.filePath("a.log");
    QByteArray m_log;
    int m_time = 0;
    int m_number = 0;
    LogFilter m_filter;
    std::shared_ptr<LogRows const> m_rows;
    ActivityCounter m_counter;
    Activity m_activity;
};

} // namespace

void tst_PlainActivity::bars()
{
    Program::compare<Bars>("entries by time", Rounds::count(120, 3000, 30000), 40);
}

QTEST_MAIN(tst_PlainActivity)
#include "tst_PlainActivity.moc"
