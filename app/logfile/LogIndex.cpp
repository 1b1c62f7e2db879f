// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogIndex.h"

#include "app/logfile/LogSeverities.h"

#include <algorithm>
#include <cstring>

namespace Velocor {

namespace {

constexpr size_t MaximumRuns = 64;

// Up to this many lines without a time are read again in every pass; beyond that they are final.
constexpr size_t MaximumReread = 1000;

// Concurrent threads may write their entries in a different order than they stamped them.
constexpr qint64 Tolerance = 20; // milliseconds

constexpr qint64 HalfADay = qint64(12) * 60 * 60 * 1000; // milliseconds

template <class T>
void MoveTail(std::vector<T>& from, size_t first, std::vector<T>& to)
{
    to.assign(from.begin() + static_cast<std::ptrdiff_t>(first), from.end());
    from.resize(first);
}

template <class T>
void AppendTail(std::vector<T>& to, std::vector<T> const& from, size_t first)
{
    to.insert(to.end(), from.begin() + static_cast<std::ptrdiff_t>(first), from.end());
}

} // namespace

LogIndex::LogIndex(LogLineParser const& parser, LogFilter const& filter)
    : m_parser(parser), m_filter(filter)
{
    m_runs.emplace_back();
}

// The first line that the next pass reads again.
size_t LogIndex::resumeLine() const
{
    const size_t end = m_runs.size() > 1 ? m_runs[1].firstLine : m_starts.size();
    const size_t settled = m_lastIsComplete || m_runs.size() > 1 ? end : end - 1;
    if (!m_newestIsTimed)
        return settled;
    const size_t afterTimed = m_newestLastTimed + 1;
    if (m_runs.size() == 1 && end > afterTimed + MaximumReread)
        return settled;
    return std::min(afterTimed, settled);
}

void LogIndex::forgetFrom(size_t line)
{
    m_starts.resize(line);
    m_marks.resize(line);
    m_runs.resize(1);
    if (line == 0) {
        m_runs[0] = Run();
        m_newestIsTimed = false;
    }
    m_runHasTimed = m_newestIsTimed;
    m_lastTimed = m_newestLastTimed;
    m_lastTime = m_newestLastTime;
}

qint64 LogIndex::resumeOffset() const
{
    const size_t resume = resumeLine();
    return resume < m_starts.size() ? m_starts[resume] : m_position;
}

qint64 LogIndex::Begin()
{
    m_position = resumeOffset();
    const size_t resume = resumeLine();

    m_knownRuns.clear();
    m_knownStarts.clear();
    m_knownMarks.clear();
    if (m_runs.size() > 1) {
        const size_t seam = m_runs[1].firstLine;
        m_knownRuns.assign(m_runs.begin() + 1, m_runs.end());
        for (Run& run : m_knownRuns)
            run.firstLine -= seam;
        MoveTail(m_starts, seam, m_knownStarts);
        MoveTail(m_marks, seam, m_knownMarks);
    }
    forgetFrom(resume);

    m_lineStart = m_position;
    m_partialLine.clear();
    m_lineIsPartial = false;
    m_lastIsComplete = true;
    return m_position;
}

bool LogIndex::Feed(char const* bytes, int count)
{
    char const* at = bytes;
    char const* const end = bytes + count;
    while (at != end) {
        const auto left = static_cast<size_t>(end - at);
        auto const* lineEnd = static_cast<char const*>(std::memchr(at, '\n', left));
        const int length = static_cast<int>((lineEnd ? lineEnd : end) - at);
        if (lineEnd && !m_lineIsPartial) {
            if (!addLine(at, length, true))
                return false;
        } else {
            m_partialLine.append(at, std::min(length, LineLimit - m_partialLine.size()));
            m_lineIsPartial = true;
            if (lineEnd && !addLine(m_partialLine.constData(), m_partialLine.size(), true))
                return false;
        }
        if (!lineEnd)
            break;
        at = lineEnd + 1;
        m_lineStart = m_position + (at - bytes);
        m_partialLine.clear();
        m_lineIsPartial = false;
    }
    m_position += count;
    return true;
}

void LogIndex::End()
{
    if (m_lineIsPartial)
        addLine(m_partialLine.constData(), m_partialLine.size(), false);
    m_knownRuns.clear();
    m_knownStarts.clear();
    m_knownMarks.clear();
}

quint8 LogIndex::markOf(LogLineParser::Parts const& parts, char const* line, int length) const
{
    quint8 mark = LogEntry::None;
    if (parts.isEntry)
        mark = static_cast<quint8>(parts.severity);
    else if (m_starts.size() > m_runs.back().firstLine)
        mark = (m_marks.back() & LogRows::SeverityMask) | LogRows::Continued;
    if (parts.timeKey >= 0)
        mark |= LogRows::Timed;
    if (m_filter.hasText() && !m_filter.Matches(QString::fromLatin1(line, length)))
        mark |= LogRows::Unmatched;
    return mark;
}

// Returns false if the rest of the file is known.
bool LogIndex::addLine(char const* line, int length, bool complete)
{
    if (length > 0 && line[length - 1] == '\r')
        --length;
    const LogLineParser::Parts parts = m_parser.Find(line, std::min(length, LineLimit));
    m_hasElapsed = m_hasElapsed || parts.elapsedLength > 0;
    m_lastIsComplete = complete;

    if (isOlder(parts)) {
        beginRun(parts);
        if (joinKnownLines(m_lineStart))
            return false;
    }
    m_marks.push_back(markOf(parts, line, std::min(length, LineLimit)));
    m_starts.push_back(m_lineStart);
    if (parts.timeKey >= 0 && complete) // an incomplete line is read again
        noteTime(parts);
    return true;
}

bool LogIndex::isOlder(LogLineParser::Parts const& parts) const
{
    if (parts.timeKey < 0 || !m_runHasTimed || m_runs.size() >= MaximumRuns)
        return false;
    Run const& run = m_runs.back();
    // A run logs its settings in the default format before it switches to another.
    if (parts.hasDate != run.hasDate)
        return run.timedLines > 1;
    if (parts.timeKey + Tolerance >= run.firstTime || parts.timeKey >= m_lastTime)
        return false;
    const bool isNextDay = !run.hasDate && m_lastTime - parts.timeKey > HalfADay;
    return !isNextDay;
}

// The last line without a time before an older entry is the rest of a torn entry.
void LogIndex::beginRun(LogLineParser::Parts const& parts)
{
    Run run;
    run.firstLine = m_starts.size();
    run.hasDate = parts.hasDate;
    if (run.firstLine > m_lastTimed + 1) {
        --run.firstLine;
        const quint8 unmatched = m_marks.back() & LogRows::Unmatched;
        m_marks.back() = LogEntry::None | LogRows::Torn | unmatched;
    }
    m_runs.push_back(run);
    m_runHasTimed = false;
}

// Reuses the lines from the older entry at `start` on, if they are known.
bool LogIndex::joinKnownLines(qint64 start)
{
    const auto found = std::lower_bound(m_knownStarts.begin(), m_knownStarts.end(), start);
    if (found == m_knownStarts.end() || *found != start || m_runs.size() != 2)
        return false;

    const auto first = static_cast<size_t>(found - m_knownStarts.begin());
    if (!(m_knownMarks[first] & LogRows::Timed))
        return false; // the rest of an entry was there: this one is new, by a clock set back
    const size_t joint = m_starts.size();
    AppendTail(m_starts, m_knownStarts, first);
    AppendTail(m_marks, m_knownMarks, first);
    for (Run known : m_knownRuns) {
        if (known.firstLine <= first) {
            m_runs[1].firstTime = known.firstTime;
            m_runs[1].hasDate = known.hasDate;
            continue;
        }
        known.firstLine += joint - first;
        m_runs.push_back(known);
    }
    m_lineIsPartial = false;
    return true;
}

void LogIndex::noteTime(LogLineParser::Parts const& parts)
{
    Run& run = m_runs.back();
    if (!m_runHasTimed || parts.hasDate != run.hasDate) {
        run.firstTime = parts.timeKey;
        run.hasDate = parts.hasDate;
    }
    ++run.timedLines;
    m_runHasTimed = true;
    m_lastTimed = m_starts.size() - 1;
    m_lastTime = parts.timeKey;
    if (m_runs.size() == 1) {
        m_newestIsTimed = true;
        m_newestLastTimed = m_lastTimed;
        m_newestLastTime = m_lastTime;
    }
}

LogRows LogIndex::Rows(LogFilter const& filter) const
{
    LogRows rows;
    rows.starts.reserve(m_starts.size() + 2);
    rows.marks.reserve(m_starts.size() + 2);
    const auto addRun = [&](size_t number) {
        const bool isLast = number + 1 == m_runs.size();
        const size_t end = isLast ? m_starts.size() : m_runs[number + 1].firstLine;
        for (size_t line = m_runs[number].firstLine; line < end; ++line) {
            const quint8 mark = m_marks[line];
            const auto severity = static_cast<LogEntry::Severity>(mark & LogRows::SeverityMask);
            if ((mark & LogRows::Unmatched) || !filter.Shows(severity))
                continue;
            rows.add(m_starts[line], mark);
            if (LogSeverities::IsProblem(severity) && !(mark & LogRows::Continued))
                ++rows.problems;
        }
    };

    if (filter.earlierRuns() && m_runs.size() > 1) {
        rows.add(LogRows::EarlierHeading, LogEntry::None);
        for (size_t number = m_runs.size() - 1; number > 0; --number)
            addRun(number);
        rows.earlier = rows.size() > 1 ? rows.size() : 0;
        if (rows.earlier == 0)
            rows = LogRows();
        else
            rows.add(LogRows::NewestHeading, LogEntry::None);
    }
    addRun(0);
    return rows;
}

} // namespace Velocor
