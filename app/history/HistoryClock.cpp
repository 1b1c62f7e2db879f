// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/HistoryClock.h"

#include "app/logfile/Milliseconds.h"

#include <algorithm>

namespace Velocor {

namespace {

// A stamp may be rounded to minutes, and the end of daylight saving time may be in between.
constexpr qint64 Uncertainty = 61 * Milliseconds::Minute;

// A midnight that leaves room for clocks that are set back over it.
constexpr qint64 SomeDay = 10000 * Milliseconds::Day;

} // namespace

qint64 HistoryClock::Read(qint64 key, bool hasDate)
{
    const qint64 timeOfDay = key % Milliseconds::Day; // a key without a date has some day
    if (hasDate) {
        m_last = key;
    } else if (m_last < 0) {
        m_last = m_firstDay + timeOfDay;
    } else {
        const qint64 midnight = m_last - m_last % Milliseconds::Day;
        const qint64 difference = midnight + timeOfDay - m_last;
        qint64 day = midnight;
        if (difference < -Milliseconds::Day / 2)
            day += Milliseconds::Day;
        else if (difference > Milliseconds::Day / 2)
            day = std::max<qint64>(0, day - Milliseconds::Day);
        m_last = day + timeOfDay;
    }
    return m_last;
}

qint64 HistoryClock::FirstDay(qint64 end, qint64 latest)
{
    const qint64 room = latest + Uncertainty - end;
    return room < 0 ? 0 : room - room % Milliseconds::Day;
}

qint64 HistoryClock::FindFirstDay(NextStamp const& next, qint64& latest)
{
    HistoryClock clock(SomeDay);
    qint64 first = -1;
    qint64 end = -1;
    LogLineParser::Parts parts;
    while (next(parts)) {
        if (parts.hasDate) {
            latest = first < 0 ? parts.timeKey : std::min(latest, parts.timeKey);
            break;
        }
        end = clock.Read(parts.timeKey, false);
        first = first < 0 ? end : first;
    }
    if (first < 0)
        return 0;
    const qint64 day = FirstDay(end - SomeDay, latest);
    latest = day + first - SomeDay;
    return day;
}

} // namespace Velocor
