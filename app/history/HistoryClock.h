// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogLineParser.h"

#include <QtGlobal>

#include <functional>

namespace Velocor {

/// Gives the time stamps of one run their dates.
///
/// A stamp with a date is its time. One without takes the day on which it is nearest to the time
/// before it: the day changes at midnight, and a clock that is set back some minutes does not
/// change it. Times are counted as LogTimeReader::Stamp::key does.
///
///     HistoryClock clock(HistoryClock::FirstDay(...));
///     time = clock.Read(parts.timeKey, parts.hasDate);
class HistoryClock
{
public:
    /// A time stamp as LogLineParser::Parts has it.
    struct Stamp
    {
        qint64 key = -1;
        bool hasDate = false;
    };

    /// @param firstDay  the midnight before the first stamp, if that has no date; 0 if unknown
    explicit HistoryClock(qint64 firstDay = 0) : m_firstDay(firstDay) {}

    /// The time of the next stamp in the order of the file.
    qint64 Read(qint64 key, bool hasDate);

    /// The last midnight from which on a run can have begun, so that it does not end later than a
    /// file was written or another run began.
    ///
    /// @param end  the time of a stamp of this run for a first day of 0
    /// @param latest  the time that it must not be after
    static qint64 FirstDay(qint64 end, qint64 latest);

    /// Gives the next stamp of a run, in the order of the file; returns false if there is none.
    using NextStamp = std::function<bool(LogLineParser::Parts& parts)>;

    /// The midnight before the first stamp of a run, if that has no date. Only then does it ask for
    /// more than the first stamp.
    ///
    /// @param latest  the time that the run must not end after; is set to that of its first stamp,
    ///                if there is one
    static qint64 FindFirstDay(NextStamp const& next, qint64& latest);

private:
    qint64 m_firstDay;
    qint64 m_last = -1;
};

} // namespace Velocor
