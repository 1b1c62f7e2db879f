// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Rows on their own, compared with a list of what was added; tst_PlainLogRows compares those that
// an index makes.

#include "app/logfile/LogRows.h"

#include <QtTest>

#include <algorithm>
#include <limits>
#include <random>
#include <vector>

using namespace Velocor;

namespace {

class Random
{
public:
    explicit Random(unsigned seed) : m_engine(seed) {}
    size_t below(size_t limit) { return m_engine() % limit; }
    bool once(size_t times) { return below(times) == 0; }

private:
    std::mt19937 m_engine;
};

struct PlainLine
{
    qint64 start;
    quint8 mark;
    quint16 check;
};

// A table with lines of any kind, and the same as a list.
struct Lines
{
    LineTable table;
    std::vector<PlainLine> list;
    qint64 end = 0;

    void Add(Random& random, size_t count)
    {
        static quint8 const kinds[] = {0,
                                       LogRows::Timed,
                                       LogRows::Timed,
                                       LogRows::Continued,
                                       LogRows::ContinuedAlone,
                                       LogRows::Torn};
        static qint64 const lengths[] = {1, 2, 40, 254, 255, 300, 70000};
        for (; count > 0; --count) {
            const auto severity = quint8(random.below(LogEntry::None + 1));
            const PlainLine line{end, quint8(kinds[random.below(6)] | severity),
                                 quint16(random.below(1 << 16))};
            table.Append(line.start, line.mark, line.check);
            list.push_back(line);
            end += lengths[random.below(7)];
        }
    }
};

struct PlainRow
{
    qint64 start;
    quint8 mark;
    quint16 check;
    size_t line;
    bool isHeading;
};

PlainRow heading(qint64 start)
{
    return {start, LogEntry::None, 0, 0, true};
}

PlainRow rowOf(Lines const& lines, size_t line, bool isContext = false)
{
    PlainLine const& of = lines.list[line];
    quint8 mark = of.mark;
    if ((mark & LogRows::Continued) && (mark & LogRows::Torn))
        mark = quint8((mark & ~LogRows::Torn) | LogRows::Alone);
    if (isContext)
        mark |= LogRows::Context | LogRows::Alone;
    return {of.start, mark, of.check, line, false};
}

bool isProblem(PlainRow const& row)
{
    const int severity = row.mark & LogRows::SeverityMask;
    return !row.isHeading && !(row.mark & LogRows::Continued) && severity >= LogEntry::Warning &&
           severity <= LogEntry::Fatal;
}

int plainRowNear(std::vector<PlainRow> const& rows, qint64 start)
{
    int nearest = -1;
    qint64 least = std::numeric_limits<qint64>::max();
    for (size_t row = 0; row < rows.size(); ++row) {
        const qint64 distance = qAbs(rows[row].start - start);
        if (rows[row].isHeading || distance >= least)
            continue;
        least = distance;
        nearest = int(row);
    }
    return nearest;
}

// What differs; empty if nothing does.
QString difference(LogRows const& rows, std::vector<PlainRow> const& plain, qint64 end)
{
    if (rows.size() != plain.size())
        return QString("%1 rows, not %2").arg(rows.size()).arg(plain.size());
    LogRows::Reader reader(rows);
    for (size_t row = 0; row < plain.size(); ++row) {
        PlainRow const& expected = plain[row];
        if (rows.start(row) != expected.start || reader.start(row) != expected.start)
            return QString("start of row %1").arg(row);
        if (rows.mark(row) != expected.mark ||
            rows.severity(row) != (expected.mark & LogRows::SeverityMask))
            return QString("mark of row %1").arg(row);
        if (rows.check(row) != expected.check || rows.isHeading(row) != expected.isHeading ||
            (!expected.isHeading && rows.line(row) != expected.line))
            return QString("row %1").arg(row);
    }
    if (rows.problems() != size_t(std::count_if(plain.begin(), plain.end(), isProblem)))
        return QString("%1 problems").arg(rows.problems());
    for (qint64 start = 0; start <= end; start += 1 + end / 50) {
        if (rows.RowNear(start) != plainRowNear(plain, start))
            return QString("row near %1").arg(start);
    }
    return QString();
}

// Rows for all lines of a run.
LogRows all(LineTable const& lines)
{
    LogRows rows(lines);
    rows.AddLines(0, lines.size());
    return rows;
}

LogRows listed(LineTable const& lines, std::vector<size_t> const& numbers)
{
    LogRows rows(lines);
    for (size_t number : numbers)
        rows.AddLine(number, false);
    return rows;
}

// Some lines of an earlier run, and all from `first` on of the newest.
LogRows runs(LineTable const& lines, size_t first, bool hasHeading)
{
    LogRows rows(lines);
    rows.AddHeading(LogRows::EarlierHeading);
    rows.AddLines(first, lines.size());
    rows.EndEarlier();
    if (hasHeading)
        rows.AddHeading(LogRows::NewestHeading);
    rows.AddLines(0, first);
    return rows;
}

} // namespace

Q_DECLARE_METATYPE(Velocor::LogRows)

class tst_LogRows : public QObject
{
    Q_OBJECT

private slots:
    void beginsEntry_data();
    void beginsEntry();
    void checks();
    void noRows();
    void anyRows_data();
    void anyRows();
    void rowOfLine();
    void linesAreReplaced();
    void countSame_data();
    void countSame();
    void countSameOfGrowingLists();
};

void tst_LogRows::beginsEntry_data()
{
    QTest::addColumn<int>("mark");
    QTest::addColumn<bool>("begins");
    QTest::newRow("a time and a severity") << (LogRows::Timed | LogEntry::Error) << true;
    QTest::newRow("a time") << (LogRows::Timed | LogEntry::None) << true;
    QTest::newRow("a severity") << int(LogEntry::Trace) << true;
    QTest::newRow("neither") << int(LogEntry::None) << false;
    QTest::newRow("continued") << (LogRows::Continued | LogEntry::Error) << false;
    QTest::newRow("torn") << (LogRows::Torn | LogRows::Timed) << false;
    QTest::newRow("continued, but not shown along with its entry")
        << (LogRows::ContinuedAlone | LogEntry::Error) << false;
}

void tst_LogRows::beginsEntry()
{
    QFETCH(int, mark);
    QTEST(LogRows::BeginsEntry(quint8(mark)), "begins");
    const bool isContinued = mark & LogRows::Continued;
    const bool isTorn = mark & LogRows::Torn;
    QCOMPARE(LogRows::IsAlone(quint8(mark)), isContinued && isTorn);
    QCOMPARE(LogRows::IsTorn(quint8(mark)), !isContinued && isTorn);
}

void tst_LogRows::checks()
{
    QByteArray line(2 * LogRows::CheckedLength, 'x');
    const auto check = [&] {
        return LogRows::CheckOf(line.constData(), line.size());
    };
    const quint16 before = check();
    line[LogRows::CheckedLength] = 'y';
    QCOMPARE(check(), before);
    line[LogRows::CheckedLength - 1] = 'y';
    QVERIFY(check() != before);
}

void tst_LogRows::noRows()
{
    const LogRows none;
    QCOMPARE(none.size(), size_t(0));
    QCOMPARE(none.RowNear(5), -1);
    QCOMPARE(none.RowOfLine(5), size_t(0));
    QCOMPARE(none.CountSame(none), size_t(0));

    Random random(1);
    Lines lines;
    lines.Add(random, 3);
    LogRows rows(lines.table);
    rows.AddHeading(LogRows::EarlierHeading);
    QCOMPARE(rows.RowNear(5), -1);
    rows.Truncate(0);
    QCOMPARE(rows.size(), size_t(0));
    QCOMPARE(rows.CountSame(all(lines.table)), size_t(0));
    QCOMPARE(all(lines.table).CountSame(rows), size_t(0));
}

void tst_LogRows::anyRows_data()
{
    QTest::addColumn<unsigned>("seed");
    for (unsigned seed = 1; seed <= 40; ++seed)
        QTest::newRow(qPrintable(QString("seed %1").arg(seed))) << seed;
}

// Earlier runs and the newest one, all of their lines or some, cut off and added to again.
void tst_LogRows::anyRows()
{
    QFETCH(unsigned, seed);
    Random random(seed);
    for (int round = 0; round < 20; ++round) {
        Lines lines;
        lines.Add(random, 1 + random.below(30));
        const size_t count = lines.list.size();
        LogRows rows(lines.table);
        std::vector<PlainRow> plain;
        const auto addSome = [&](size_t from) {
            for (size_t line = from; line < count; ++line) {
                if (random.once(2))
                    continue;
                const bool isContext = random.once(3);
                rows.AddLine(line, isContext);
                plain.push_back(rowOf(lines, line, isContext));
            }
        };
        const auto addRun = [&] {
            if (random.once(2))
                return addSome(random.below(count));
            const size_t first = random.below(count);
            const size_t end = first + random.below(count - first + 1);
            rows.AddLines(first, end);
            for (size_t line = first; line < end; ++line)
                plain.push_back(rowOf(lines, line));
        };
        if (random.once(2)) {
            rows.AddHeading(LogRows::EarlierHeading);
            plain.push_back(heading(LogRows::EarlierHeading));
            for (size_t left = 1 + random.below(3); left > 0; --left)
                addRun();
            rows.EndEarlier();
            if (!random.once(3)) {
                rows.AddHeading(LogRows::NewestHeading);
                plain.push_back(heading(LogRows::NewestHeading));
            }
        }
        const size_t newest = plain.size();
        QCOMPARE(rows.earlier() > 0, newest > 0);
        addRun();
        QCOMPARE(difference(rows, plain, lines.end), QString());

        const size_t kept = newest + random.below(plain.size() - newest + 1);
        rows.Truncate(kept);
        plain.resize(kept);
        QCOMPARE(difference(rows, plain, lines.end), QString());
        addSome(kept > newest ? plain.back().line + 1 : 0);
        QCOMPARE(difference(rows, plain, lines.end), QString());
        QCOMPARE(rows.RowNear(-100), plainRowNear(plain, -100));
        QCOMPARE(rows.RowNear(2 * lines.end), plainRowNear(plain, 2 * lines.end));
    }
}

void tst_LogRows::rowOfLine()
{
    Random random(1);
    Lines lines;
    lines.Add(random, 40);
    const LogRows some = listed(lines.table, {3, 4, 10, 11, 20, 39});
    const std::vector<size_t> expected{0, 0, 0, 0, 1, 2, 2, 2, 2, 2, 2,
                                       3, 4, 4, 4, 4, 4, 4, 4, 4, 4};
    for (size_t line = 0; line < 40; ++line)
        QCOMPARE(some.RowOfLine(line), line < expected.size() ? expected[line] : size_t(5));
    QCOMPARE(some.RowOfLine(40), size_t(6));
    const LogRows every = all(lines.table);
    for (size_t line = 0; line <= 40; ++line)
        QCOMPARE(every.RowOfLine(line), line);
}

void tst_LogRows::linesAreReplaced()
{
    Random random(1);
    Lines lines;
    lines.Add(random, 5);
    LogRows rows(lines.table, 1, 2, 3);
    rows.AddLine(4, false);
    QCOMPARE(rows.newestEnd(), size_t(1));
    QCOMPARE(rows.complete(), qint64(2));
    QCOMPARE(rows.end(), qint64(3));
    lines.Add(random, 5);
    rows.SetLines(lines.table, 10, 20, 30);
    rows.AddLine(9, false);
    QCOMPARE(rows.lines().size(), size_t(10));
    QCOMPARE(rows.newestEnd(), size_t(10));
    QCOMPARE(rows.complete(), qint64(20));
    QCOMPARE(rows.end(), qint64(30));
    QCOMPARE(difference(rows, {rowOf(lines, 4), rowOf(lines, 9)}, lines.end), QString());
}

void tst_LogRows::countSame_data()
{
    QTest::addColumn<LogRows>("one");
    QTest::addColumn<LogRows>("other");
    QTest::addColumn<int>("count");
    Random random(1);
    Lines lines;
    lines.Add(random, 10);
    const LineTable ten = lines.table;
    LineTable changed = ten;
    changed.SetMark(4, ten.mark(4) ^ LogRows::Timed);
    lines.Add(random, 10);
    const LineTable twenty = lines.table;
    const auto row = [](char const* name, LogRows const& one, LogRows const& other, int count) {
        QTest::newRow(name) << one << other << count;
    };
    row("the same", all(ten), all(ten), 10);
    row("more lines", all(ten), all(twenty), 10);
    row("another line", all(ten), all(changed), 4);
    row("all lines and some", all(ten), listed(ten, {0, 1, 2}), 0);
    row("the same list", listed(ten, {0, 1, 5}), listed(ten, {0, 1, 5}), 3);
    row(
        "a list that was made again", listed(ten, {0, 1, 5}),
        [&] {
            LogRows rows = listed(ten, {0, 2, 3});
            rows.Truncate(0);
            for (size_t line : {0, 1, 5})
                rows.AddLine(line, false);
            return rows;
        }(),
        3);
    row("a longer list", listed(ten, {0, 1, 5}), listed(twenty, {0, 1, 5, 12}), 3);
    row("another list", listed(ten, {0, 1, 5}), listed(ten, {0, 2, 5}), 1);
    row("the same list, another line", listed(ten, {0, 1, 5}), listed(changed, {0, 1, 5}), 2);
    row(
        "another first line", all(ten),
        [&] {
            LogRows rows(ten);
            rows.AddLines(1, 10);
            return rows;
        }(),
        0);
    row("earlier runs", runs(ten, 6, true), runs(ten, 6, true), 7);
    row("an earlier run that is shorter", runs(twenty, 6, true), runs(ten, 6, true), 7);
    row("earlier runs without a heading", runs(ten, 6, false), runs(ten, 6, false), 6);
    row("a heading in one only", runs(ten, 6, true), runs(ten, 6, false), 0);
    row("no rows after the heading", runs(ten, 0, true), runs(ten, 0, true), 0);
    const auto twoParts = [&] {
        LogRows rows(ten);
        rows.AddLines(0, 2);
        rows.AddLines(5, 9);
        return rows;
    }();
    row("lines with a gap, which are not looked at", twoParts, twoParts, 0);
    const auto listAfterList = [&] {
        LogRows rows(ten);
        rows.AddHeading(LogRows::EarlierHeading);
        rows.AddLine(7, false);
        rows.EndEarlier();
        rows.AddLine(1, false);
        return rows;
    }();
    row("a list after another, which is not looked at", listAfterList, listAfterList, 0);
}

void tst_LogRows::countSame()
{
    QFETCH(LogRows, one);
    QFETCH(LogRows, other);
    QTEST(int(one.CountSame(other)), "count");
    QTEST(int(other.CountSame(one)), "count");
}

void tst_LogRows::countSameOfGrowingLists()
{
    Random random(1);
    Lines lines;
    lines.Add(random, 100);
    LogRows before = listed(lines.table, {});
    for (size_t line = 0; line < 100; line += 1 + random.below(5)) {
        LogRows after = before;
        after.AddLine(line, false);
        QCOMPARE(before.CountSame(after), before.size());
        before = after;
    }
    QVERIFY(before.size() > 20);
}

QTEST_GUILESS_MAIN(tst_LogRows)
#include "tst_LogRows.moc"
