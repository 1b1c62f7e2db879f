// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Compares where the blocks of a log's rows say that problems are with a look at every row, while
// rows are added, removed and changed anywhere, and after any part of the blocks has been looked
// at.

#include "app/logfile/LogRows.h"
#include "app/window/log/ProblemBlocks.h"
#include "plain/Program.h"

#include <QtTest>

#include <algorithm>
#include <vector>

using namespace Velocor;

class tst_PlainProblemBlocks : public QObject
{
    Q_OBJECT

private slots:
    void blocks();
};

namespace {

class Blocks : public Program::Pair
{
public:
    void perform(Program::Draws& draws)
    {
        m_draws = &draws;
        const int kind = draws.below(32);
        if (kind < 8)
            insert(static_cast<int>(m_marks.size()));
        else if (kind < 12)
            insert(draws.below(static_cast<int>(m_marks.size()) + 1));
        else if (kind < 16)
            remove();
        else if (kind < 22)
            change();
        else if (kind < 31)
            look();
        else
            reset();
    }

    void finish()
    {
        while (!m_blocks.isComplete())
            m_blocks.Look(rows(), 100);
        compare(1);
        compare(1 + m_marks.size() / 300);
        compare(400);
        compare(m_marks.size());
    }

private:
    quint8 mark()
    {
        static constexpr quint8 Flags[] = {LogRows::Timed, LogRows::Continued, LogRows::Torn,
                                           LogRows::ContinuedAlone, 0};
        return static_cast<quint8>(m_draws->below(LogEntry::None + 1) | m_draws->oneOf(Flags));
    }

    // Up to some blocks, but usually few rows.
    int amount() { return 1 + (m_draws->once(3) ? m_draws->below(1500) : m_draws->below(20)); }

    // With a problem only here and there.
    std::vector<quint8> marks(int count)
    {
        std::vector<quint8> some(size_t(count), quint8(LogEntry::Trace | LogRows::Timed));
        for (int i = m_draws->below(8); i > 0; --i)
            some[size_t(m_draws->below(count))] = mark();
        return some;
    }

    void insert(int first)
    {
        const int count = amount();
        tell("insert # before #", count, first);
        const std::vector<quint8> some = marks(count);
        m_marks.insert(m_marks.begin() + first, some.begin(), some.end());
        m_blocks.Insert(size_t(first), size_t(count));
        same("size", m_blocks.size(), m_marks.size());
    }

    void remove()
    {
        if (m_marks.empty())
            return;
        const int first = m_draws->once(2) ? m_draws->below(int(m_marks.size())) : 0;
        const int count = std::min(amount(), int(m_marks.size()) - first);
        tell("remove # from #", count, first);
        m_marks.erase(m_marks.begin() + first, m_marks.begin() + first + count);
        m_blocks.Remove(size_t(first), size_t(count));
        same("size", m_blocks.size(), m_marks.size());
    }

    void change()
    {
        if (m_marks.empty())
            return;
        const int first = m_draws->below(int(m_marks.size()));
        const int count = std::min(amount(), int(m_marks.size()) - first);
        tell("change # from #", count, first);
        const std::vector<quint8> some = marks(count);
        std::copy(some.begin(), some.end(), m_marks.begin() + first);
        m_blocks.Change(size_t(first), size_t(count));
    }

    void look()
    {
        const int limit = m_draws->below(3000);
        tell("look at #", limit);
        m_blocks.Look(rows(), size_t(limit));
    }

    void reset()
    {
        tell("reset");
        m_marks = marks(amount());
        m_blocks.Reset(m_marks.size());
        same("size", m_blocks.size(), m_marks.size());
    }

    ProblemBlocks::Marks rows() const
    {
        return [this](size_t row) {
            return m_marks[row];
        };
    }

    // 0 for none, then the severities from the least to the worst.
    static int rank(LogEntry::Severity severity)
    {
        return severity == ProblemBlocks::NoProblem ? 0 : 1 + severity;
    }

    void compare(size_t parts)
    {
        std::vector<int> plain(parts, 0);
        for (size_t row = 0; row < m_marks.size(); ++row) {
            const int severity = m_marks[row] & LogRows::SeverityMask;
            const bool isEntry = !(m_marks[row] & LogRows::Continued);
            if (isEntry && severity >= LogEntry::Warning && severity <= LogEntry::Fatal) {
                int& worst = plain[row * parts / m_marks.size()];
                worst = std::max(worst, 1 + severity);
            }
        }
        std::vector<int> found;
        for (const LogEntry::Severity severity : m_blocks.Worst(rows(), parts))
            found.push_back(rank(severity));
        same("worst", text(found), text(plain));
    }

    static QString text(std::vector<int> const& numbers)
    {
        QString all;
        for (const int number : numbers)
            all += QString::number(number);
        return all;
    }

    std::vector<quint8> m_marks;
    ProblemBlocks m_blocks;
};

} // namespace

void tst_PlainProblemBlocks::blocks()
{
    Program::compare<Blocks>("problem blocks", Rounds::count(6000, 200000, 2000000), 30);
}

QTEST_APPLESS_MAIN(tst_PlainProblemBlocks)
#include "tst_PlainProblemBlocks.moc"
