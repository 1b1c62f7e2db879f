// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/PatternCounter.h"

#include "app/logfile/LogLineReader.h"

#include <QElapsedTimer>

#include <utility>

namespace Velocor {

namespace {

constexpr int CountReportInterval = 300; // milliseconds
constexpr size_t RowsBetweenChecks = 1024;

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
        if (start < 0) {
            m_time = -1; // a heading
            continue;
        }
        const QByteArray line = reader.Line(start);
        if (LogRows::CheckOf(line.constData(), line.size()) == m_rows->check(row))
            add(patterns, line, start);
    }
    report(patterns, row);
}

void PatternCounter::add(PatternList& patterns, QByteArray const& line, qint64 start)
{
    const LogEntry entry = m_parser.Parse(line);
    if (entry.timeKey >= 0) {
        m_time = m_clock.Read(entry.timeKey, entry.hasDate);
        m_isDated = m_isDated && entry.hasDate;
    }
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
