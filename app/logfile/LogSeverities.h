// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogEntry.h"

#include <QString>

namespace Velocor {

/// What is known of the severities: their names, and which of them tell of a problem. Any thread.
class LogSeverities
{
public:
    /// The name that entries carry where nothing is translated; empty for None.
    static char const* LoggedName(LogEntry::Severity severity);

    /// The name in the user's language, which is also the one in entries of a translated program;
    /// empty for None.
    static QString Name(LogEntry::Severity severity);

    /// Whether it is a warning or worse.
    static constexpr bool IsProblem(LogEntry::Severity severity)
    {
        return severity >= LogEntry::Warning && severity != LogEntry::None;
    }
};

} // namespace Velocor
