// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/RepeatGroups.h"

#include "app/history/MessagePattern.h"
#include "app/logfile/LogLineReader.h"

#include <algorithm>
#include <utility>

namespace Velocor {

namespace {

constexpr size_t EntriesBetweenQuestions = 1024;

// The entries of rows. A line that belongs to no entry counts as one here, and so does a heading.
class EntriesOfRows
{
public:
    EntriesOfRows(LogRows const& rows, LogSource const& source, LogLineParser const& parser)
        : m_rows(rows), m_starts(rows), m_source(source), m_parser(parser),
          m_isOpen(m_reader.Open(source, parser.fileType()))
    {}

    size_t size() const { return m_rows.size(); }

    // The first row of the entry that a row belongs to.
    size_t Start(size_t row) const
    {
        while (row > 0 && continues(row))
            --row;
        return row;
    }

    // The row after the last one of the entry that a row belongs to.
    size_t End(size_t row) const
    {
        do
            ++row;
        while (row < m_rows.size() && continues(row));
        return row;
    }

    size_t Count(size_t first, size_t end) const
    {
        size_t count = 0;
        for (size_t row = first; row < end; row = End(row))
            ++count;
        return count;
    }

    // Whether the entry that starts with a row repeats the one above.
    bool Repeats(size_t row)
    {
        if (row == 0)
            return false;
        const QString above = pattern(Start(row - 1));
        return !above.isNull() && above == pattern(row);
    }

private:
    bool continues(size_t row) const { return LogRows::ContinuesEntry(m_rows.mark(row)); }

    // Null if the entry repeats nothing. The one before was asked for last.
    QString pattern(size_t first)
    {
        if (!m_isKnown || m_known != first) {
            m_pattern = readPattern(first);
            m_known = first;
            m_isKnown = true;
        }
        return m_pattern;
    }

    QString readPattern(size_t first)
    {
        const quint8 mark = m_rows.mark(first);
        if (!m_isOpen || m_rows.isHeading(first) || (mark & LogRows::Torn))
            return QString();
        const auto log = static_cast<ushort>(m_source.LogAt(m_starts.start(first)));
        QString pattern = QChar(ushort(mark & (LogRows::SeverityMask | LogRows::Context)));
        pattern += QChar(log);
        const size_t end = End(first);
        int size = 0;
        for (size_t row = first; row < end; ++row) {
            const QByteArray line = m_reader.Line(m_starts.start(row));
            size += line.size();
            const bool isThere =
                LogRows::CheckOf(line.constData(), line.size()) == m_rows.check(row);
            if (!isThere || size > RepeatGroups::MostCompared)
                return QString();
            const LogEntry entry = m_parser.Parse(line);
            pattern += MessagePattern::Of(entry.program) + QLatin1Char('\n') +
                       MessagePattern::Of(entry.message) + QLatin1Char('\n');
        }
        return pattern;
    }

    LogRows const& m_rows;
    LogRows::Reader m_starts;
    LogSource const& m_source;
    LogLineParser const& m_parser;
    LogLineReader m_reader;
    bool m_isOpen;
    bool m_isKnown = false;
    size_t m_known = 0;
    QString m_pattern;
};

// Rows that are what they were, perhaps in another place.
struct SameRows
{
    size_t before;
    size_t now;
    size_t count;

    size_t end() const { return now + count; }
};

// Groups of entries that are added one after the other.
class GrowingGroups
{
public:
    explicit GrowingGroups(EntriesOfRows const& entries) : m_entries(entries) {}

    // Adds the rows from `first` to the one before `end`, of one entry or of some that repeat it.
    void Add(size_t first, size_t end, size_t count, bool repeats)
    {
        if (!repeats) {
            finish();
            m_last = {first, first, 0};
        }
        m_last.end = end;
        m_last.entries += count;
    }

    // Adds rows whose groups are known. They are whole entries.
    //
    // @param repeats  whether the first one repeats the one above
    void AddKnown(RepeatGroups::List const& known, SameRows const& rows, bool repeats)
    {
        const auto endsBefore = [](RepeatGroup const& group, size_t row) {
            return group.end <= row;
        };
        const size_t endBefore = rows.before + rows.count;
        auto group = std::lower_bound(known.begin(), known.end(), rows.before, endsBefore);
        const auto now = [&rows](size_t before) {
            return rows.now + (before - rows.before);
        };
        size_t row = rows.before;
        for (; group != known.end() && group->first < endBefore; ++group) {
            if (row < group->first)
                addDifferent(now(row), now(group->first), std::exchange(repeats, false));
            const size_t first = std::max(row, group->first);
            row = std::min(endBefore, group->end);
            const bool isWhole = row - first == group->end - group->first;
            Add(now(first), now(row),
                isWhole ? group->entries : m_entries.Count(now(first), now(row)),
                std::exchange(repeats, false));
        }
        if (row < endBefore)
            addDifferent(now(row), now(endBefore), repeats);
    }

    std::shared_ptr<RepeatGroups::List const> Finished()
    {
        finish();
        return std::make_shared<RepeatGroups::List>(std::move(m_groups));
    }

private:
    // Of entries that do not repeat each other, the ones between the first and the last do not
    // matter.
    void addDifferent(size_t first, size_t end, bool repeats)
    {
        Add(first, m_entries.End(first), 1, repeats);
        const size_t last = m_entries.Start(end - 1);
        if (last > first)
            Add(last, end, 1, false);
    }

    void finish()
    {
        if (m_last.entries > 1)
            m_groups.push_back(m_last);
        m_last = {0, 0, 0};
    }

    EntriesOfRows const& m_entries;
    RepeatGroups::List m_groups;
    RepeatGroup m_last{0, 0, 0};
};

// Without entries that began before the rows or may go on after them.
SameRows WholeEntries(EntriesOfRows const& entries, SameRows const& rows)
{
    if (rows.count == 0)
        return rows;
    const size_t first = entries.Start(rows.now) == rows.now ? rows.now : entries.End(rows.now);
    const size_t end = entries.Start(rows.end() - 1);
    if (first >= end)
        return {rows.before, rows.now, 0};
    return {rows.before + (first - rows.now), first, end - first};
}

} // namespace

void RepeatGroups::Forget()
{
    m_groups.reset();
}

std::shared_ptr<RepeatGroups::List const>
RepeatGroups::Of(LogUpdate const& update, LogSource const& source, LogLineParser const& parser)
{
    const std::shared_ptr<List const> known = std::exchange(m_groups, nullptr);
    EntriesOfRows entries(*update.rows, source, parser);
    GrowingGroups groups(entries);
    size_t row = 0;
    const auto readTo = [&](size_t end) {
        for (size_t read = 1; row < end; ++read) {
            if (read % EntriesBetweenQuestions == 0 && !m_goesOn())
                return false;
            const size_t next = entries.End(row);
            groups.Add(row, next, 1, entries.Repeats(row));
            row = next;
        }
        return true;
    };
    if (known && !update.isReset) {
        const size_t after = update.changeAt + update.removed;
        const SameRows above{0, 0, update.changeAt};
        const SameRows below{after, update.changeAt + update.inserted,
                             m_rowCount - update.changedTail - after};
        for (SameRows const& part : {above, below}) {
            const SameRows same = WholeEntries(entries, part);
            if (same.count == 0)
                continue;
            if (!readTo(same.now))
                return nullptr;
            groups.AddKnown(*known, same, entries.Repeats(same.now));
            row = same.end();
        }
    }
    if (!readTo(entries.size()))
        return nullptr;
    m_rowCount = entries.size();
    m_groups = groups.Finished();
    return m_groups;
}

} // namespace Velocor
