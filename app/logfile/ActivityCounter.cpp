// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/ActivityCounter.h"

#include <algorithm>

namespace Velocor {

namespace {

// Stamps are at the start of a line, but for some of other programs.
constexpr qint64 StampLimit = 1024; // bytes

// Some megabytes.
constexpr size_t MostKnownTimes = 200 * 1000;

// How far a row with a time is looked for.
constexpr size_t MostWithoutTime = 100 * 1000;

} // namespace

size_t Activity::Bar::entries() const
{
    size_t sum = 0;
    for (const size_t count : counts)
        sum += count;
    return sum;
}

// Rounded up, so that a time is in the bar that its product with the number of bars says.
qint64 Activity::TimeOf(int bar) const
{
    const auto parts = static_cast<qint64>(bars.size());
    return from + ((to - from) * bar + parts - 1) / parts;
}

ActivityCounter::ActivityCounter(QObject* parent) : QObject(parent)
{
    qRegisterMetaType<ActivityRequest>();
    qRegisterMetaType<Activity>();
}

// A line that continues an entry is none.
void ActivityCounter::addRow(size_t row, LogCounts& counts) const
{
    const quint8 mark = m_rows->mark(row);
    if (!(mark & LogRows::Continued) && !m_rows->isHeading(row))
        ++counts[mark & LogRows::SeverityMask];
}

void ActivityCounter::forgetTimes(size_t same)
{
    if (m_times.size() > MostKnownTimes)
        same = 0;
    for (auto time = m_times.begin(); time != m_times.end();)
        time = time->first < same ? std::next(time) : m_times.erase(time);
}

// Rows that were there before need not be looked at again.
void ActivityCounter::addUp()
{
    LogRows const& rows = *m_request.rows;
    const bool isOneRun = m_rows && m_rows->earlier() == 0 && rows.earlier() == 0;
    const size_t same = m_rows == m_request.rows ? rows.size()
                        : isOneRun               ? std::min(rows.CountSame(*m_rows), rows.size())
                                                 : 0;
    forgetTimes(same);
    m_rows = m_request.rows;
    m_sums.resize(std::min(m_sums.size(), same / BlockSize + 1));
    if (m_sums.empty())
        m_sums.emplace_back();
    for (size_t block = m_sums.size(); block * BlockSize <= rows.size(); ++block) {
        LogCounts sum = m_sums.back();
        for (size_t row = (block - 1) * BlockSize; row < block * BlockSize; ++row)
            addRow(row, sum);
        m_sums.push_back(sum);
        if (isCancelled())
            return;
    }
}

LogCounts ActivityCounter::countsBefore(size_t row) const
{
    LogCounts counts = m_sums[row / BlockSize];
    for (size_t next = row / BlockSize * BlockSize; next < row; ++next)
        addRow(next, counts);
    return counts;
}

LogLineParser::Parts ActivityCounter::read(size_t row)
{
    const qint64 start = m_rows->start(row);
    if (start < 0 || !(m_rows->mark(row) & LogRows::Timed) || !m_file.isOpen() ||
        !m_file.Seek(start))
        return LogLineParser::Parts();
    LogFileType const& type = m_request.parser.fileType();
    const QByteArray bytes = m_file.Read(StampLimit);
    char const* const last = type.lineEnd().Find(bytes.constBegin(), bytes.constEnd(), 0, '\0');
    char const* line = bytes.constData();
    int length = last ? static_cast<int>(last - line) + 1 - type.lineEnd().size() : bytes.size();
    length = type.encoding.WithoutReturn(line, length);
    QByteArray narrow;
    type.encoding.Narrow(line, length, narrow);
    return m_request.parser.Find(line, length);
}

// The row itself or, in a direction, the next one with a time.
LogLineParser::Parts ActivityCounter::firstTimed(size_t from, int step)
{
    size_t row = from;
    for (size_t looked = 0; row < m_rows->size() && looked < MostWithoutTime; ++looked) {
        if (m_rows->mark(row) & LogRows::Timed) {
            const LogLineParser::Parts parts = read(row);
            if (parts.timeKey >= 0)
                return parts;
        }
        row += static_cast<size_t>(step); // past the first one, it is larger than any
    }
    return LogLineParser::Parts();
}

qint64 ActivityCounter::timeAt(size_t row)
{
    const auto known = m_times.find(row);
    if (known != m_times.end())
        return known->second;
    const LogLineParser::Parts parts = firstTimed(row, -1);
    if (parts.timeKey < 0)
        return firstTimed(row, 1).timeKey; // may be another one when the rows below are others
    m_times.emplace(row, parts.timeKey);
    return parts.timeKey;
}

int ActivityCounter::barOf(qint64 time, Activity const& activity) const
{
    if (time < activity.from)
        return -1;
    if (time >= activity.to)
        return m_request.parts;
    return static_cast<int>((time - activity.from) * m_request.parts /
                            (activity.to - activity.from));
}

// Notes the rows that bars begin with, if they are after `low` and not after `high`.
void ActivityCounter::divide(Place low, Place high, Activity const& activity)
{
    if (low.bar >= high.bar || isCancelled())
        return;
    if (high.row - low.row == 1) {
        for (int bar = low.bar + 1; bar <= high.bar; ++bar) {
            size_t& first = m_firstRows[static_cast<size_t>(bar)];
            first = std::min(first, static_cast<size_t>(high.row));
        }
        return;
    }
    Place middle{low.row + (high.row - low.row) / 2, 0};
    middle.bar = barOf(timeAt(static_cast<size_t>(middle.row)), activity);
    divide(low, middle, activity);
    divide(middle, high, activity);
}

void ActivityCounter::findBars(Activity const& activity)
{
    const auto count = static_cast<qint64>(m_rows->size());
    m_firstRows.assign(static_cast<size_t>(m_request.parts) + 1, m_rows->size());
    divide({-1, -1}, {count, m_request.parts}, activity);
    for (size_t bar = m_firstRows.size() - 1; bar > 0; --bar)
        m_firstRows[bar - 1] = std::min(m_firstRows[bar - 1], m_firstRows[bar]);
}

void ActivityCounter::fill(Activity& activity) const
{
    activity.bars.resize(static_cast<size_t>(m_request.parts));
    LogCounts before = countsBefore(m_firstRows.front());
    for (size_t number = 0; number < activity.bars.size(); ++number) {
        Activity::Bar& bar = activity.bars[number];
        const LogCounts after = countsBefore(m_firstRows[number + 1]);
        for (size_t severity = 0; severity < after.size(); ++severity)
            bar.counts[severity] = after[severity] - before[severity];
        for (size_t row = m_firstRows[number]; row < m_firstRows[number + 1]; ++row) {
            bar.start = m_rows->start(row);
            if (bar.start >= 0) // no heading
                break;
        }
        before = after;
    }
}

void ActivityCounter::Count(ActivityRequest const& request)
{
    if (m_currentRequest > request.number)
        return;
    if (request.source != m_request.source) {
        m_rows.reset();
        m_times.clear();
    }
    m_request = request;
    m_file.Open(request.source);
    addUp();
    Activity activity;
    activity.number = request.number;
    const LogLineParser::Parts first = firstTimed(0, 1);
    const LogLineParser::Parts last = request.rows->size() > 0
                                          ? firstTimed(request.rows->size() - 1, -1)
                                          : LogLineParser::Parts();
    if (first.timeKey < 0 || last.timeKey < 0) {
        activity.state = Activity::NoTimes;
    } else if (!first.hasDate || !last.hasDate) {
        activity.state = Activity::NoDates;
    } else {
        activity.state = Activity::Known;
        activity.first = std::min(first.timeKey, last.timeKey);
        activity.last = std::max(first.timeKey, last.timeKey);
        const bool isAll = request.from < 0 || request.to <= request.from;
        activity.from = isAll ? activity.first : request.from;
        activity.to = isAll ? activity.last + 1 : request.to;
        findBars(activity);
        if (!isCancelled())
            fill(activity);
    }
    m_file.Close();
    if (!isCancelled())
        Q_EMIT counted(activity);
}

} // namespace Velocor
