// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

namespace Velocor {

/// A place in a log, as users type it.
///
/// | text | place |
/// |---|---|
/// | `214` | a line of the file, starting at 1 |
/// | `14:03`, `14:03:02`, `14:03:02.5` | a time of day |
/// | `2026-11-20`, `2026-11-20 14:03`, `2026-11-20T14:03:02` | a date, or a date and a time |
/// | `Nov 20 14:03:02`, `20/Nov/2026:14:03:02 +0100`, ... | a date and a time, see ForeignStamp |
/// | `+5m`, `-30s`, `+2h`, `+1d`, `-500ms` | an interval from the current entry |
///
/// A plain value.
///
///     const LogPlace place = LogPlace::Parse("+5m");
///     if (place.kind == LogPlace::Interval)
///         target = currentTime + place.value;
struct LogPlace
{
    enum Kind {
        Invalid,
        Line,     ///< `value` is its number
        Time,     ///< `value` is in milliseconds since midnight
        DateTime, ///< `value` is in milliseconds, as LogTimeReader::Stamp::key
        Interval  ///< `value` is in milliseconds, negative for earlier entries
    };

    Kind kind = Invalid;
    qint64 value = 0;
    QString error; ///< for users: why it is invalid; empty if it is not, or if there is no text

    /// Reads what a user has typed. Blanks at its ends do not count.
    static LogPlace Parse(QString const& text);
};

} // namespace Velocor
