// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Compares the table of a file's lines with a vector that has all of each line, and the list of
// line numbers with a vector: what they hold, and that copies remain what they are.

#include "app/logfile/LineNumbers.h"
#include "app/logfile/LineTable.h"
#include "plain/Program.h"

#include <QtTest>

#include <algorithm>
#include <vector>

using namespace Velocor;

class tst_PlainLineTable : public QObject
{
    Q_OBJECT

private slots:
    void tables();
    void numbers();
    void differentAtAnyLine();
};

namespace {

struct PlainLine
{
    qint64 start;
    quint8 mark;
    quint16 check;

    bool operator==(PlainLine const& other) const
    {
        return start == other.start && mark == other.mark && check == other.check;
    }
};

using PlainTable = std::vector<PlainLine>;

size_t PlainCountSame(PlainTable const& a, PlainTable const& b)
{
    size_t count = 0;
    while (count < std::min(a.size(), b.size()) && a[count] == b[count])
        ++count;
    return count;
}

class Tables : public Program::Pair
{
public:
    void perform(Program::Draws& draws)
    {
        m_draws = &draws;
        const int kind = draws.below(64);
        if (kind < 24)
            append(1 + draws.below(4), 100);
        else if (kind < 36)
            append(1 + draws.below(200), 3);
        else if (kind < 40)
            append(int(LineTable::BlockSize) - 200 + draws.below(400), 1);
        else if (kind < 46)
            truncate();
        else if (kind < 50)
            setMark();
        else if (kind < 54)
            keep();
        else if (kind < 58)
            takePart();
        else
            look();
    }

    void finish()
    {
        compare(m_table, m_plain);
        for (Kept const& kept : m_kept)
            compare(kept.table, kept.plain);
    }

private:
    struct Kept
    {
        LineTable table;
        PlainTable plain;
    };

    // The length of one line in `rare` is rare itself.
    void append(int count, int rare)
    {
        static qint64 const lengths[] = {1,     253,   254,    255,          256,
                                         65535, 65536, 100000, 5000000000LL, 3};
        tell("append #", count);
        const int marks = m_draws->once(4) ? 200 : 5;
        const int rareAt = m_draws->below(rare);
        const qint64 rareLength = m_draws->oneOf(lengths);
        for (int i = 0; i < count; ++i) {
            m_end += i % rare == rareAt ? rareLength : 1 + i % 120;
            ++m_number;
            const PlainLine line{m_end, quint8(m_number % marks), quint16(m_number * 7)};
            m_table.Append(line.start, line.mark, line.check);
            m_plain.push_back(line);
        }
    }

    void truncate()
    {
        const int size = int(m_plain.size());
        int lines = m_draws->once(2) ? m_draws->below(size + 1)
                                     : size - m_draws->below(qMin(size, 300) + 1);
        if (m_draws->once(3))
            lines -= lines % int(LineTable::BlockSize);
        tell("truncate to #", lines);
        m_table.Truncate(size_t(lines));
        m_plain.resize(size_t(lines));
        m_end = m_plain.empty() ? 0 : m_plain.back().start;
    }

    void setMark()
    {
        if (m_plain.empty())
            return;
        const int line = m_draws->below(int(m_plain.size()));
        const auto mark = quint8(m_draws->below(256));
        tell("mark # is #", line, uint(mark));
        m_table.SetMark(size_t(line), mark);
        m_plain[size_t(line)].mark = mark;
    }

    void keep()
    {
        tell("keep a copy");
        if (m_kept.size() == 3)
            m_kept.erase(m_kept.begin() + m_draws->below(3));
        m_kept.push_back({m_table, m_plain});
    }

    // Only of its end, of its start, or of both.
    void takePart()
    {
        if (m_plain.empty())
            return;
        if (m_draws->once(2))
            keep();
        const int size = int(m_plain.size());
        const int first = m_draws->once(3) ? 0 : m_draws->below(qMin(size, 20000) + 1);
        const int end = m_draws->once(3) ? size : first + m_draws->below(size - first + 1);
        const qint64 offset = first == size || m_draws->once(3) ? 0 : m_plain[size_t(first)].start;
        tell("take lines # to #", first, end);
        tell("with starts less by #", offset);
        m_table = m_table.Part(size_t(first), size_t(end), offset);
        m_plain = PlainTable(m_plain.begin() + first, m_plain.begin() + end);
        for (PlainLine& line : m_plain)
            line.start -= offset;
        m_end = m_plain.empty() ? 0 : m_plain.back().start;
    }

    void look()
    {
        tell("look");
        same("size", m_table.size(), m_plain.size());
        for (Kept const& kept : m_kept) {
            same("same lines", m_table.CountSame(kept.table), PlainCountSame(m_plain, kept.plain));
            same("same lines, reverse", kept.table.CountSame(m_table),
                 PlainCountSame(m_plain, kept.plain));
        }
        if (m_plain.empty())
            return;
        LineTable::Reader reader(m_table);
        for (int i = 0; i < 10; ++i) {
            static int const units[] = {1, 1, 128, int(LineTable::BlockSize)};
            const int drawn = m_draws->below(int(m_plain.size()));
            const auto near = size_t(drawn - drawn % m_draws->oneOf(units));
            const auto line = i < 5 ? near : m_plain.size() - 1 - near % qMin<size_t>(near + 1, 9);
            compareLine(m_table, m_plain, line, reader);
            const qint64 distance = m_draws->once(3) ? 0 : m_draws->below(300) - 100;
            const qint64 offset = m_plain[line].start + distance;
            const auto after = std::upper_bound(
                m_plain.begin(), m_plain.end(), offset,
                [](qint64 value, PlainLine const& other) { return value < other.start; });
            const auto plain = size_t(qMax<std::ptrdiff_t>(1, after - m_plain.begin())) - 1;
            same("line at", m_table.LineAt(offset), plain);
        }
    }

    void compareLine(LineTable const& table, PlainTable const& plain, size_t line,
                     LineTable::Reader& reader)
    {
        same("start", table.start(line), plain[line].start);
        same("start, by reader", reader.start(line), plain[line].start);
        same("mark", uint(table.mark(line)), uint(plain[line].mark));
        same("check", uint(table.check(line)), uint(plain[line].check));
    }

    void compare(LineTable const& table, PlainTable const& plain)
    {
        same("size", table.size(), plain.size());
        LineTable::Reader reader(table);
        for (size_t line = 0; line < plain.size() && difference().isEmpty(); ++line) {
            if (!(PlainLine{reader.start(line), table.mark(line), table.check(line)} ==
                  plain[line]))
                compareLine(table, plain, line, reader);
        }
    }

    LineTable m_table;
    PlainTable m_plain;
    std::vector<Kept> m_kept;
    qint64 m_end = 0;
    int m_number = 0;
};

class Numbers : public Program::Pair
{
public:
    void perform(Program::Draws& draws)
    {
        m_draws = &draws;
        const int kind = draws.below(8);
        if (kind < 4)
            append(1 + draws.below(kind == 0 ? 30000 : 50));
        else if (kind == 4)
            truncate();
        else if (kind == 5)
            keep();
        else
            compareWithKept();
    }

    void finish()
    {
        compare(m_numbers, m_plain);
        compare(m_kept, m_plainKept);
    }

private:
    void append(int count)
    {
        tell("append #", count);
        for (int i = 0; i < count; ++i) {
            m_plain.push_back(++m_next);
            m_numbers.Append(m_next);
        }
    }

    void truncate()
    {
        int count = m_draws->below(int(m_plain.size()) + 2);
        if (m_draws->once(3))
            count -= count % int(LineNumbers::BlockSize);
        tell("truncate to #", count);
        m_numbers.Truncate(size_t(count));
        m_plain.resize(qMin(m_plain.size(), size_t(count)));
    }

    void keep()
    {
        tell("keep a copy");
        m_kept = m_numbers;
        m_plainKept = m_plain;
    }

    void compareWithKept()
    {
        tell("compare with the copy");
        const size_t end = qMin(m_plain.size(), m_plainKept.size());
        size_t count = 0;
        while (count < end && m_plain[count] == m_plainKept[count])
            ++count;
        same("same numbers", m_numbers.CountSame(m_kept), count);
    }

    void compare(LineNumbers const& numbers, std::vector<quint32> const& plain)
    {
        same("size", numbers.size(), plain.size());
        for (size_t at = 0; at < plain.size() && difference().isEmpty(); ++at)
            same("number", numbers.at(at), plain[at]);
    }

    LineNumbers m_numbers;
    LineNumbers m_kept;
    std::vector<quint32> m_plain;
    std::vector<quint32> m_plainKept;
    quint32 m_next = 0;
};

} // namespace

void tst_PlainLineTable::tables()
{
    Program::compare<Tables>("line table", Rounds::count(4000, 200000, 4000000), 30);
}

void tst_PlainLineTable::numbers()
{
    Program::compare<Numbers>("line numbers", Rounds::count(3000, 200000, 4000000), 30);
}

// Tables that share nothing: wherever they differ, and however little.
void tst_PlainLineTable::differentAtAnyLine()
{
    constexpr size_t Count = 600;
    const auto table = [](size_t other, qint64 later, int otherMark, int otherCheck) {
        LineTable lines;
        for (size_t line = 0; line < Count; ++line) {
            const bool isOther = line == other;
            lines.Append(qint64(line) * 70 + (line >= other ? later : 0),
                         quint8((line % 5) ^ (isOther ? otherMark : 0)),
                         quint16((line * 77) ^ (isOther ? otherCheck : 0)));
        }
        return lines;
    };
    const LineTable lines = table(Count, 0, 0, 0);
    QCOMPARE(lines.CountSame(table(Count, 0, 0, 0)), Count);
    for (size_t line = 0; line < Count; ++line) {
        QCOMPARE(lines.CountSame(table(line, 1, 0, 0)), line);
        QCOMPARE(lines.CountSame(table(line, 0, 1, 0)), line);
        QCOMPARE(lines.CountSame(table(line, 0, 0, 1)), line);
        LineTable shorter = table(Count, 0, 0, 0);
        shorter.Truncate(line);
        QCOMPARE(lines.CountSame(shorter), line);
        QCOMPARE(shorter.CountSame(lines), line);
    }
}

QTEST_APPLESS_MAIN(tst_PlainLineTable)
#include "tst_PlainLineTable.moc"
