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

    /// The name in the user's language, which a translated program also uses in its entries; empty
    /// for None.
    static QString Name(LogEntry::Severity severity);

    /// Whether it is a warning or worse.
    static constexpr bool IsProblem(LogEntry::Severity severity)
    {
        return severity >= LogEntry::Warning && severity != LogEntry::None;
    }
};

} // namespace Velocor
