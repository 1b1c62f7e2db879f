// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The table rows while repeats are folded, and how they change, compared with a list of what the
// table shows: random entries, some of several rows, that come and go at two places.

#include "app/window/log/FoldedRows.h"

#include "Rounds.h"

#include <QSet>
#include <QStringList>
#include <QtTest>

#include <random>

using namespace Velocor;

namespace {

// An entry has a pattern, and a number that no other one has.
struct Entry
{
    int pattern;
    int number;
    int rows;

    bool Repeats(Entry const& other) const
    {
        return pattern == other.pattern && rows == other.rows;
    }
};

using Log = std::vector<Entry>;

int RowsOf(Log const& log)
{
    int rows = 0;
    for (Entry const& entry : log)
        rows += entry.rows;
    return rows;
}

QStringList RowTexts(Log const& log)
{
    QStringList texts;
    for (Entry const& entry : log) {
        for (int row = 0; row < entry.rows; ++row)
            texts.append(QString("%1.%2").arg(entry.number).arg(row));
    }
    return texts;
}

} // namespace

class tst_PlainFoldedRows : public QObject
{
    Q_OBJECT

private slots:
    void randomChanges();

private:
    void change(std::mt19937& random);
    void checkRows(Log const& log, FoldedRows const& folded);
    FoldedRows fold(Log const& log) const;
    QStringList shown(Log const& log) const;

    Log m_log;
    QSet<int> m_open; // numbers of the first entries
    int m_number = 0;
    qint64 m_changes = 0;
};

FoldedRows tst_PlainFoldedRows::fold(Log const& log) const
{
    auto groups = std::make_shared<FoldedRows::Groups>();
    QHash<size_t, int> numbers;
    size_t row = 0;
    for (size_t entry = 0; entry < log.size();) {
        const size_t first = row;
        size_t next = entry;
        for (; next < log.size() && log[next].Repeats(log[entry]); ++next)
            row += size_t(log[next].rows);
        if (next > entry + 1)
            groups->push_back({first, row, next - entry});
        numbers.insert(first, log[entry].number);
        entry = next;
    }
    return FoldedRows(RowsOf(log), groups, [&](RepeatGroup const& group) {
        return m_open.contains(numbers.value(group.first));
    });
}

// What the table shows: each row, and at the first one of a group the number of its entries.
QStringList tst_PlainFoldedRows::shown(Log const& log) const
{
    QStringList rows;
    for (size_t entry = 0; entry < log.size();) {
        size_t next = entry;
        while (next < log.size() && log[next].Repeats(log[entry]))
            ++next;
        const QStringList texts =
            RowTexts(Log(log.begin() + qint64(entry), log.begin() + qint64(next)));
        if (next == entry + 1)
            rows += texts;
        else if (m_open.contains(log[entry].number))
            rows += QStringList("open " + texts[0]) + texts.mid(1);
        else
            rows += QString("%1 x %2").arg(next - entry).arg(texts[0]);
        entry = next;
    }
    return rows;
}

void tst_PlainFoldedRows::checkRows(Log const& log, FoldedRows const& folded)
{
    const QStringList all = RowTexts(log);
    const QStringList table = shown(log);
    QCOMPARE(folded.count(), table.size());
    QCOMPARE(folded.RowAt(folded.count()), all.size());
    QCOMPARE(folded.TableRowOf(all.size()), folded.count());
    int tableRow = -1;
    for (int row = 0; row < all.size(); ++row) {
        const bool isShown =
            tableRow + 1 < table.size() && table[tableRow + 1].split(' ').last() == all[row];
        tableRow += isShown;
        QCOMPARE(folded.TableRowOf(row), tableRow);
        QCOMPARE(folded.IsHidden(row), !isShown);
        if (isShown)
            QCOMPARE(folded.RowAt(tableRow), row);
        RepeatGroup const* group = folded.GroupOf(row);
        QCOMPARE(group != nullptr && int(group->first) == row,
                 table[tableRow].contains(' ') && isShown);
        if (!isShown)
            QVERIFY(group && int(group->first) < row && row < int(group->end));
    }
}

void tst_PlainFoldedRows::change(std::mt19937& random)
{
    const auto below = [&random](size_t limit) {
        return size_t(random() % limit);
    };
    const auto newEntry = [&] {
        return Entry{int(below(2)), ++m_number, below(4) ? 1 : 1 + int(below(2))};
    };
    const Log before = m_log;
    const FoldedRows foldedBefore = fold(before);
    QStringList table = shown(before);

    // Entries above and below that stay, and others between them and at the end.
    const size_t above = below(before.size() + 1);
    const size_t removed = below(2) ? 0 : below(before.size() - above + 1);
    const size_t left = before.size() - above - removed;
    const size_t tail = below(2) ? 0 : std::min(left, below(3));
    Log after(before.begin(), before.begin() + qint64(above));
    FoldedRows::Change rows{RowsOf(after), 0, 0, 0, 0};
    rows.removed =
        RowsOf(Log(before.begin() + qint64(above), before.begin() + qint64(above + removed)));
    for (size_t i = 0, count = below(2) ? 0 : below(4); i < count; ++i)
        after.push_back(newEntry());
    rows.inserted = RowsOf(after) - rows.at;
    after.insert(after.end(), before.begin() + qint64(above + removed),
                 before.end() - qint64(tail));
    rows.tail = RowsOf(Log(before.end() - qint64(tail), before.end()));
    const int middle = RowsOf(after);
    // The last entry may grow.
    if (tail == 0 && left > 0 && below(4) == 0)
        ++after.back().rows;
    for (size_t i = 0, count = below(3); i < count; ++i)
        after.push_back(newEntry());
    rows.newTail = RowsOf(after) - middle;

    const FoldedRows foldedAfter = fold(after);
    checkRows(after, foldedAfter);
    if (QTest::currentTestFailed())
        return;
    const FoldedRows::Change change = FoldedRows::ChangeOf(foldedBefore, foldedAfter, rows);
    const QStringList expected = shown(after);
    QVERIFY(change.at >= 0 && change.removed >= 0 && change.inserted >= 0);
    QVERIFY(change.tail >= 0 && change.newTail >= 0);
    QVERIFY(change.at + change.removed + change.tail <= table.size());
    table = table.mid(0, table.size() - change.tail);
    table = table.mid(0, change.at) + expected.mid(change.at, change.inserted) +
            table.mid(change.at + change.removed);
    table += expected.mid(expected.size() - change.newTail);
    QCOMPARE(table, expected);
    m_changes += change.removed + change.tail < int(shown(before).size()) / 2;
    m_log = after;
}

void tst_PlainFoldedRows::randomChanges()
{
    std::mt19937 random(Rounds::seed());
    const int count = Rounds::count(3000, 300000, 3000000);
    for (int i = 0; i < count; ++i) {
        if (i % 20 == 0) {
            m_log.clear();
            m_open.clear();
        }
        for (Entry const& entry : m_log) {
            if (random() % 20 == 0)
                m_open.insert(entry.number);
        }
        change(random);
        if (QTest::currentTestFailed()) {
            qWarning("change %d", i);
            return;
        }
    }
    QVERIFY2(m_changes > count / 3, "most rows are told to differ");
}

QTEST_APPLESS_MAIN(tst_PlainFoldedRows)
#include "tst_PlainFoldedRows.moc"
