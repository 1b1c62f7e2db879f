// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogIndex.h"

#include "app/logfile/LogSeverities.h"
#include "app/logfile/Milliseconds.h"

#include <algorithm>
#include <cstring>
#include <limits>

namespace Velocor {

namespace {

constexpr size_t MaximumRuns = 64;

// Up to this many lines without a time are read again in every pass; beyond that they are final.
constexpr size_t MaximumReread = 1000;

// Concurrent threads may write their entries in a different order than they stamped them.
constexpr qint64 Tolerance = 20; // milliseconds

constexpr qint64 HalfADay = 12 * Milliseconds::Hour;

// The most that the end of daylight saving time sets a clock back; and a minute, because stamps may
// be given in minutes.
constexpr qint64 ClockChange = 61 * Milliseconds::Minute;

// The flags of a mark that the text filter sets.
constexpr quint8 OfText = LogRows::Unmatched | LogRows::Hidden;

LogEntry::Severity SeverityOf(quint8 mark)
{
    return static_cast<LogEntry::Severity>(mark & LogRows::SeverityMask);
}

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

LogIndex::LogIndex(LogLineParser const& parser, LogFilter const& filter, bool isOneRun)
    : m_parser(parser), m_filter(filter), m_lineEnd(parser.fileType().lineEnd()),
      m_isOneRun(isOneRun || parser.fileType().isForeign)
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
    m_checks.resize(line);
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

qint64 LogIndex::completeOffset() const
{
    return m_lastIsComplete || m_starts.empty() ? m_position : m_starts.back();
}

qint64 LogIndex::Begin()
{
    const bool hasSeam = m_runs.size() > 1;
    m_formerEnd = m_position;
    m_knownEnd = completeOffset();
    m_knownSeam = hasSeam ? m_starts[m_runs[1].firstLine] : -1;
    m_isSeamUnchanged = false;
    m_hasMoved = false;
    // What follows a run that was read to its end was added to it, however old it looks. Without a
    // time, the run that was read may not be the one that goes on.
    if (m_isOneRun || (m_newestIsTimed && !hasSeam))
        m_seamLimit = 0;
    else
        m_seamLimit = hasSeam ? m_knownEnd : std::numeric_limits<qint64>::max();

    m_position = resumeOffset();
    const size_t resume = resumeLine();
    keepKnownLines();
    forgetFrom(resume);

    m_lineStart = m_position;
    m_partialLine.clear();
    m_lineIsPartial = false;
    m_lastIsComplete = true;
    return m_position;
}

// Sets the lines after the seam aside, but for an incomplete last one.
void LogIndex::keepKnownLines()
{
    m_knownRuns.clear();
    m_knownStarts.clear();
    m_knownMarks.clear();
    m_knownChecks.clear();
    if (m_runs.size() < 2)
        return;

    const size_t seam = m_runs[1].firstLine;
    m_knownRuns.assign(m_runs.begin() + 1, m_runs.end());
    for (Run& run : m_knownRuns)
        run.firstLine -= seam;
    MoveTail(m_starts, seam, m_knownStarts);
    MoveTail(m_marks, seam, m_knownMarks);
    MoveTail(m_checks, seam, m_knownChecks);
    if (!m_lastIsComplete) {
        m_knownStarts.pop_back();
        m_knownMarks.pop_back();
        m_knownChecks.pop_back();
    }
    while (m_knownRuns.size() > 1 && m_knownRuns.back().firstLine >= m_knownStarts.size())
        m_knownRuns.pop_back();
}

bool LogIndex::Feed(char const* bytes, int count)
{
    char const* at = bytes;
    char const* const end = bytes + count;
    while (at != end) {
        const char before = m_lineIsPartial && at == bytes ? m_lastByte : '\0';
        char const* const lineEnd = m_lineEnd.Find(at, end, m_position + (at - bytes), before);
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
        if (m_lineIsPartial)
            m_partialLine.clear();
        m_lineIsPartial = false;
    }
    m_lastByte = count > 0 ? end[-1] : m_lastByte;
    m_position += count;
    return true;
}

void LogIndex::End()
{
    m_knownRuns.clear();
    m_knownStarts.clear();
    m_knownMarks.clear();
    m_knownChecks.clear();
    if (m_lineIsPartial)
        addLine(m_partialLine.constData(), m_partialLine.size(), false);
    m_hasLostSeam = m_knownSeam >= 0 && m_runs.size() == 1 && !m_isOneRun;
}

// What the text filter says of a line: flags of its mark.
quint8 LogIndex::textMarkOf(char const* line, int length)
{
    if (!m_filter.hasText() || m_slowLine > 0)
        return 0;
    const LogFilter::Match match =
        m_filter.Find(m_parser.fileType().encoding.narrowed().Decode(line, length));
    if (match == LogFilter::TooLong)
        m_slowLine = m_starts.size() + 1;
    if (match == LogFilter::Hidden)
        return LogRows::Unmatched | LogRows::Hidden;
    return match == LogFilter::Yes ? 0 : LogRows::Unmatched;
}

quint8 LogIndex::markOf(LogLineParser::Parts const& parts, char const* line, int length)
{
    quint8 mark = LogEntry::None;
    if (parts.isEntry)
        mark = static_cast<quint8>(parts.severity);
    else if (m_starts.size() > m_runs.back().firstLine)
        mark = (m_marks.back() & LogRows::SeverityMask) | LogRows::Continued;
    if (parts.timeKey >= 0)
        mark |= LogRows::Timed;
    return mark | textMarkOf(line, length);
}

// Returns false if the lines up to the new position are known.
bool LogIndex::addLine(char const* line, int length, bool complete)
{
    const qint64 end = m_lineStart + length + 1;
    if (complete)
        length = std::max(0, length + 1 - m_lineEnd.size());
    LogEncoding const& encoding = m_parser.fileType().encoding;
    length = encoding.WithoutReturn(line, length);
    const quint16 check = LogRows::CheckOf(line, length);
    QByteArray narrow;
    encoding.Narrow(line, length, narrow);
    const LogLineParser::Parts parts =
        m_parser.Find(line, std::min(length, PartsLimit), m_beginnings);
    m_hasElapsed = m_hasElapsed || parts.elapsedLength > 0;
    m_hasTimes = m_hasTimes || parts.timeLength > 0;
    m_hasSeverities = m_hasSeverities || parts.severity != LogEntry::None;
    m_lastIsComplete = complete;

    if (isSeam(parts, end)) {
        beginRun(parts);
        if (joinKnownLines(m_lineStart))
            return false;
    }
    if (m_isSeamUnchanged && m_lineStart >= m_formerEnd)
        joinRuns();
    m_marks.push_back(markOf(parts, line, std::min(length, LineLimit)));
    m_checks.push_back(check);
    m_starts.push_back(m_lineStart);
    if (parts.timeKey >= 0 && complete) // an incomplete line is read again
        noteTime(parts);
    return true;
}

bool LogIndex::isSeam(LogLineParser::Parts const& parts, qint64 end) const
{
    if (parts.timeKey < 0 || !m_runHasTimed || m_runs.size() >= MaximumRuns ||
        m_lineStart >= m_seamLimit)
        return false;
    Run const& run = m_runs.back();
    const bool changesFormat = parts.hasDate != run.hasDate && run.timedLines > 1;
    const bool isEarlier = parts.hasDate == run.hasDate && isOlder(parts);
    if (!m_knownStarts.empty())
        return (changesFormat || isEarlier) && isKnown(parts, end);

    const bool followsRest = m_starts.size() > m_lastTimed + 1;
    // A run logs its settings in the default format, with a date, before it switches to another.
    return (changesFormat && (followsRest || parts.hasDate)) ||
           (isEarlier && (followsRest || parts.timeKey + ClockChange < m_lastTime));
}

bool LogIndex::isOlder(LogLineParser::Parts const& parts) const
{
    Run const& run = m_runs.back();
    if (parts.timeKey + Tolerance + parts.resolution > std::min(run.firstTime, m_lastTime))
        return false;
    const bool isNextDay = !run.hasDate && m_lastTime - parts.timeKey > HalfADay;
    return !isNextDay;
}

// Whether the current line, which ends at `end`, is one of those that followed the seam. The rest
// of a torn entry is not: where it was, the newest run writes next.
bool LogIndex::isKnown(LogLineParser::Parts const& parts, qint64 end) const
{
    const auto found = std::lower_bound(m_knownStarts.begin(), m_knownStarts.end(), m_lineStart);
    if (found == m_knownStarts.end() || *found != m_lineStart)
        return false;
    const quint8 mark = m_knownMarks[static_cast<size_t>(found - m_knownStarts.begin())];
    const bool isLast = found + 1 == m_knownStarts.end();
    return !(mark & LogRows::Torn) && (mark & LogRows::Timed) &&
           (mark & LogRows::SeverityMask) == static_cast<quint8>(parts.severity) &&
           end == (isLast ? m_knownEnd : found[1]);
}

// The log writes at the end of the file, so whatever looked like a seam was none.
void LogIndex::joinRuns()
{
    for (size_t number = 1; number < m_runs.size(); ++number) {
        const size_t first = m_runs[number].firstLine;
        if (m_marks[first] & LogRows::Torn)
            m_marks[first] = (m_marks[first - 1] & LogRows::SeverityMask) | LogRows::Continued |
                             (m_marks[first] & OfText);
    }
    m_runs.resize(1);
    m_isSeamUnchanged = false;
    m_isOneRun = true;
    m_hasMoved = true;
    m_runHasTimed = true;
    m_newestLastTimed = m_marks.size() - 1;
    while (!(m_marks[m_newestLastTimed] & LogRows::Timed))
        --m_newestLastTimed; // the first line of each run but the newest follows a timed one
    m_lastTimed = m_newestLastTimed;
}

// The last line without a time before an older entry is the rest of a torn entry.
void LogIndex::beginRun(LogLineParser::Parts const& parts)
{
    Run run;
    run.firstLine = m_starts.size();
    run.hasDate = parts.hasDate;
    if (run.firstLine > m_lastTimed + 1) {
        --run.firstLine;
        const quint8 ofText = m_marks.back() & OfText;
        m_marks.back() = LogEntry::None | LogRows::Torn | ofText;
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

    const qint64 seam =
        m_runs[1].firstLine < m_starts.size() ? m_starts[m_runs[1].firstLine] : start;
    m_isSeamUnchanged = seam == m_knownSeam;
    m_hasMoved = !m_isSeamUnchanged;
    const auto first = static_cast<size_t>(found - m_knownStarts.begin());
    const size_t joint = m_starts.size();
    AppendTail(m_starts, m_knownStarts, first);
    AppendTail(m_marks, m_knownMarks, first);
    AppendTail(m_checks, m_knownChecks, first);
    for (Run known : m_knownRuns) {
        if (known.firstLine <= first) {
            m_runs[1].firstTime = known.firstTime;
            m_runs[1].hasDate = known.hasDate;
            continue;
        }
        known.firstLine += joint - first;
        m_runs.push_back(known);
    }
    m_runHasTimed = true;
    m_lastTimed = m_starts.size() - 1;
    m_lineIsPartial = false;
    m_partialLine.clear();
    m_seamLimit = 0;
    m_position = m_knownEnd;
    m_lineStart = m_knownEnd;
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

// Whether a line from the first one of an entry on matches the text, and none has a term that
// hides.
bool LogIndex::isEntryMatched(size_t first, size_t end) const
{
    bool isMatched = m_slowLine > 0;
    for (size_t line = first; line < end && m_slowLine == 0; ++line) {
        if (line > first && !(m_marks[line] & LogRows::Continued))
            break;
        if (m_marks[line] & LogRows::Hidden)
            return false;
        isMatched = isMatched || !(m_marks[line] & LogRows::Unmatched);
    }
    return isMatched;
}

void LogIndex::addRow(size_t line, int flags, LogRows& rows) const
{
    const auto mark = static_cast<quint8>((m_marks[line] & ~OfText) | flags);
    rows.add(m_starts[line], mark, m_checks[line]);
    if (LogSeverities::IsProblem(SeverityOf(mark)) && !(mark & LogRows::Continued))
        ++rows.problems;
}

void LogIndex::addRun(size_t number, LogFilter const& filter, LogRows& rows) const
{
    const bool isLast = number + 1 == m_runs.size();
    const size_t end = isLast ? m_starts.size() : m_runs[number + 1].firstLine;
    const auto context = static_cast<size_t>(filter.context());
    size_t entryEnd = 0; // at most
    bool isMatched = false;
    size_t next = m_runs[number].firstLine; // the first line not added yet
    size_t contextEnd = next;               // up to here, lines follow a hit
    for (size_t line = next; line < end; ++line) {
        const quint8 mark = m_marks[line];
        const bool isContinued = mark & LogRows::Continued;
        const bool isAlone = isContinued && line >= entryEnd;
        if (!isContinued)
            entryEnd = LogRows::BeginsEntry(mark) ? line + MaximumEntryLines : line + 1;
        if (!isContinued || isAlone)
            isMatched = isEntryMatched(line, isAlone ? line + 1 : std::min(entryEnd, end));
        if (isMatched && filter.Shows(SeverityOf(mark))) {
            for (next = std::max(next, line - std::min(line, context)); next < line; ++next)
                addRow(next, LogRows::Context | LogRows::Alone, rows);
            addRow(line, isAlone ? LogRows::Alone : 0, rows);
            contextEnd = line + context + 1;
        } else if (line < contextEnd) {
            addRow(line, LogRows::Context | LogRows::Alone, rows);
        } else {
            continue;
        }
        next = line + 1;
    }
}

LogRows LogIndex::Rows(LogFilter const& filter) const
{
    LogRows rows;
    rows.starts.reserve(m_starts.size() + 2);
    rows.marks.reserve(m_starts.size() + 2);
    rows.checks.reserve(m_starts.size() + 2);
    if (filter.earlierRuns() && m_runs.size() > 1) {
        rows.add(LogRows::EarlierHeading, LogEntry::None);
        for (size_t number = m_runs.size() - 1; number > 0; --number)
            addRun(number, filter, rows);
        rows.earlier = rows.size() > 1 ? rows.size() : 0;
        if (rows.earlier == 0)
            rows = LogRows();
        else
            rows.add(LogRows::NewestHeading, LogEntry::None);
    }
    addRun(0, filter, rows);
    rows.complete = completeOffset();
    rows.end = m_position;
    return rows;
}

} // namespace Velocor
