// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogLocator.h"

#include "app/logfile/LogIndex.h"
#include "app/logfile/LogLineReader.h"
#include "app/logfile/Milliseconds.h"

#include <algorithm>
#include <functional>

namespace Velocor {

namespace {

constexpr int RowsPerReport = 100 * 1000; // much less than a second

// Where a line of the file starts; -1 if it has fewer lines.
qint64 StartOfLine(LogLocateRequest const& request, std::function<bool()> const& isCancelled)
{
    const LogLineEnd lineEnd = request.parser.fileType().lineEnd();
    qint64 number = request.place.value;
    if (request.source.logs) { // whose bytes are not next to each other
        LineTable const& lines = request.rows->lines();
        const bool exists = number >= 1 && number <= static_cast<qint64>(lines.size());
        return exists ? lines.start(static_cast<size_t>(number) - 1) : -1;
    }
    LogBytes log;
    if (number == 1 || !log.Open(request.source))
        return number == 1 ? 0 : -1;
    qint64 offset = 0;
    char before = '\0'; // the last byte, unless a line ended with it
    while (!isCancelled()) {
        const QByteArray bytes = log.Read(1 << 20);
        if (bytes.isEmpty())
            return -1;
        char const* at = bytes.constBegin();
        while (char const* last =
                   lineEnd.Find(at, bytes.constEnd(), offset + (at - bytes.constBegin()), before)) {
            at = last + 1;
            before = '\0';
            const qint64 start = offset + (at - bytes.constBegin());
            if (--number == 1)
                return start < log.size() ? start : -1;
        }
        before = at == bytes.constEnd() ? '\0' : bytes.back();
        offset += bytes.size();
    }
    return -1;
}

// One look at the times of the rows.
class Times
{
public:
    Times(LogLocateRequest const& request, std::function<bool()> isCancelled,
          std::function<void(int)> report)
        : m_request(request), m_isCancelled(std::move(isCancelled)), m_report(std::move(report)),
          m_starts(*request.rows), m_count(static_cast<int>(request.rows->size()))
    {
        m_isOpen = m_reader.Open(request.source, request.parser.fileType());
    }

    LogLocation find()
    {
        const LogPlace place = m_request.place;
        const LogLineParser::Parts base = baseParts();
        if (base.timeKey < 0)
            return answer(LogLocation::NoTimes, -1);
        if (place.kind == LogPlace::DateTime && !base.hasDate)
            return answer(LogLocation::NoDates, -1);
        if (place.kind == LogPlace::Interval)
            return onward(base.timeKey + place.value, place.value);
        const qint64 target = place.kind == LogPlace::DateTime
                                  ? place.value
                                  : base.timeKey - base.timeKey % Milliseconds::Day + place.value;
        return forward(-1, target);
    }

private:
    static LogLocation answer(LogLocation::Answer what, int row)
    {
        LogLocation location;
        location.answer = what;
        location.row = row;
        return location;
    }

    LogLineParser::Parts parts(int row)
    {
        const auto position = static_cast<size_t>(row);
        const qint64 start = m_starts.start(position);
        if (!m_isOpen || start < 0 || !(m_request.rows->mark(position) & LogRows::Timed))
            return LogLineParser::Parts();
        const QByteArray bytes = m_reader.Line(start);
        char const* line = bytes.constData();
        int length = bytes.size();
        QByteArray narrow;
        m_request.parser.fileType().encoding.Narrow(line, length, narrow);
        return m_request.parser.Find(line, std::min(length, LogIndex::PartsLimit));
    }

    // A line without a time belongs to the entry above.
    LogLineParser::Parts baseParts()
    {
        const int from = m_request.currentRow < 0 ? m_count - 1 : m_request.currentRow;
        for (int row = from; row >= 0 && !m_isCancelled(); --row) {
            const LogLineParser::Parts found = parts(row);
            if (found.timeKey >= 0)
                return found;
        }
        for (int row = from + 1; row < m_count && !m_isCancelled(); ++row) {
            const LogLineParser::Parts found = parts(row);
            if (found.timeKey >= 0)
                return found;
        }
        return LogLineParser::Parts();
    }

    LogLocation onward(qint64 target, qint64 interval)
    {
        const int current = m_request.currentRow < 0 ? m_count - 1 : m_request.currentRow;
        return interval < 0 ? backward(current, target) : forward(current, target);
    }

    LogLocation forward(int from, qint64 target)
    {
        int last = from;
        for (int row = from + 1; row < m_count && !m_isCancelled(); ++row) {
            if (row % RowsPerReport == RowsPerReport - 1)
                m_report(static_cast<int>(qint64(row) * 100 / m_count));
            const qint64 key = parts(row).timeKey;
            if (key >= target)
                return answer(LogLocation::Found, row);
            if (key >= 0)
                last = row;
        }
        return answer(LogLocation::Beyond, last);
    }

    LogLocation backward(int from, qint64 target)
    {
        int first = from;
        for (int row = from - 1; row >= 0 && !m_isCancelled(); --row) {
            const qint64 key = parts(row).timeKey;
            if (key >= 0 && key <= target)
                return answer(LogLocation::Found, row);
            if (key >= 0)
                first = row;
        }
        return answer(LogLocation::Beyond, first);
    }

    LogLocateRequest const& m_request;
    std::function<bool()> m_isCancelled;
    std::function<void(int)> m_report;
    LogLineReader m_reader;
    LogRows::Reader m_starts;
    bool m_isOpen = false;
    int m_count;
};

LogLocation LineIn(LogLocateRequest const& request, std::function<bool()> const& isCancelled)
{
    LogLocation location;
    const qint64 start = StartOfLine(request, isCancelled);
    if (start < 0) {
        location.answer = LogLocation::NoSuchLine;
        return location;
    }
    location.row = request.rows->RowNear(start);
    if (location.row >= 0 && request.rows->start(static_cast<size_t>(location.row)) != start)
        location.answer = LogLocation::Nearest;
    return location;
}

} // namespace

LogLocator::LogLocator(QObject* parent) : QObject(parent)
{
    qRegisterMetaType<LogLocateRequest>();
    qRegisterMetaType<LogLocation>();
}

void LogLocator::Locate(LogLocateRequest const& request)
{
    const auto isCancelled = [this, &request] {
        return m_currentRequest > request.number;
    };
    const auto report = [this, &request](int percent) {
        Q_EMIT progressed(request.number, percent);
    };
    LogLocation location = request.place.kind == LogPlace::Line
                               ? LineIn(request, isCancelled)
                               : Times(request, isCancelled, report).find();
    if (isCancelled())
        return;
    location.number = request.number;
    if (location.row >= 0)
        location.start = request.rows->start(static_cast<size_t>(location.row));
    Q_EMIT located(location);
}

} // namespace Velocor
