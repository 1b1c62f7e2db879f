// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogEntry.h"

#include <QString>

namespace Velocor {

/// The names of the severities, and which of them are problems. Any thread.
class LogSeverities
{
public:
    /// The untranslated name in log entries; empty for None.
    static char const* LoggedName(LogEntry::Severity severity);

    /// The name in the entries of this program's log: as the framework's texts are translated,
    /// which no catalog of the window does but a program's own may; empty for None.
    static QString NameInLog(LogEntry::Severity severity);

    /// The name to show, in the language of the window; empty for None.
    static QString Name(LogEntry::Severity severity);

    /// Whether it is a warning or worse.
    static constexpr bool IsProblem(LogEntry::Severity severity)
    {
        return severity >= LogEntry::Warning && severity != LogEntry::None;
    }
};

} // namespace Velocor
