// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogEntry.h"

#include <QtGlobal>

#include <vector>

namespace Velocor {

/// The rows of the log view, oldest first: where in the file each begins, and what it is.
///
/// Nine bytes a row; the texts stay in the file. If entries of earlier runs are among them, two
/// heading rows stand before the earlier ones and before the newest run's.
struct LogRows
{
    /// Starts of the heading rows, which no line of a file has.
    static constexpr qint64 EarlierHeading = -1;
    static constexpr qint64 NewestHeading = -2;

    /// What is known of a row besides its start: a LogEntry::Severity and these flags.
    static constexpr quint8 SeverityMask = 0x07;
    static constexpr quint8 Continued = 0x08; ///< no entry of its own; has the severity above it
    static constexpr quint8 Torn = 0x10;      ///< its first part was written over
    static constexpr quint8 Timed = 0x20;     ///< its time is known
    static constexpr quint8 Unmatched = 0x40; ///< the text filter does not let it through

    std::vector<qint64> starts;
    std::vector<quint8> marks;
    size_t earlier = 0;  ///< how many rows are of earlier runs, with their heading; 0 if none
    size_t problems = 0; ///< entries that are warnings or worse

    size_t size() const { return starts.size(); }

    void add(qint64 start, quint8 mark)
    {
        starts.push_back(start);
        marks.push_back(mark);
    }

    LogEntry::Severity severity(size_t row) const
    {
        return static_cast<LogEntry::Severity>(marks[row] & SeverityMask);
    }
};

} // namespace Velocor
