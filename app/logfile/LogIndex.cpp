// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogIndex.h"

#include "app/logfile/LogSeverities.h"
#include "app/logfile/Milliseconds.h"

#include <algorithm>
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

LogEntry::Severity SeverityOf(quint8 mark)
{
    return static_cast<LogEntry::Severity>(mark & LogRows::SeverityMask);
}

bool ShowsAll(LogFilter const& filter)
{
    bool showsAll = !filter.hasText();
    for (int severity = LogEntry::Trace; severity <= LogEntry::None; ++severity)
        showsAll = showsAll && filter.Shows(static_cast<LogEntry::Severity>(severity));
    return showsAll;
}

} // namespace

LogIndex::LogIndex(LogLineParser const& parser, LogFilter const& filter, bool isOneRun)
    : m_parser(parser), m_filter(filter), m_search(filter, parser.fileType().encoding.narrowed()),
      m_lineEnd(parser.fileType().lineEnd()), m_isOneRun(isOneRun || parser.fileType().isForeign)
{
    m_runs.emplace_back();
}

// The first line that the next pass reads again.
size_t LogIndex::resumeLine() const
{
    const size_t end = m_runs.size() > 1 ? m_runs[1].firstLine : m_lines.size();
    const size_t settled = m_lastIsComplete || m_runs.size() > 1 ? end : end - 1;
    if (!m_newestIsTimed)
        return settled;
    const size_t afterTimed = m_newestLastTimed + 1;
    if (m_runs.size() == 1 && end > afterTimed + MaximumReread)
        return settled;
    return std::min(afterTimed, settled);
}

void LogIndex::count(quint8 mark, int step)
{
    if (!(mark & LogRows::Continued))
        m_counts[SeverityOf(mark)] += static_cast<size_t>(step);
}

void LogIndex::setMark(size_t line, quint8 mark)
{
    count(m_lines.mark(line), -1);
    m_lines.SetMark(line, mark);
    count(mark, 1);
}

void LogIndex::forgetFrom(size_t line)
{
    for (size_t forgotten = line; forgotten < m_lines.size(); ++forgotten)
        count(m_lines.mark(forgotten), -1);
    m_lines.Truncate(line);
    m_matches.resize(std::min(line, m_matches.size()));
    m_entryEnd = entryEndBefore(line);
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
    return resume < m_lines.size() ? m_lines.start(resume) : m_position;
}

qint64 LogIndex::completeOffset() const
{
    return m_lastIsComplete || m_lines.isEmpty() ? m_position : m_lines.start(m_lines.size() - 1);
}

qint64 LogIndex::Begin()
{
    const bool hasSeam = m_runs.size() > 1;
    m_searched = AllLines;
    m_formerEnd = m_position;
    m_knownEnd = completeOffset();
    m_knownSeam = hasSeam ? m_lines.start(m_runs[1].firstLine) : -1;
    m_hasLostRun = false;
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
    forgetKnownLines();
    if (m_runs.size() < 2)
        return;

    m_knownFirst = m_runs[1].firstLine;
    m_knownRuns.assign(m_runs.begin() + 1, m_runs.end());
    m_known = m_lines;
    m_knownMatches = m_matches;
    if (!m_lastIsComplete)
        m_known.Truncate(m_known.size() - 1);
    m_knownMatches.resize(std::min(m_knownMatches.size(), m_known.size()));
    while (m_knownRuns.size() > 1 && m_knownRuns.back().firstLine >= m_known.size()) {
        m_knownRuns.pop_back(); // all of it is the incomplete line
        m_hasLostRun = true;
    }
}

void LogIndex::forgetKnownLines()
{
    m_knownRuns.clear();
    m_known = LineTable();
    m_knownFirst = 0;
}

// The known line that starts there; if there is none, their end.
size_t LogIndex::knownLineAt(qint64 start) const
{
    if (!hasKnownLines())
        return m_known.size();
    const size_t line = m_known.LineAt(start);
    return line >= m_knownFirst && m_known.start(line) == start ? line : m_known.size();
}

bool LogIndex::Feed(char const* bytes, int count)
{
    if (m_position == 0)
        m_search.Learn(bytes, count);
    m_candidate = -1;
    char const* at = bytes;
    char const* const end = bytes + count;
    while (at != end) {
        const char before = m_lineIsPartial && at == bytes ? m_lastByte : '\0';
        char const* const lineEnd = m_lineEnd.Find(at, end, m_position + (at - bytes), before);
        const int length = static_cast<int>((lineEnd ? lineEnd : end) - at);
        if (lineEnd && !m_lineIsPartial) {
            findCandidate(at, end);
            if (!addLine(at, length, true))
                return false;
        } else {
            m_partialLine.append(at, std::min<int>(length, LineLimit - m_partialLine.size()));
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

// Candidates are looked for in all bytes rather than in each line, for the goal "filter by
// expression in a terminal" in docs/performance.md; compared in tst_PlainSearch. A line in UTF-16
// is narrowed before it is searched.
//
// @param at  where a line starts
void LogIndex::findCandidate(char const* at, char const* end)
{
    if (!m_filter.hasText() || m_candidate >= m_lineStart)
        return;
    const bool isWide = m_parser.fileType().encoding.isWide();
    m_candidate = m_lineStart + (isWide ? 0 : m_search.Find(at, end) - at);
}

void LogIndex::End()
{
    forgetKnownLines();
    m_candidate = -1;
    if (m_lineIsPartial)
        addLine(m_partialLine.constData(), m_partialLine.size(), false);
    const bool hasLostAll = m_knownSeam >= 0 && m_runs.size() == 1;
    m_hasLostSeam = (hasLostAll || m_hasLostRun) && !m_isOneRun;
}

// Whether the line with this index matches the text filter.
LogFilter::Match LogIndex::matchOf(char const* line, int length, size_t index)
{
    if (m_slowLine > 0)
        return LogFilter::Yes;
    length = std::min(length, LineLimit);
    const std::optional<LogFilter::Match> known = m_search.Answer(line, length);
    if (known)
        return *known;
    const LogFilter::Match match =
        m_filter.Find(m_parser.fileType().encoding.narrowed().Decode(line, length));
    if (match == LogFilter::TooLong)
        m_slowLine = index + 1;
    return match;
}

quint8 LogIndex::markOf(LogLineParser::Parts const& parts)
{
    quint8 mark = LogEntry::None;
    const size_t number = m_lines.size();
    if (parts.isEntry) {
        mark = static_cast<quint8>(parts.severity);
    } else if (number > m_runs.back().firstLine) {
        mark = m_lines.mark(number - 1) & LogRows::SeverityMask;
        mark |= number < m_entryEnd ? LogRows::Continued : LogRows::ContinuedAlone;
    }
    if (parts.timeKey >= 0)
        mark |= LogRows::Timed;
    if (!(mark & LogRows::Continued))
        m_entryEnd = number + (LogRows::BeginsEntry(mark) ? MaximumEntryLines : 1);
    return mark;
}

// The length of a line without its line end.
//
// @param length  without the last byte of the line end
int LogIndex::contentLength(char const* line, int length, bool complete) const
{
    if (complete)
        length = std::max(0, length + 1 - m_lineEnd.size());
    return m_parser.fileType().encoding.WithoutReturn(line, length);
}

// Returns false if the lines up to the new position are known.
bool LogIndex::addLine(char const* line, int length, bool complete)
{
    const qint64 end = m_lineStart + length + 1;
    LogEncoding const& encoding = m_parser.fileType().encoding;
    length = contentLength(line, length, complete);
    const quint16 check = LogRows::CheckOf(line, length);
    QByteArray narrow;
    encoding.Narrow(line, length, narrow);
    const LogLineParser::Parts parts =
        m_parser.Find(line, std::min(length, PartsLimit), m_beginnings);
    if (parts.elapsedLength > 0)
        m_hasElapsed = true;
    if (parts.timeLength > 0)
        m_hasTimes = true;
    if (parts.severity != LogEntry::None)
        m_hasSeverities = true;
    m_lastIsComplete = complete;

    if (isSeam(parts, end)) {
        beginRun(parts);
        if (joinKnownLines(m_lineStart))
            return false;
    }
    if (m_isSeamUnchanged && m_lineStart >= m_formerEnd)
        joinRuns();
    if (m_filter.hasText()) {
        const bool isCandidate = m_candidate < end || m_slowLine > 0;
        m_matches.push_back(isCandidate ? matchOf(line, length, m_lines.size())
                                        : m_search.answer());
    }
    const quint8 mark = markOf(parts);
    m_lines.Append(m_lineStart, mark, check);
    count(mark, 1);
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
    if (!changesFormat && !isEarlier)
        return false;
    if (hasKnownLines())
        return isKnown(parts, end);

    const bool followsRest = m_lines.size() > m_lastTimed + 1;
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
    const size_t line = knownLineAt(m_lineStart);
    if (line == m_known.size())
        return false;
    const quint8 mark = m_known.mark(line);
    const bool isLast = line + 1 == m_known.size();
    return !LogRows::IsTorn(mark) && (mark & LogRows::Timed) &&
           (mark & LogRows::SeverityMask) == static_cast<quint8>(parts.severity) &&
           end == (isLast ? m_knownEnd : m_known.start(line + 1));
}

// The log writes at the end of the file, so whatever looked like a seam was none.
void LogIndex::joinRuns()
{
    for (size_t number = 1; number < m_runs.size(); ++number) {
        const size_t first = m_runs[number].firstLine;
        if (!LogRows::IsTorn(m_lines.mark(first)))
            continue;
        const bool isAlone = first >= entryEndBefore(first);
        setMark(first, (m_lines.mark(first - 1) & LogRows::SeverityMask) |
                           (isAlone ? LogRows::ContinuedAlone : LogRows::Continued));
    }
    m_runs.resize(1);
    m_isSeamUnchanged = false;
    m_isOneRun = true;
    m_hasMoved = true;
    m_runHasTimed = true;
    m_newestLastTimed = m_lines.size() - 1;
    while (!(m_lines.mark(m_newestLastTimed) & LogRows::Timed))
        --m_newestLastTimed; // the first line of each run but the newest follows a timed one
    m_lastTimed = m_newestLastTimed;
}

// The last line without a time before an older entry is the rest of a torn entry.
void LogIndex::beginRun(LogLineParser::Parts const& parts)
{
    Run run;
    run.firstLine = m_lines.size();
    run.hasDate = parts.hasDate;
    if (run.firstLine > m_lastTimed + 1) {
        --run.firstLine;
        setMark(run.firstLine, LogEntry::None | LogRows::Torn);
    }
    m_runs.push_back(run);
    m_runHasTimed = false;
}

// Reuses the lines from the older entry at `start` on, if they are known.
bool LogIndex::joinKnownLines(qint64 start)
{
    const size_t first = knownLineAt(start);
    if (first == m_known.size() || m_runs.size() != 2)
        return false;

    const size_t seamLine = m_runs[1].firstLine; // this one, or the rest of a torn entry above it
    const qint64 seam = seamLine == m_lines.size() ? start : m_lines.start(seamLine);
    m_isSeamUnchanged = seam == m_knownSeam;
    m_hasMoved = !m_isSeamUnchanged;
    const size_t joint = m_lines.size();
    LineTable::Reader known(m_known);
    for (size_t line = first; line < m_known.size(); ++line) {
        m_lines.Append(known.start(line), m_known.mark(line), m_known.check(line));
        count(m_known.mark(line), 1);
    }
    if (m_filter.hasText())
        m_matches.insert(m_matches.end(),
                         m_knownMatches.begin() + static_cast<std::ptrdiff_t>(first),
                         m_knownMatches.end());
    m_entryEnd = entryEndBefore(m_lines.size());
    for (Run run : m_knownRuns) {
        if (run.firstLine <= first) {
            m_runs[1].firstTime = run.firstTime;
            m_runs[1].hasDate = run.hasDate;
            continue;
        }
        run.firstLine += joint - first;
        m_runs.push_back(run);
    }
    m_runHasTimed = true;
    m_lastTimed = m_lines.size() - 1;
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
    m_lastTimed = m_lines.size() - 1;
    m_lastTime = parts.timeKey;
    if (m_runs.size() == 1) {
        m_newestIsTimed = true;
        m_newestLastTimed = m_lastTimed;
        m_newestLastTime = m_lastTime;
    }
}

qint64 LogIndex::endOf(size_t line) const
{
    return line + 1 < m_lines.size() ? m_lines.start(line + 1) : m_position;
}

void LogIndex::BeginSearch(LogFilter const& filter)
{
    m_filter = filter;
    m_search = CandidateSearch(filter, m_parser.fileType().encoding.narrowed());
    m_slowLine = 0;
    m_searched = filter.hasText() && !m_lines.isEmpty() ? 0 : AllLines;
    m_matches.assign(filter.hasText() ? m_lines.size() : 0, LogFilter::No);
    m_matches.shrink_to_fit();
}

qint64 LogIndex::searchOffset() const
{
    return m_searched < size() ? m_lines.start(m_searched) : m_position;
}

qint64 LogIndex::SearchEnd(qint64 size) const
{
    const qint64 start = searchOffset();
    if (m_position - start <= size)
        return m_position;
    const size_t line = m_lines.LineAt(start + size);
    return line > m_searched ? m_lines.start(line)
                             : std::min(endOf(line), start + LineLimit + m_lineEnd.size());
}

void LogIndex::Search(QByteArray const& lines, std::function<bool()> const& goesOn)
{
    if (m_searched == 0)
        m_search.Learn(lines.constData(), lines.size());
    LineTable::Reader starts(m_lines);
    const auto startOf = [&](size_t line) {
        return line < m_lines.size() ? starts.start(line) : m_position;
    };
    const bool isWide = m_parser.fileType().encoding.isWide();
    const qint64 offset = searchOffset();
    const qint64 end = offset + lines.size();
    for (qint64 start = offset; start < end; start = startOf(m_searched)) {
        char const* const rest = lines.constData() + (start - offset);
        // A line in UTF-16 is narrowed before it is searched.
        char const* const found = isWide ? rest : m_search.Find(rest, lines.constEnd());
        const bool isFound = found != lines.constEnd();
        const qint64 place = start + (found - rest) - (isFound ? 0 : 1);
        const bool isInFirst = place < startOf(m_searched + 1);
        const size_t next = (isInFirst ? m_searched : m_lines.LineAt(place)) + (isFound ? 0 : 1);
        for (; m_searched < next; ++m_searched)
            m_matches[m_searched] = m_search.answer();
        if (!isFound)
            break;
        const qint64 lineStart = startOf(m_searched);
        searchLine(lines.constData() + (lineStart - offset), startOf(m_searched + 1) - lineStart);
        if (m_slowLine > 0 || !goesOn())
            break;
    }
    if (m_searched >= m_lines.size() || m_slowLine > 0)
        m_searched = AllLines;
}

// Searches the next line.
//
// @param length  with the line end
void LogIndex::searchLine(char const* line, qint64 length)
{
    const bool complete = m_lastIsComplete || m_searched + 1 < m_lines.size();
    const qint64 limited = std::min<qint64>(length - (complete ? 1 : 0), LineLimit);
    int size = contentLength(line, static_cast<int>(limited), complete);
    QByteArray narrow;
    m_parser.fileType().encoding.Narrow(line, size, narrow);
    m_matches[m_searched] = matchOf(line, size, m_searched);
    ++m_searched;
}

// Whether a line from the first one of an entry on matches the text, and none has a term that
// hides.
bool LogIndex::isEntryMatched(size_t first, size_t end) const
{
    if (m_slowLine > 0 || m_matches.empty())
        return true;
    bool isMatched = false;
    for (size_t line = first; line < end; ++line) {
        const quint8 mark = m_lines.mark(line);
        if (line > first && (!(mark & LogRows::Continued) || LogRows::IsAlone(mark)))
            break;
        if (m_matches[line] == LogFilter::Hidden)
            return false;
        isMatched = isMatched || m_matches[line] == LogFilter::Yes;
    }
    return isMatched;
}

// Of a line that belongs to no entry, the line itself.
size_t LogIndex::firstLineOfEntry(size_t line) const
{
    while ((m_lines.mark(line) & LogRows::Continued) && !LogRows::IsAlone(m_lines.mark(line)))
        --line;
    return line;
}

// Up to where lines without a stamp would belong to the entry of the line before this one.
size_t LogIndex::entryEndBefore(size_t line) const
{
    if (line == 0)
        return 0;
    const size_t first = firstLineOfEntry(line - 1);
    return first + (LogRows::BeginsEntry(m_lines.mark(first)) ? MaximumEntryLines : 1);
}

std::vector<size_t> LogIndex::RunStarts() const
{
    std::vector<size_t> starts;
    for (Run const& run : m_runs)
        starts.push_back(run.firstLine);
    return starts;
}

size_t LogIndex::endOfRun(size_t number) const
{
    return number + 1 == m_runs.size() ? m_lines.size() : m_runs[number + 1].firstLine;
}

void LogIndex::addRest(Rest rest, LogFilter const& filter, LogRows& rows) const
{
    const auto context = static_cast<size_t>(filter.context());
    bool isMatched = false;
    for (size_t line = rest.from; line < rest.end; ++line) {
        const quint8 mark = m_lines.mark(line);
        const bool isAlone = LogRows::IsAlone(mark);
        if (!(mark & LogRows::Continued) || isAlone)
            isMatched = isEntryMatched(line, isAlone ? line + 1 : rest.end);
        if (isMatched && filter.Shows(SeverityOf(mark))) {
            rest.next = std::max(rest.next, line - std::min(line, context));
            for (; rest.next < line; ++rest.next)
                rows.AddLine(rest.next, true);
            rows.AddLine(line, false);
            rest.contextEnd = line + context + 1;
        } else if (line < rest.contextEnd) {
            rows.AddLine(line, true);
        } else {
            continue;
        }
        rest.next = line + 1;
    }
}

void LogIndex::addRun(size_t number, LogFilter const& filter, LogRows& rows) const
{
    const size_t first = m_runs[number].firstLine;
    const size_t end = endOfRun(number);
    if (!ShowsAll(filter))
        addRest({first, end, first, first}, filter, rows);
    else if (m_runs.size() == 1)
        rows.AddLines(first, end, countProblems());
    else
        rows.AddLines(first, end);
}

size_t LogIndex::countProblems() const
{
    size_t problems = 0;
    for (int severity = LogEntry::Trace; severity <= LogEntry::None; ++severity) {
        if (LogSeverities::IsProblem(static_cast<LogEntry::Severity>(severity)))
            problems += m_counts[static_cast<size_t>(severity)];
    }
    return problems;
}

LogRows LogIndex::Rows(LogFilter const& filter) const
{
    LogRows rows(m_lines, endOfRun(0), completeOffset(), m_position);
    if (filter.earlierRuns() && m_runs.size() > 1) {
        rows.AddHeading(LogRows::EarlierHeading);
        for (size_t number = m_runs.size() - 1; number > 0; --number)
            addRun(number, filter, rows);
        if (rows.size() > 1) {
            rows.EndEarlier();
            rows.AddHeading(LogRows::NewestHeading);
        } else {
            rows.Truncate(0);
        }
    }
    addRun(0, filter, rows);
    return rows;
}

// The fast path for following a large file, see docs/performance.md; tst_PlainLogRows compares it
// with the other one.
//
// Where the lines differ, an entry may begin earlier, and whether it matches depends on all of its
// lines. Lines before it may be the context of what follows; those that were are not taken over.
LogRows LogIndex::Rows(LogFilter const& filter, LogRows const& before) const
{
    if (m_runs.size() > 1 || before.earlier() > 0 || m_slowLine > 0 || ShowsAll(filter))
        return Rows(filter);

    Rest rest{0, m_lines.size(), 0, 0};
    rest.from = std::min(before.lines().CountSame(m_lines), before.newestEnd());
    if (rest.from > 0)
        rest.from = firstLineOfEntry(rest.from - 1);
    size_t kept = before.RowOfLine(rest.from);
    size_t hits = kept; // the rows up to the last one that is no context
    while (hits > 0 && (before.mark(hits - 1) & LogRows::Context))
        --hits;
    if (hits > 0)
        rest.contextEnd = before.line(hits - 1) + static_cast<size_t>(filter.context()) + 1;
    while (kept > hits && before.line(kept - 1) >= rest.contextEnd)
        --kept;
    if (kept > 0)
        rest.next = before.line(kept - 1) + 1;

    LogRows rows = before;
    rows.Truncate(kept);
    rows.SetLines(m_lines, m_lines.size(), completeOffset(), m_position);
    addRest(rest, filter, rows);
    return rows;
}

} // namespace Velocor
