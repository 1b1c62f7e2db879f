// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Compares the difference between rows of several logs that is found by the numbers of their lines
// with the one that is found by what the lines are and where they start.

#include "app/history/FamilyChange.h"
#include "plain/Rounds.h"

#include <QtTest>

#include <random>

using namespace Velocor;

namespace {

struct Row
{
    size_t log;
    size_t line; // of the log
    bool isContext;
};

using Rows = std::vector<Row>;

class Family
{
public:
    explicit Family(quint32 seed) : m_random(seed) {}

    // Logs with some lines, and rows of some of them.
    void start()
    {
        m_logs.resize(1 + below(4));
        for (LineTable& log : m_logs) {
            for (size_t count = below(12); count > 0; --count)
                appendLine(log);
        }
        for (int count = int(below(30)); count > 0; --count)
            addRow(m_rows, m_rows.size());
    }

    // Lines come and go at the ends of logs; rows change in one place, or in any.
    void change()
    {
        for (LineTable& log : m_logs) {
            if (chance(6))
                log.Truncate(below(log.size() + 1));
            for (size_t count = below(4); count > 0; --count)
                appendLine(log);
        }
        const auto isGone = [this](Row const& row) {
            return row.line >= m_logs[row.log].size();
        };
        m_rows.erase(std::remove_if(m_rows.begin(), m_rows.end(), isGone), m_rows.end());
        for (size_t count = below(3); count > 0 && !m_rows.empty(); --count) {
            const size_t at = below(m_rows.size());
            if (chance(3))
                m_rows.erase(m_rows.begin() + std::ptrdiff_t(at));
            else if (chance(2))
                addRow(m_rows, at);
            else
                m_rows[at].isContext = !m_rows[at].isContext;
        }
        for (size_t count = below(4); count > 0; --count)
            addRow(m_rows, m_rows.size());
    }

    // One log after the other, as a LogSource has them.
    LogRows merged() const
    {
        LineTable all;
        for (size_t log = 0; log < m_logs.size(); ++log) {
            for (size_t line = 0; line < m_logs[log].size(); ++line)
                all.Append(qint64(log) * 1000000 + m_logs[log].start(line), m_logs[log].mark(line),
                           m_logs[log].check(line));
        }
        LogRows rows(all, all.size());
        for (Row const& row : m_rows)
            rows.AddMergedLine(firstLineOf(row.log) + row.line, row.isContext);
        return rows;
    }

    size_t firstLineOf(size_t log) const
    {
        size_t first = 0;
        for (size_t before = 0; before < log; ++before)
            first += m_logs[before].size();
        return first;
    }

    std::vector<LineTable> const& logs() const { return m_logs; }

private:
    size_t below(size_t limit) { return m_random() % limit; }
    bool chance(size_t oneIn) { return below(oneIn) == 0; }

    void appendLine(LineTable& log)
    {
        const qint64 end = log.isEmpty() ? 0 : log.start(log.size() - 1) + 1;
        log.Append(end + qint64(below(2)), LogEntry::Trace, quint16(below(2)));
    }

    void addRow(Rows& rows, size_t at)
    {
        const size_t log = below(m_logs.size());
        if (!m_logs[log].isEmpty())
            rows.insert(rows.begin() + std::ptrdiff_t(at),
                        {log, below(m_logs[log].size()), chance(4)});
    }

    std::mt19937 m_random;
    std::vector<LineTable> m_logs;
    Rows m_rows;
};

QString Difference(LogRows const& before, LogRows const& after,
                   std::vector<FamilyLines> const& lines)
{
    HistoryUpdate update;
    FamilyChange(before, after, lines).Find(update);
    if (update.isReset)
        return QStringLiteral("reset");
    return QString("at %1 -%2 +%3").arg(update.changeAt).arg(update.removed).arg(update.inserted);
}

} // namespace

class tst_FamilyChange : public QObject
{
    Q_OBJECT

private slots:
    void randomChanges();
};

void tst_FamilyChange::randomChanges()
{
    const quint32 seed = Rounds::seed();
    const int count = Rounds::count(20000, 1000000);
    int kept = 0;
    for (int round = 0; round < count; ++round) {
        Family family(seed + quint32(round));
        family.start();
        Family const old = family;
        family.change();
        std::vector<FamilyLines> known;
        std::vector<FamilyLines> unknown; // no line has its number, so that each is looked at
        for (size_t log = 0; log < family.logs().size(); ++log) {
            const size_t first = old.firstLineOf(log);
            known.push_back(
                {first, family.firstLineOf(log), old.logs()[log].CountSame(family.logs()[log])});
            unknown.push_back({first, size_t(1) << 40, 0});
        }
        const LogRows before = old.merged();
        const LogRows after = family.merged();
        const QString plain = Difference(before, after, unknown);
        QVERIFY2(Difference(before, after, known) == plain,
                 qPrintable(QString("round %1: not %2").arg(round).arg(plain)));
        kept += plain != "reset";
    }
    QVERIFY2(kept > count / 10 && kept < count, qPrintable(QString::number(kept)));
}

QTEST_APPLESS_MAIN(tst_FamilyChange)
#include "tst_FamilyChange.moc"
