// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LineCheck.h"
#include "app/logfile/LineNumbers.h"
#include "app/logfile/LineTable.h"
#include "app/logfile/LogEntry.h"

#include <QtGlobal>

#include <algorithm>
#include <utility>
#include <vector>

namespace Velocor {

/// The rows of the log view, oldest first: where each starts in the file, and what it is.
///
/// The texts stay in the file, to keep memory use low. A check tells whether a line is still the
/// one that was read when it is read again, because a log overwrites its file. If there are entries
/// of earlier runs, a heading row precedes them and another one precedes the newest run.
///
/// Rows refer to lines of a table: to all lines of a run, which takes no memory, or to some, with
/// four bytes for each. A plain value, and cheap to copy; several threads may read the same one.
///
///     LogRows rows(lines);
///     rows.AddLines(0, lines.size());
///     LogRows::Reader reader(rows);
///     for (size_t row = 0; row < rows.size(); ++row)
///         show(reader.start(row), rows.severity(row));
class LogRows
{
public:
    /// Start values of the heading rows, which no line can have.
    static constexpr qint64 EarlierHeading = -1;
    static constexpr qint64 NewestHeading = -2;

    /// Of the heading of a run among several; those of the runs after it are smaller.
    static constexpr qint64 FirstRunHeading = -3;

    /// The mark of a row: a LogEntry::Severity and these flags.
    static constexpr quint8 SeverityMask = 0x07;
    static_assert(LogEntry::None <= SeverityMask, "a mark has no room for another severity");
    static constexpr quint8 Continued = 0x08; ///< not an entry; has the severity of the entry above
    static constexpr quint8 Torn = 0x10;      ///< its first part was overwritten
    static constexpr quint8 Timed = 0x20;     ///< its time is known
    static constexpr quint8 Context = 0x40;   ///< shown only because it is near a line that matches
    static constexpr quint8 Alone = 0x80;     ///< continued, but not shown along with its entry

    /// In a LineTable, instead of Alone. A line that is continued is not torn.
    static constexpr quint8 ContinuedAlone = Continued | Torn;

    /// Whether a line with this mark is the first one of an entry. The lines that follow it without
    /// a stamp, those with the mark Continued, belong to the same entry.
    static bool BeginsEntry(quint8 mark)
    {
        return !(mark & (Continued | Torn)) &&
               ((mark & Timed) || (mark & SeverityMask) != LogEntry::None);
    }

    /// Whether a row with this mark belongs to the entry of the row above.
    static bool ContinuesEntry(quint8 mark) { return (mark & Continued) && !(mark & Alone); }

    /// Whether a mark in a LineTable is that of a line that is continued, but not shown along with
    /// an entry.
    static bool IsAlone(quint8 mark) { return (mark & ContinuedAlone) == ContinuedAlone; }

    /// Whether a mark in a LineTable is that of a torn line.
    static bool IsTorn(quint8 mark) { return (mark & ContinuedAlone) == Torn; }

    /// The start of a line that a check covers, in bytes.
    static constexpr int CheckedLength = 4096;

    /// A number that differs for different lines, except for one pair in 65,536. Valid in this
    /// process.
    ///
    /// @param line  without its line end
    static quint16 CheckOf(char const* line, int length)
    {
        return LineCheck(line, static_cast<size_t>(std::min(length, CheckedLength)));
    }

    LogRows() = default;

    /// No rows yet.
    ///
    /// @param newestEnd  the line that follows those of the newest run
    /// @param complete  a line that starts here or later has no line end yet
    /// @param end  where the file ended
    explicit LogRows(LineTable lines, size_t newestEnd = 0, qint64 complete = 0, qint64 end = 0)
        : m_lines(std::move(lines)), m_newestEnd(newestEnd), m_complete(complete), m_end(end)
    {}

    size_t size() const { return m_size; }
    qint64 start(size_t row) const; ///< to read many of them, use a Reader
    quint8 mark(size_t row) const;
    quint16 check(size_t row) const; ///< see CheckOf(); 0 for headings
    LogEntry::Severity severity(size_t row) const
    {
        return static_cast<LogEntry::Severity>(mark(row) & SeverityMask);
    }

    bool isHeading(size_t row) const { return partOf(row).isHeading(); }
    bool isContext(size_t row) const { return isContextOf(partOf(row), row); }

    /// The position in lines(); meaningless for a heading.
    size_t line(size_t row) const { return lineOf(partOf(row), row); }

    LineTable const& lines() const { return m_lines; }
    size_t newestEnd() const { return m_newestEnd; }
    qint64 complete() const { return m_complete; }
    qint64 end() const { return m_end; }

    /// The number of rows of earlier runs, including their heading; 0 if there are none.
    size_t earlier() const { return m_earlier; }

    /// The number of headings.
    size_t headings() const { return m_headings; }

    /// The number of entries that are warnings or worse.
    size_t problems() const { return m_problems; }

    /// The row whose line starts there or, if there is none, as near to it as possible; -1 without
    /// lines.
    int RowNear(qint64 start) const;

    /// The row of the first line, of those that are listed for the newest run, that is not before
    /// this one; size() if there is none. There must be no other rows.
    size_t RowOfLine(size_t line) const
    {
        return m_parts.empty() ? 0 : rowOfLine(m_parts.back(), line);
    }

    /// How many rows of the newest run, from its first one, are known to be the same in other rows.
    /// There may be more. Takes the same time however many there are.
    size_t CountSame(LogRows const& other) const;

    /// How many rows, from the first one of all, are known to be the same in other rows. There may
    /// be more. Takes the same time however many there are.
    size_t CountSameFirst(LogRows const& other) const;

    void AddHeading(qint64 start);

    /// Adds rows for the lines from `first` to the one before `end`.
    void AddLines(size_t first, size_t end);

    /// The same, if it is known how many problems are among them.
    void AddLines(size_t first, size_t end, size_t problems);

    /// Adds a row for one line, which must be among the first 2^31.
    void AddLine(size_t line, bool isContext);

    /// The same for lines of several logs by time, in any order. Such rows are all of the newest
    /// run, and there must be no others.
    void AddMergedLine(size_t line, bool isContext);

    /// Adds the rows of one run of another file, without its heading.
    ///
    /// @param rows  of a table whose lines are in this one, too
    /// @param first  the first of the rows to add
    /// @param end  the row after the last one
    /// @param offset  the line here that is the first one there
    void AddRows(LogRows const& rows, size_t first, size_t end, size_t offset);

    /// Tells that the rows so far are those of the earlier runs.
    void EndEarlier() { m_earlier = m_size; }

    /// Removes the rows of the newest run from this one on.
    void Truncate(size_t row);

    /// Replaces the lines. Those that have rows must be the same.
    void SetLines(LineTable const& lines, size_t newestEnd, qint64 complete, qint64 end);

    /// Reads the starts of many rows that are near each other, in any order.
    class Reader
    {
    public:
        /// @param rows  must exist, unchanged, as long as the reader
        explicit Reader(LogRows const& rows) : m_rows(&rows), m_lines(rows.m_lines) {}

        /// As LogRows::start().
        qint64 start(size_t row)
        {
            Part const& part = m_rows->partOf(row);
            return part.isHeading() ? part.heading() : m_lines.start(m_rows->lineOf(part, row));
        }

    private:
        LogRows const* m_rows;
        LineTable::Reader m_lines;
    };

private:
    // Rows that are next to each other: a heading, lines in the order of the file without a gap,
    // such lines with gaps, which are listed, or a list of lines in any order.
    struct Part
    {
        enum Kind { Heading, Lines, Listed, Merged };

        Kind kind;
        size_t firstRow;
        size_t first; // line, or position in the list; of a heading, its negated start

        bool isHeading() const { return kind == Heading; }
        bool isList() const { return kind == Listed || kind == Merged; }
        qint64 heading() const { return -static_cast<qint64>(first); }
    };

    Part const& partOf(size_t row) const
    {
        size_t number = m_parts.size() - 1;
        while (m_parts[number].firstRow > row)
            --number;
        return m_parts[number];
    }

    // In the list, besides the number of the line.
    static constexpr quint32 IsContext = 0x80000000;

    size_t lineOf(Part const& part, size_t row) const
    {
        const size_t position = part.first + row - part.firstRow;
        return part.isList() ? m_numbers.at(position) & ~IsContext : position;
    }

    bool isContextOf(Part const& part, size_t row) const
    {
        return part.isList() && (m_numbers.at(part.first + row - part.firstRow) & IsContext);
    }

    size_t endOf(Part const& part) const;
    size_t endOfSame(Part const& part, size_t sameLines, size_t sameNumbers) const;
    size_t rowOfLine(Part const& part, size_t line) const;
    int mergedRowNear(qint64 start) const;
    bool isProblem(size_t row) const;

    LineTable m_lines;
    LineNumbers m_numbers;
    std::vector<Part> m_parts; // without empty ones
    size_t m_size = 0;
    size_t m_earlier = 0;
    size_t m_headings = 0;
    size_t m_problems = 0;
    size_t m_newestEnd = 0;
    qint64 m_complete = 0;
    qint64 m_end = 0;
};

} // namespace Velocor
