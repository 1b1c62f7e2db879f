// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogFinder.h"

#include "app/logfile/CandidateSearch.h"
#include "app/logfile/LogLineReader.h"
#include "app/logfile/LogUpdate.h"

#include <QElapsedTimer>

#include <algorithm>

namespace Velocor {

namespace {

constexpr int ReportInterval = 200; // milliseconds
constexpr size_t RowsBetweenReports = 1024;

} // namespace

LogFinder::LogFinder(QObject* parent) : QObject(parent)
{
    qRegisterMetaType<LogFindRequest>();
    qRegisterMetaType<LogHits>();
}

bool LogFinder::isSameText(LogFindRequest const& request) const
{
    return request.source == m_request.source && request.type.IsLike(m_request.type) &&
           request.text.HasSameText(m_request.text);
}

void LogFinder::Find(LogFindRequest const& request)
{
    const bool mayKeep = !request.isReset && m_complete.isComplete && isSameText(request);
    const LogHits before = mayKeep ? m_complete : LogHits();
    m_request = request;
    m_complete = LogHits();
    m_found.clear();
    m_slowStart = -1;
    if (isCancelled())
        return;

    LogLineReader reader;
    if (!reader.Open(request.source, request.type) || !request.text.hasText()) {
        report(request.rows->size(), true);
        return;
    }
    if (!mayKeep || before.slowLine > 0 || !findChanged(reader, before))
        findAll(reader);
}

void LogFinder::findAll(LogLineReader& reader)
{
    if (search(reader, 0, m_request.rows->size(), true))
        report(m_request.rows->size(), true);
}

// Returns false if all rows may have changed.
bool LogFinder::findChanged(LogLineReader& reader, LogHits const& before)
{
    LogUpdate change;
    change.rows = m_request.rows;
    change.Compare(*before.rows);
    if (change.isReset)
        return false;

    LogRows const& now = *m_request.rows;
    const size_t changedEnd = change.changeAt + change.inserted;
    const qint64 offset =
        static_cast<qint64>(now.earlier()) - static_cast<qint64>(before.rows->earlier());
    // The last line may have been incomplete: same start, but another text.
    const size_t tail = std::max<size_t>(change.changedTail, 1);
    const size_t newestBefore = before.rows->size() - before.rows->earlier();
    const size_t same = newestBefore > tail ? newestBefore - tail : 0;

    keep(*before.hits, 0, change.changeAt, 0);
    if (!search(reader, change.changeAt, changedEnd, false))
        return true;
    keep(*before.hits, change.changeAt + change.removed, before.rows->earlier() + same, offset);
    if (search(reader, now.earlier() + same, now.size(), false))
        report(now.size(), true);
    return true;
}

// Takes over what was found in the rows from `from` to `to`, which have moved by `offset`.
void LogFinder::keep(std::vector<int> const& before, size_t from, size_t to, qint64 offset)
{
    auto hit = std::lower_bound(before.begin(), before.end(), static_cast<int>(from));
    for (; hit != before.end() && static_cast<size_t>(*hit) < to; ++hit)
        m_found.push_back(*hit + static_cast<int>(offset));
}

// Returns false if the search is over: cancelled, or stopped by a line that takes too long.
bool LogFinder::search(LogLineReader& reader, size_t from, size_t to, bool isReported)
{
    LogRows const& rows = *m_request.rows;
    LogEncoding const& encoding = m_request.type.encoding;
    const CandidateSearch candidates(m_request.text, encoding);
    LogRows::Reader starts(rows);
    QElapsedTimer sinceReport;
    sinceReport.start();
    for (size_t row = from; row < to; ++row) {
        if (isCancelled())
            return false;
        if (isReported && row % RowsBetweenReports == 0 && sinceReport.hasExpired(ReportInterval)) {
            report(row, false);
            sinceReport.start();
        }
        const qint64 start = starts.start(row);
        if (start < 0)
            continue; // a heading
        const QByteArray line = reader.Line(start);
        const std::optional<LogFilter::Match> known =
            candidates.Answer(line.constData(), line.size());
        const LogFilter::Match match =
            known ? *known : m_request.text.Find(encoding.Decode(line.constData(), line.size()));
        if (match == LogFilter::TooLong) {
            m_slowStart = start;
            m_found.clear();
            report(rows.size(), true);
            return false;
        }
        if (match == LogFilter::Yes)
            m_found.push_back(static_cast<int>(row));
    }
    return true;
}

void LogFinder::report(size_t searched, bool isComplete)
{
    LogHits hits;
    hits.number = m_request.number;
    hits.rows = m_request.rows;
    hits.hits = std::make_shared<std::vector<int>>(m_found);
    hits.searched = static_cast<int>(searched);
    hits.isComplete = isComplete;
    hits.slowLine = m_slowStart < 0 ? 0 : numberOfLine(m_slowStart);
    if (isComplete)
        m_complete = hits;
    Q_EMIT found(hits);
}

qint64 LogFinder::numberOfLine(qint64 start) const
{
    if (m_request.source.logs) // whose bytes are not next to each other
        return static_cast<qint64>(m_request.rows->lines().LineAt(start)) + 1;
    LogBytes log;
    if (!log.Open(m_request.source))
        return 0;
    qint64 number = 1;
    while (log.position() < start && !isCancelled()) {
        const QByteArray bytes = log.Read(std::min<qint64>(1 << 20, start - log.position()));
        if (bytes.isEmpty())
            break;
        number += std::count(bytes.begin(), bytes.end(), '\n');
    }
    return number;
}

} // namespace Velocor
