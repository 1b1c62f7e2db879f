// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

namespace Velocor {

/// One line of a log file, taken apart for people. A plain record.
struct LogEntry
{
    /// The severities of the log, and what lines have that are no entry of their own.
    enum Severity : int { Trace = 0, Notification, Warning, Error, Fatal, None };

    QString time; ///< the stamp as it was written; empty if there is none
    Severity severity = None;
    QString elapsed;      ///< milliseconds since the entry before; empty if not logged
    QString message;      ///< the rest of the line, or all of a line that is no entry
    bool isEntry = false; ///< false: goes on with the entry above it, or is torn
};

} // namespace Velocor
