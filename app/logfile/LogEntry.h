// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

#include <array>
#include <cstddef>

namespace Velocor {

/// One line of a log file, split into its parts. A plain record.
struct LogEntry
{
    /// The severities of the log; None for lines that are not entries.
    enum Severity : int { Trace = 0, Notification, Warning, Error, Fatal, None };

    QString time;         ///< the time stamp as written; empty if there is none
    qint64 timeKey = -1;  ///< see LogTimeReader::Stamp; -1 if the time is unknown
    bool hasDate = false; ///< whether that counts from a date, not from midnight
    Severity severity = None;
    QString elapsed;      ///< milliseconds since the previous entry; empty if not logged
    QString message;      ///< the rest of the line, or the whole line if it is not an entry
    QString program;      ///< who wrote it, in entries of the journal; may be empty
    bool isEntry = false; ///< false if it continues the entry above or is torn
};

/// Numbers of entries by LogEntry::Severity.
using LogCounts = std::array<size_t, LogEntry::None + 1>;

} // namespace Velocor
