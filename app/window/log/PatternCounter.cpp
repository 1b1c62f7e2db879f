// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/PatternCounter.h"

#include "app/logfile/LogLineReader.h"

#include <QElapsedTimer>

#include <algorithm>
#include <utility>

namespace Velocor {

namespace {

constexpr int CountReportInterval = 300; // milliseconds
constexpr size_t RowsBetweenChecks = 1024;

// How far a row with a time is looked for.
constexpr size_t MostRowsWithoutTime = 10 * 1000;

} // namespace

PatternCounter::PatternCounter(LogSource source, LogLineParser parser,
                               std::shared_ptr<LogRows const> rows)
    : m_source(std::move(source)), m_parser(std::move(parser)), m_rows(std::move(rows))
{
    qRegisterMetaType<std::shared_ptr<CountedPatterns const>>();
}

void PatternCounter::Count()
{
    PatternList patterns;
    LogLineReader reader;
    const size_t count = reader.Open(m_source, m_parser.fileType()) ? m_rows->size() : 0;
    LogRows::Reader starts(*m_rows);
    QElapsedTimer sinceReport;
    sinceReport.start();
    size_t row = 0;
    for (; row < count && !m_isStopped; ++row) {
        if (row % RowsBetweenChecks == 0 && sinceReport.hasExpired(CountReportInterval)) {
            report(patterns, row);
            sinceReport.start();
        }
        const qint64 start = starts.start(row);
        const bool isHeading = start < 0;
        // Of all earlier runs of one file, only the first has a heading.
        if (isHeading || (m_rows->mark(row) & LogRows::Torn)) {
            m_time = -1;
            m_isAtStart = true;
        }
        if (isHeading)
            continue;
        const QByteArray line = reader.Line(start);
        if (isThere(row, line))
            add(patterns, row, line, start);
    }
    report(patterns, row);
}

bool PatternCounter::isThere(size_t row, QByteArray const& line) const
{
    return LogRows::CheckOf(line.constData(), line.size()) == m_rows->check(row);
}

// Of the first row of the run, from this one on, that has a time; -1 if there is none.
qint64 PatternCounter::timeBelow(size_t row) const
{
    LogLineReader reader;
    if (!reader.Open(m_source, m_parser.fileType()))
        return -1;
    const size_t end = std::min(m_rows->size(), row + MostRowsWithoutTime);
    for (; row < end && !m_rows->isHeading(row); ++row) {
        if (!(m_rows->mark(row) & LogRows::Timed))
            continue;
        const QByteArray line = reader.Line(m_rows->start(row));
        const LogEntry entry = isThere(row, line) ? m_parser.Parse(line) : LogEntry();
        if (entry.timeKey >= 0)
            return HistoryClock(m_clock).Read(entry.timeKey, entry.hasDate);
    }
    return -1;
}

void PatternCounter::add(PatternList& patterns, size_t row, QByteArray const& line, qint64 start)
{
    const LogEntry entry = m_parser.Parse(line);
    if (entry.timeKey >= 0) {
        m_time = m_clock.Read(entry.timeKey, entry.hasDate);
        m_isDated = m_isDated && entry.hasDate;
    } else if (m_isAtStart) {
        m_time = timeBelow(row);
    }
    m_isAtStart = false;
    if (!entry.isEntry)
        return;
    patterns.Add(entry.severity, entry.message, m_time, start);
    ++m_entries;
}

void PatternCounter::report(PatternList const& patterns, size_t rows)
{
    const auto result = std::make_shared<CountedPatterns>();
    result->patterns = patterns.Sorted();
    result->rows = rows;
    result->entries = m_entries;
    result->isDated = m_isDated;
    result->isComplete = rows == m_rows->size();
    Q_EMIT counted(result);
}

} // namespace Velocor
