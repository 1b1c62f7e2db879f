// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/terminal/LogFollower.h"

#include "app/history/HistoryLines.h"
#include "app/history/HistoryTime.h"
#include "app/logfile/LogIndex.h"
#include "app/logfile/LogLineReader.h"
#include "app/logfile/Milliseconds.h"

#include <QObject>
#include <QTimer>

#include <algorithm>
#include <utility>

namespace Velocor {

namespace {

// So many of the last rows that have been seen may belong to an entry that goes on, or be its
// context. What has been printed of them is known for longer, because rows may disappear.
constexpr size_t MaximumUnsettled = 2 * LogIndex::MaximumEntryLines;
constexpr size_t MaximumKnown = 2 * MaximumUnsettled;

} // namespace

LogFollower::LogFollower(QString program, QString path, Print print, std::function<void()> flush)
    : m_program(std::move(program)), m_path(std::move(path)), m_print(std::move(print)),
      m_flush(std::move(flush))
{
    QObject::connect(&m_scanner, &LogScanner::updated, &m_scanner,
                     [this](LogUpdate const& update) { take(update); });
}

void LogFollower::NotePrinted(HistoryFile const& file)
{
    LogRows const& rows = file.rows();
    m_hasLines = !rows.lines().isEmpty();
    m_firstCheck = m_hasLines ? rows.lines().check(0) : quint16(0);
    m_end = file.runStarts().size() > 1 ? rows.lines().start(file.runStarts()[1]) : rows.complete();
    for (size_t row = rows.earlier(); row < rows.size(); ++row) {
        if (rows.start(row) >= 0 && rows.start(row) < m_end)
            m_printed[rows.start(row)] = rows.check(row);
    }
    forgetOldLines(rows);
    m_held.Share(file);
}

void LogFollower::Start(LogLineParser const& parser, LogFilter const& filter)
{
    m_parser = parser;
    m_filter = filter;
    m_scanner.SetWatched(true);
    m_scanner.SetCurrentRequest(++m_request);
    open();
}

void LogFollower::open()
{
    if (!m_held.isOpen())
        m_held.Open(m_path);
    m_scanner.Open(m_request, m_path, m_parser, m_filter);
}

// Not at once, because the scanner is sending an update. Others that it sends until then may be of
// either file.
void LogFollower::restart()
{
    m_held = HistoryFile();
    m_hasLines = false;
    m_end = 0;
    m_printed.clear();
    m_scanner.SetCurrentRequest(++m_request);
    QTimer::singleShot(0, &m_scanner, [this] { open(); });
}

// What the file got before another one took its name.
void LogFollower::printRest()
{
    if (!m_held.Read(m_parser, m_filter))
        return;
    LogRows const& rows = m_held.rows();
    if (rows.lines().isEmpty())
        return;
    noteFirstLine(rows);
    m_parser.SetFileType(m_held.parser().fileType());
    HistoryLines lines(m_held);
    const size_t newestEnd = rows.newestEnd();
    const qint64 end = newestEnd < rows.lines().size() ? rows.lines().start(newestEnd) : rows.end();
    printNew(rows, end, [&lines, &rows](size_t row, QByteArray& lineEnd) {
        const QByteArray content = lines.Content(rows.line(row));
        lineEnd = lines.bytes().mid(content.size());
        return QByteArray(content.constData(), content.size());
    });
}

// The first row of the newest run whose entry may have changed.
size_t LogFollower::firstCandidate(LogRows const& rows) const
{
    size_t from = rows.earlier();
    size_t to = rows.size();
    while (from < to) {
        const size_t middle = from + (to - from) / 2;
        if (rows.start(middle) < m_end)
            from = middle + 1;
        else
            to = middle;
    }
    return from - std::min(from - rows.earlier(), MaximumUnsettled);
}

void LogFollower::take(LogUpdate const& update)
{
    LogRows const& rows = *update.rows;
    m_scanner.NoteTaken();
    if (!update.exists || update.request != m_request)
        return;
    if (m_held.isOpen() && !m_held.IsInPlace()) {
        printRest();
        restart();
        return;
    }
    if (rows.lines().isEmpty() || update.isPartial)
        return;
    if (!m_held.isOpen())
        m_held.Open(m_path);
    noteFirstLine(rows);

    m_parser.SetFileType(update.type);
    LogLineReader reader;
    if (!reader.Open(m_path, update.type))
        return;
    const size_t newestEnd = rows.newestEnd();
    const qint64 end =
        newestEnd < rows.lines().size() ? rows.lines().start(newestEnd) : rows.complete();
    printNew(rows, end, [&](size_t row, QByteArray& lineEnd) {
        const QByteArray content = reader.Line(rows.start(row));
        const LogLineEnd usual = update.type.lineEnd();
        const bool hasReturn =
            reader.nextStart() - rows.start(row) == content.size() + 1 + usual.size();
        lineEnd = (hasReturn ? "\r" : "") + usual.bytes();
        return content;
    });
}

// Another first line is that of another run.
void LogFollower::noteFirstLine(LogRows const& rows)
{
    const quint16 firstCheck = rows.lines().check(0);
    if (m_hasLines && firstCheck != m_firstCheck) {
        m_end = 0;
        m_printed.clear();
    }
    m_hasLines = true;
    m_firstCheck = firstCheck;
}

// @param end  where the newest run ends in the file
void LogFollower::printNew(LogRows const& rows, qint64 end, Line const& read)
{
    for (size_t row = firstCandidate(rows); row < rows.size(); ++row) {
        const qint64 start = rows.start(row);
        if (start < 0 || start >= end)
            continue;
        // A new file may begin with the line that the one before began with, such as a header.
        const auto printed = m_printed.find(start);
        if (printed != m_printed.end() && printed->second == rows.check(row))
            continue;
        QByteArray lineEnd;
        const QByteArray content = read(row, lineEnd);
        if (LogRows::CheckOf(content.constData(), content.size()) != rows.check(row))
            continue; // overwritten meanwhile; the next update will have it
        print(rows, row, content, lineEnd);
        m_printed[start] = rows.check(row);
    }
    m_end = end;
    forgetOldLines(rows);
    m_flush();
}

void LogFollower::print(LogRows const& rows, size_t row, QByteArray const& content,
                        QByteArray const& lineEnd)
{
    const qint64 time = timeOf(content);
    const QByteArray bytes = content + lineEnd;
    m_print({m_program, m_path, m_parser, bytes, content, rows.severity(row), rows.line(row) + 1,
             time});
}

// A stamp without a date is of today.
qint64 LogFollower::timeOf(QByteArray const& content)
{
    char const* text = content.constData();
    int length = content.size();
    QByteArray narrow;
    m_parser.fileType().encoding.Narrow(text, length, narrow);
    const LogLineParser::Parts parts = m_parser.Find(text, std::min(length, LogIndex::PartsLimit));
    if (parts.timeKey < 0)
        return m_time;
    if (m_time < 0)
        m_clock = HistoryClock(HistoryTime::Now() / Milliseconds::Day * Milliseconds::Day);
    m_time = m_clock.Read(parts.timeKey, parts.hasDate);
    return m_time;
}

void LogFollower::forgetOldLines(LogRows const& rows)
{
    const size_t count = rows.size() - rows.earlier();
    if (count > MaximumKnown)
        m_printed.erase(m_printed.begin(),
                        m_printed.lower_bound(rows.start(rows.size() - MaximumKnown)));
}

} // namespace Velocor
