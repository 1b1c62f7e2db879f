// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/RowsInSpan.h"

#include "app/history/HistoryClock.h"
#include "app/logfile/LogIndex.h"

#include <algorithm>

namespace Velocor {

namespace {

constexpr size_t LinesBetweenQuestions = 4096;

} // namespace

void RowsInSpan::Forget()
{
    m_lines = LineTable();
    m_runs.clear();
    m_isIn = std::vector<bool>();
    m_isDated = true;
}

std::shared_ptr<LogRows const> RowsInSpan::Of(LogRows const& rows, std::vector<Run> const& runs,
                                              LogSource const& source, LogLineParser const& parser,
                                              LogSpan const& span)
{
    const bool isSameType = parser.fileType().IsLike(m_parser.fileType());
    if (source != m_source || span != m_span || !isSameType)
        Forget();
    m_source = source;
    m_span = span;
    m_parser = parser;
    m_reader.Open(source, parser.fileType());
    if (!read(rows, runs)) {
        Forget();
        return nullptr;
    }
    return std::make_shared<LogRows>(select(rows));
}

// The lines at the start about which nothing can have changed.
size_t RowsInSpan::countKnown(LineTable const& lines, std::vector<Run> const& runs) const
{
    if (!m_isDated)
        return 0; // later stamps may tell another day
    const size_t same = m_lines.CountSame(lines);
    const auto startsOf = [same](std::vector<Run> const& all) {
        std::vector<size_t> starts;
        for (Run const& run : all) {
            if (run.firstLine < same)
                starts.push_back(run.firstLine);
        }
        return starts;
    };
    return startsOf(runs) == startsOf(m_runs) ? same : 0;
}

// Newest run first: a run ended before the next one began.
bool RowsInSpan::read(LogRows const& rows, std::vector<Run> const& runs)
{
    const size_t known = countKnown(rows.lines(), runs);
    m_lines = rows.lines();
    m_runs = runs;
    m_isIn.resize(known);
    m_isIn.resize(m_lines.size());
    const auto isKnown = [known](Run const& run) {
        return run.endLine <= known;
    };
    const auto first = std::find_if_not(runs.begin(), runs.end(), isKnown);
    qint64 latest = -1;
    for (auto run = runs.end(); run != first;) {
        --run;
        latest = latest < 0 ? run->modified : std::min(latest, run->modified);
        const qint64 firstDay = findFirstDay(*run, latest);
        if (!isKnown(*run) && !readRun(*run, firstDay, known))
            return false;
    }
    return true;
}

LogLineParser::Parts RowsInSpan::partsOf(size_t line)
{
    const QByteArray text = m_reader.Line(m_lines.start(line));
    char const* start = text.constData();
    int length = text.size();
    QByteArray narrow;
    m_parser.fileType().encoding.Narrow(start, length, narrow);
    return m_parser.Find(start, std::min(length, LogIndex::PartsLimit));
}

qint64 RowsInSpan::findFirstDay(Run const& run, qint64& latest)
{
    size_t line = run.firstLine;
    const auto next = [&](LogLineParser::Parts& parts) {
        for (; line < run.endLine; ++line) {
            if (!isTimed(line))
                continue;
            parts = partsOf(line);
            if (parts.timeKey < 0)
                continue;
            ++line;
            return true;
        }
        return false;
    };
    return HistoryClock::FindFirstDay(next, latest);
}

// From the last stamp that is known on; from the first line if there is none.
bool RowsInSpan::readRun(Run const& run, qint64 firstDay, size_t known)
{
    size_t from = std::max(run.firstLine, std::min(known, run.endLine));
    const auto isStamped = [this](size_t line) {
        return isTimed(line) && partsOf(line).timeKey >= 0;
    };
    if (from > run.firstLine)
        --from;
    while (from > run.firstLine && !isStamped(from))
        --from;
    HistoryClock clock(firstDay);
    qint64 time = -1;
    size_t undecided = from; // lines before the first stamp
    for (size_t line = from; line < run.endLine; ++line) {
        if (line % LinesBetweenQuestions == 0 && !m_goesOn())
            return false;
        const LogLineParser::Parts parts = isTimed(line) ? partsOf(line) : LogLineParser::Parts();
        if (parts.timeKey >= 0) {
            m_isDated = m_isDated && parts.hasDate;
            time = clock.Read(parts.timeKey, parts.hasDate);
        }
        if (time < 0)
            continue;
        const bool isIn = m_span.Contains(time);
        for (; undecided <= line; ++undecided)
            m_isIn[undecided] = isIn;
    }
    for (; undecided < run.endLine; ++undecided)
        m_isIn[undecided] = m_span.Contains(-1);
    return true;
}

LogRows RowsInSpan::select(LogRows const& rows) const
{
    LogRows selected(rows.lines(), rows.newestEnd(), rows.complete(), rows.end());
    qint64 heading = 0;
    for (size_t row = 0; row < rows.size(); ++row) {
        if (row == rows.earlier())
            selected.EndEarlier();
        if (rows.isHeading(row)) {
            const bool isOneFile = rows.start(0) == LogRows::EarlierHeading;
            heading = rows.start(row);
            if (isOneFile && selected.size() == 0 && heading == LogRows::NewestHeading) {
                heading = 0; // only one run is left
                continue;
            }
            // That of a folded run has no rows, and that of the newest run tells what is above it.
            const bool isFolded = row + 1 == rows.size() || rows.isHeading(row + 1);
            const bool isNeeded = heading == LogRows::NewestHeading && selected.size() > 0;
            if (!isFolded && !isNeeded)
                continue;
        } else if (!m_isIn[rows.line(row)]) {
            continue;
        }
        if (heading != 0)
            selected.AddHeading(heading);
        heading = 0;
        if (!rows.isHeading(row))
            selected.AddLine(rows.line(row), rows.mark(row) & LogRows::Context);
    }
    if (rows.earlier() == rows.size())
        selected.EndEarlier();
    return selected;
}

} // namespace Velocor
