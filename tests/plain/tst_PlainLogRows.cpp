// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Compares the rows that an index derives from former rows with those that it makes of all lines,
// and the difference between the two with one that is found row by row, while a log grows: with
// filters, context, entries of many lines, lines of any length, torn ones, and several runs.

#include "app/logfile/LogIndex.h"
#include "app/logfile/LogUpdate.h"
#include "plain/WrittenLog.h"

#include <QtTest>

#include <algorithm>
#include <limits>
#include <memory>
#include <vector>

using namespace Velocor;

class tst_PlainLogRows : public QObject
{
    Q_OBJECT

private slots:
    void rows();
};

namespace {

struct PlainRow
{
    qint64 start;
    quint8 mark;
    quint16 check;

    bool operator==(PlainRow const& other) const
    {
        return start == other.start && mark == other.mark && check == other.check;
    }
    bool operator!=(PlainRow const& other) const { return !(*this == other); }
};

struct PlainRows
{
    explicit PlainRows(LogRows const& from)
        : earlier(from.earlier()), problems(from.problems()), complete(from.complete()),
          end(from.end())
    {
        LogRows::Reader reader(from);
        rows.reserve(from.size());
        for (size_t row = 0; row < from.size(); ++row)
            rows.push_back({reader.start(row), from.mark(row), from.check(row)});
    }

    bool operator==(PlainRows const& other) const
    {
        return rows == other.rows && earlier == other.earlier && problems == other.problems &&
               complete == other.complete && end == other.end;
    }

    int rowNear(qint64 start) const
    {
        int nearest = -1;
        qint64 least = std::numeric_limits<qint64>::max();
        for (size_t row = 0; row < rows.size(); ++row) {
            const qint64 distance = qAbs(rows[row].start - start);
            if (rows[row].start < 0 || distance >= least)
                continue;
            least = distance;
            nearest = int(row);
        }
        return nearest;
    }

    // Problems that are not continued lines, and no headings.
    size_t countProblems() const
    {
        return size_t(std::count_if(rows.begin(), rows.end(), [](PlainRow const& row) {
            const int severity = row.mark & LogRows::SeverityMask;
            return !(row.mark & LogRows::Continued) && severity >= LogEntry::Warning &&
                   severity <= LogEntry::Fatal;
        }));
    }

    std::vector<PlainRow> rows;
    size_t earlier;
    size_t problems;
    qint64 complete;
    qint64 end;
};

QString Text(PlainRows const& rows)
{
    QString text = QString("%1 earlier, %2 problems, complete to %3, end %4:")
                       .arg(rows.earlier)
                       .arg(rows.problems)
                       .arg(rows.complete)
                       .arg(rows.end);
    for (PlainRow const& row : rows.rows)
        text += QString(" %1:%2:%3").arg(row.start).arg(uint(row.mark), 0, 16).arg(row.check);
    return text;
}

// The numbers of an update.
QString Numbers(LogUpdate const& update)
{
    if (update.isReset)
        return QStringLiteral("reset");
    return QString("at %1 -%2 +%3, tail %4")
        .arg(update.changeAt)
        .arg(update.removed)
        .arg(update.inserted)
        .arg(update.changedTail);
}

LogUpdate PlainCompare(PlainRows const& before, PlainRows const& after)
{
    LogUpdate update;
    const size_t newestBefore = before.rows.size() - before.earlier;
    const size_t newestAfter = after.rows.size() - after.earlier;
    update.isReset = (before.earlier == 0) != (after.earlier == 0) || newestAfter < newestBefore;
    const size_t shorter = qMin(before.earlier, after.earlier);
    size_t front = 0;
    while (front < shorter && before.rows[front] == after.rows[front])
        ++front;
    size_t back = 0;
    while (back < shorter - front &&
           before.rows[before.earlier - 1 - back] == after.rows[after.earlier - 1 - back])
        ++back;
    update.changeAt = front;
    update.removed = before.earlier - front - back;
    update.inserted = after.earlier - front - back;
    for (size_t row = 0; row < newestBefore && !update.isReset && update.changedTail == 0; ++row) {
        if (before.rows[before.earlier + row] != after.rows[after.earlier + row])
            update.changedTail = newestBefore - row;
    }
    return update;
}

// A log that grows, or is written over from its start, and rows of several moments.
class Rows : public WrittenLog
{
public:
    void perform(Program::Draws& draws)
    {
        m_draws = &draws;
        const int kind = draws.below(64);
        if (kind < 10)
            write(entry());
        else if (kind < 20)
            write(otherLine());
        else if (kind < 27)
            writePart();
        else if (kind == 27)
            writeAroundLimits();
        else if (kind < 30)
            turnBack();
        else if (kind == 30)
            startAgain();
        else if (kind == 31)
            changeFilter();
        else
            pass();
    }

    void finish()
    {
        performLast([this] { pass(); });
    }

private:
    QByteArray entry()
    {
        const int step = m_draws->below(5000);
        return WrittenLog::entry(step, message());
    }

    QByteArray message()
    {
        static int const lengths[] = {3, 10, 200, 254, 256, 300, 5, 8};
        if (m_draws->once(100))
            return QByteArray(70000, 'a') + "x";
        return QByteArray(m_draws->oneOf(lengths), "abc"[m_draws->below(3)]) +
               (m_draws->once(4) ? "x" : "");
    }

    QByteArray otherLine()
    {
        static char const* const lines[] = {"", "x", "it goes on", "Error", "5 Error", "hide x"};
        return m_draws->oneOf(lines) + QByteArray(m_draws->once(8) ? "\r\n" : "\n");
    }

    void write(QByteArray bytes)
    {
        if (!m_draws->once(4))
            bytes.prepend(m_rest);
        m_rest.clear();
        WrittenLog::write(bytes);
    }

    // The rest follows later, or never. Until then, the entry may look like another one.
    void writePart()
    {
        const QByteArray whole = m_draws->once(2) ? QByteArray("x hide\n") : entry();
        const int length = 1 + m_draws->below(qMin(60, whole.size() - 1));
        m_rest.clear();
        write(whole.left(length));
        m_rest = whole.mid(length);
    }

    // Around the limits: of an entry's lines, and of a block.
    void writeAroundLimits()
    {
        const bool isBlock = m_draws->once(8);
        const int most = isBlock ? int(LineTable::BlockSize) : int(LogIndex::MaximumEntryLines);
        const QByteArray text = m_draws->once(2) ? entry() : otherLine();
        const int count = most - 3 + m_draws->below(6);
        tell("write # times #", count, text);
        writeMany(text, text.size() > 300 ? 10 : count);
    }

    // What follows may look like an earlier run, until the log grows.
    void turnBack()
    {
        m_time = qMax<qint64>(0, m_time - 1000 * qint64(m_draws->below(10000)));
        tell("the clock goes back to #", m_time);
    }

    void startAgain()
    {
        m_time += Day;
        m_position = 0;
        tell("a new run");
    }

    void changeFilter()
    {
        static char const* const texts[] = {"", "x", "x", "aaaaa", "Error", "nowhere"};
        m_filter = LogFilter();
        m_filter.SetEarlierRuns(!m_draws->once(3));
        m_filter.SetContext(m_draws->once(3) ? 0 : m_draws->below(6));
        for (int severity = 0; severity <= LogEntry::None; ++severity)
            m_filter.SetSeverity(LogEntry::Severity(severity), !m_draws->once(3));
        m_filter.SetText(m_draws->oneOf(texts), false, true);
        if (m_draws->once(2))
            m_filter.SetTerms(LogTerms(), LogTerms("hide", true));
        tell("filter: earlier runs #, context #, text #", m_filter.earlierRuns(),
             m_filter.context(), m_filter.hasText());
        forget();
    }

    void forget()
    {
        m_index = LogIndex(parser(), m_filter);
        m_before = LogRows();
        m_older = LogRows();
    }

    static LogLineParser parser()
    {
        LogLineParser parser;
        parser.SetOwn(true);
        return parser;
    }

    void pass()
    {
        const int slice = m_draws->once(4) ? 1 + m_draws->below(500) : 1 << 20;
        tell("a pass, # bytes at a time", slice);
        const int tail = qMax(0, m_passed.size() - 256);
        if (!m_file.startsWith(m_passed.left(int(m_index.resumeOffset()))) ||
            !m_file.mid(tail).startsWith(m_passed.mid(tail)))
            forget();
        read(slice);
        if (m_index.hasLostSeam()) {
            forget();
            read(slice);
        }
        m_passed = m_file;
        compare();
    }

    void read(int slice)
    {
        qint64 offset = m_index.Begin();
        int reports = 3;
        while (offset < m_file.size()) {
            const int count = int(qMin<qint64>(slice, m_file.size() - offset));
            const bool goesOn = m_index.Feed(m_file.constData() + offset, count);
            offset = goesOn ? offset + count : m_index.nextOffset();
            // Rows are also made in the middle of a pass.
            if (m_draws->once(8) && !m_index.awaitsKnownLines() && --reports >= 0)
                m_older = m_index.Rows(m_filter, m_before);
        }
        m_index.End();
    }

    void compare()
    {
        const LogRows rows = m_index.Rows(m_filter, m_before);
        const PlainRows whole(m_index.Rows(m_filter));
        const PlainRows grown(rows);
        const PlainRows fromOlder(m_index.Rows(m_filter, m_older));
        if (!(grown == whole))
            same("rows", Text(grown), Text(whole));
        if (!(fromOlder == whole))
            same("rows from older ones", Text(fromOlder), Text(whole));
        same("problems", rows.problems(), whole.countProblems());

        LogUpdate update;
        update.rows = std::make_shared<LogRows>(rows);
        update.Compare(m_before);
        same("update", Numbers(update), Numbers(PlainCompare(PlainRows(m_before), whole)));
        compareFirst(PlainRows(m_before), grown, m_before.CountSameFirst(rows));
        for (int i = 0; i < 3; ++i) {
            const qint64 start = m_draws->below(m_file.size() + 100);
            same("row near", rows.RowNear(start), whole.rowNear(start));
        }
        if (m_draws->once(4))
            m_older = m_before;
        m_before = rows;
    }

    // Those that are known to be the same are the same.
    void compareFirst(PlainRows const& before, PlainRows const& after, size_t known)
    {
        const size_t shorter = qMin(before.rows.size(), after.rows.size());
        size_t count = 0;
        while (count < shorter && before.rows[count] == after.rows[count])
            ++count;
        same("rows known to be the same", known > count ? known : 0, size_t(0));
    }

    QByteArray m_passed;
    QByteArray m_rest; // of an entry
    LogFilter m_filter;
    LogIndex m_index{parser()};
    LogRows m_before;
    LogRows m_older;
};

} // namespace

void tst_PlainLogRows::rows()
{
    Program::compare<Rows>("log rows", Rounds::count(6000, 200000, 4000000), 80);
}

QTEST_APPLESS_MAIN(tst_PlainLogRows)
#include "tst_PlainLogRows.moc"
