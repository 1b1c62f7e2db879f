// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LineCheck.h"
#include "app/logfile/LogEntry.h"

#include <QtGlobal>

#include <algorithm>
#include <limits>
#include <vector>

namespace Velocor {

/// The rows of the log view, oldest first: where each starts in the file, and what it is.
///
/// The texts stay in the file, to keep memory use low. A check tells whether a line is still the
/// one that was read when it is read again, because a log overwrites its file. If there are entries
/// of earlier runs, a heading row precedes them and another one precedes the newest run.
struct LogRows
{
    /// Start values of the heading rows, which no line can have.
    static constexpr qint64 EarlierHeading = -1;
    static constexpr qint64 NewestHeading = -2;

    /// The mark of a row: a LogEntry::Severity and these flags.
    static constexpr quint8 SeverityMask = 0x07;
    static_assert(LogEntry::None <= SeverityMask, "a mark has no room for another severity");
    static constexpr quint8 Continued = 0x08; ///< not an entry; has the severity of the entry above
    static constexpr quint8 Torn = 0x10;      ///< its first part was overwritten
    static constexpr quint8 Timed = 0x20;     ///< its time is known
    static constexpr quint8 Context = 0x40;   ///< shown only because it is near a line that matches
    static constexpr quint8 Alone = 0x80;     ///< continued, but not shown along with its entry

    /// In an index, instead of the last two: the line does not match the text filter, or has a term
    /// that hides it.
    static constexpr quint8 Unmatched = 0x40;
    static constexpr quint8 Hidden = 0x80;

    std::vector<qint64> starts;
    std::vector<quint8> marks;
    std::vector<quint16> checks; ///< see CheckOf(); 0 for headings
    qint64 complete = 0;         ///< a line that starts here or later has no line end yet
    qint64 end = 0;              ///< where the file ended
    size_t earlier = 0;          ///< rows of earlier runs, including their heading; 0 if none
    size_t problems = 0;         ///< entries that are warnings or worse

    size_t size() const { return starts.size(); }

    void add(qint64 start, quint8 mark, quint16 check = 0)
    {
        starts.push_back(start);
        marks.push_back(mark);
        checks.push_back(check);
    }

    /// Whether a line with this mark is the first one of an entry. The lines that follow it without
    /// a stamp, those with the mark Continued, belong to the same entry.
    static bool BeginsEntry(quint8 mark)
    {
        return !(mark & (Continued | Torn)) &&
               ((mark & Timed) || (mark & SeverityMask) != LogEntry::None);
    }

    /// The start of a line that a check covers, in bytes.
    static constexpr int CheckedLength = 4096;

    /// A number that differs for different lines, except for one pair in 65,536. Valid in this
    /// process.
    ///
    /// @param line  without its line end
    static quint16 CheckOf(char const* line, int length)
    {
        return LineCheck(line, static_cast<size_t>(std::min(length, CheckedLength)));
    }

    /// The row whose line starts there or, if there is none, as near to it as possible; -1 without
    /// lines.
    int RowNear(qint64 start) const
    {
        int nearest = -1;
        qint64 least = std::numeric_limits<qint64>::max();
        for (size_t row = 0; row < starts.size() && least > 0; ++row) {
            const qint64 distance = starts[row] < 0 ? least : qAbs(starts[row] - start);
            if (distance < least) {
                least = distance;
                nearest = static_cast<int>(row);
            }
        }
        return nearest;
    }

    LogEntry::Severity severity(size_t row) const
    {
        return static_cast<LogEntry::Severity>(marks[row] & SeverityMask);
    }
};

} // namespace Velocor
