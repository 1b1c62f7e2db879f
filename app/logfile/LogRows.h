// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogEntry.h"

#include <QtGlobal>

#include <vector>

namespace Velocor {

/// The rows of the log view, oldest first: where each starts in the file, and what it is.
///
/// The texts stay in the file, to keep memory use low. If there are entries of earlier runs, a
/// heading row precedes them and another one precedes the newest run.
struct LogRows
{
    /// Start values of the heading rows, which no line can have.
    static constexpr qint64 EarlierHeading = -1;
    static constexpr qint64 NewestHeading = -2;

    /// The mark of a row: a LogEntry::Severity and these flags.
    static constexpr quint8 SeverityMask = 0x07;
    static constexpr quint8 Continued = 0x08; ///< not an entry; has the severity of the entry above
    static constexpr quint8 Torn = 0x10;      ///< its first part was overwritten
    static constexpr quint8 Timed = 0x20;     ///< its time is known
    static constexpr quint8 Unmatched = 0x40; ///< does not match the text filter
    static constexpr quint8 Context = 0x80;   ///< shown only because it is near a line that matches

    std::vector<qint64> starts;
    std::vector<quint8> marks;
    size_t earlier = 0;  ///< rows of earlier runs, including their heading; 0 if none
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
