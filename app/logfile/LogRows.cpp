// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogRows.h"

#include "app/logfile/LogSeverities.h"

#include <limits>

namespace Velocor {

namespace {

// The mark of a row by that of its line.
quint8 RowMark(quint8 lineMark)
{
    return LogRows::IsAlone(lineMark) ? (lineMark & ~LogRows::Torn) | LogRows::Alone : lineMark;
}

bool IsProblemMark(quint8 mark)
{
    return !(mark & LogRows::Continued) &&
           LogSeverities::IsProblem(static_cast<LogEntry::Severity>(mark & LogRows::SeverityMask));
}

} // namespace

qint64 LogRows::start(size_t row) const
{
    Part const& part = partOf(row);
    return part.isHeading() ? part.heading() : m_lines.start(lineOf(part, row));
}

quint8 LogRows::mark(size_t row) const
{
    Part const& part = partOf(row);
    if (part.isHeading())
        return LogEntry::None;
    const quint8 mark = RowMark(m_lines.mark(lineOf(part, row)));
    return isContextOf(part, row) ? mark | Context | Alone : mark;
}

quint16 LogRows::check(size_t row) const
{
    Part const& part = partOf(row);
    return part.isHeading() ? quint16(0) : m_lines.check(lineOf(part, row));
}

bool LogRows::isProblem(size_t row) const
{
    return IsProblemMark(mark(row));
}

void LogRows::AddHeading(qint64 start)
{
    m_parts.push_back({Part::Heading, m_size, static_cast<size_t>(-start)});
    ++m_size;
    ++m_headings;
}

void LogRows::AddLines(size_t first, size_t end)
{
    size_t problems = 0;
    for (size_t line = first; line < end; ++line)
        problems += IsProblemMark(m_lines.mark(line));
    AddLines(first, end, problems);
}

void LogRows::AddLines(size_t first, size_t end, size_t problems)
{
    if (first == end)
        return;
    m_parts.push_back({Part::Lines, m_size, first});
    m_size += end - first;
    m_problems += problems;
}

void LogRows::AddLine(size_t line, bool isContext)
{
    const bool isNext = !m_parts.empty() && m_parts.back().kind == Part::Listed &&
                        m_parts.back().firstRow >= m_earlier && this->line(m_size - 1) < line;
    if (!isNext)
        m_parts.push_back({Part::Listed, m_size, m_numbers.size()});
    m_numbers.Append(static_cast<quint32>(line) | (isContext ? IsContext : 0));
    m_problems += IsProblemMark(m_lines.mark(line));
    ++m_size;
}

void LogRows::AddMergedLine(size_t line, bool isContext)
{
    if (m_parts.empty())
        m_parts.push_back({Part::Merged, m_size, m_numbers.size()});
    m_numbers.Append(static_cast<quint32>(line) | (isContext ? IsContext : 0));
    m_problems += IsProblemMark(m_lines.mark(line));
    ++m_size;
}

void LogRows::AddRows(LogRows const& rows, size_t first, size_t end, size_t offset)
{
    if (first == end)
        return;
    Part const& part = rows.partOf(first);
    if (part.kind == Part::Lines) {
        const size_t line = rows.lineOf(part, first) + offset;
        const bool isAll = end - first == rows.size();
        if (isAll)
            AddLines(line, line + end - first, rows.problems());
        else
            AddLines(line, line + end - first);
        return;
    }
    for (size_t row = first; row < end; ++row)
        AddLine(rows.lineOf(part, row) + offset, rows.isContext(row));
}

void LogRows::Truncate(size_t row)
{
    for (size_t removed = row; removed < m_size; ++removed)
        m_problems -= isProblem(removed);
    while (!m_parts.empty() && m_parts.back().firstRow >= row) {
        if (m_parts.back().isList())
            m_numbers.Truncate(m_parts.back().first);
        m_headings -= m_parts.back().isHeading();
        m_parts.pop_back();
    }
    if (!m_parts.empty() && m_parts.back().isList())
        m_numbers.Truncate(m_parts.back().first + row - m_parts.back().firstRow);
    m_size = std::min(m_size, row);
}

void LogRows::SetLines(LineTable const& lines, size_t newestEnd, qint64 complete, qint64 end)
{
    m_lines = lines;
    m_newestEnd = newestEnd;
    m_complete = complete;
    m_end = end;
}

// The row after the last one of a part.
size_t LogRows::endOf(Part const& part) const
{
    const auto next = static_cast<size_t>(&part - m_parts.data()) + 1;
    return next < m_parts.size() ? m_parts[next].firstRow : m_size;
}

// The first row of a part whose line is not before this one; its end if there is none.
size_t LogRows::rowOfLine(Part const& part, size_t line) const
{
    size_t from = part.firstRow;
    size_t to = endOf(part);
    while (from < to) {
        const size_t middle = from + (to - from) / 2;
        if (lineOf(part, middle) < line)
            from = middle + 1;
        else
            to = middle;
    }
    return from;
}

// The rows are in no order that would help.
int LogRows::mergedRowNear(qint64 start) const
{
    const size_t line = m_lines.LineAt(start);
    int before = -1;
    int after = -1;
    size_t lineBefore = 0;
    size_t lineAfter = m_lines.size();
    for (size_t row = 0; row < m_size; ++row) {
        const size_t other = m_numbers.at(row) & ~IsContext;
        if (other <= line && (before < 0 || other > lineBefore)) {
            before = static_cast<int>(row);
            lineBefore = other;
        } else if (other > line && other < lineAfter) {
            after = static_cast<int>(row);
            lineAfter = other;
        }
    }
    if (before < 0 || after < 0)
        return std::max(before, after);
    const qint64 distanceBefore = qAbs(start - m_lines.start(lineBefore));
    return distanceBefore <= m_lines.start(lineAfter) - start ? before : after;
}

int LogRows::RowNear(qint64 start) const
{
    if (!m_parts.empty() && m_parts.back().kind == Part::Merged)
        return mergedRowNear(start);
    int nearest = -1;
    qint64 least = std::numeric_limits<qint64>::max();
    const auto compare = [&](size_t row) {
        const qint64 distance = qAbs(this->start(row) - start);
        if (distance >= least)
            return;
        least = distance;
        nearest = static_cast<int>(row);
    };
    for (Part const& part : m_parts) {
        if (part.isHeading())
            continue;
        const size_t after = rowOfLine(part, m_lines.LineAt(start) + 1);
        if (after > part.firstRow)
            compare(after - 1);
        if (after < endOf(part))
            compare(after);
    }
    return nearest;
}

size_t LogRows::CountSame(LogRows const& other) const
{
    if (m_parts.empty() || other.m_parts.empty())
        return 0;
    Part const& part = m_parts.back();
    Part const& otherPart = other.m_parts.back();
    const size_t headings = part.firstRow - m_earlier;
    const bool isSameKind = part.kind != Part::Merged && part.kind == otherPart.kind &&
                            part.first == otherPart.first &&
                            headings == otherPart.firstRow - other.m_earlier;
    if (!isSameKind || part.isHeading() || headings > 1)
        return 0;
    const size_t sameLines = m_lines.CountSame(other.m_lines);
    size_t same =
        std::min(endOf(part) - part.firstRow, other.endOf(otherPart) - otherPart.firstRow);
    if (part.kind == Part::Listed) {
        // What is before the parts in the lists does not matter, but it would have to be compared.
        if (part.first > 0)
            return 0;
        same = std::min(same, m_numbers.CountSame(other.m_numbers));
    }
    return headings + std::min(same, rowOfLine(part, sameLines) - part.firstRow);
}

// Where the rows of a part that are the same in other rows end, if they have the same part.
size_t LogRows::endOfSame(Part const& part, size_t sameLines, size_t sameNumbers) const
{
    if (part.isHeading())
        return endOf(part);
    if (part.kind == Part::Merged || (part.isList() && sameNumbers < part.first))
        return part.firstRow;
    const size_t end = rowOfLine(part, sameLines);
    return part.isList() ? std::min(end, part.firstRow + sameNumbers - part.first) : end;
}

// The fast path for following a log with large older files, see docs/performance.md;
// tst_PlainLogRows compares row by row.
size_t LogRows::CountSameFirst(LogRows const& other) const
{
    const size_t sameLines = m_lines.CountSame(other.m_lines);
    const size_t sameNumbers = m_numbers.CountSame(other.m_numbers);
    size_t same = 0;
    for (size_t i = 0; i < std::min(m_parts.size(), other.m_parts.size()); ++i) {
        Part const& part = m_parts[i];
        Part const& otherPart = other.m_parts[i];
        const bool isSamePlace = part.kind == otherPart.kind && part.first == otherPart.first &&
                                 part.firstRow == otherPart.firstRow;
        if (!isSamePlace)
            break;
        same = std::min(endOfSame(part, sameLines, sameNumbers), other.endOf(otherPart));
        if (same < endOf(part))
            break;
    }
    return same;
}

} // namespace Velocor
