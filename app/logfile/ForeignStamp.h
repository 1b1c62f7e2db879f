// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QDate>

namespace Velocor {

/// The time stamps of other programs: ISO 8601, RFC 3164, ctime() and more; see the table in
/// ForeignStamp.cpp. Pure, any thread.
///
///     ForeignStamp stamp = ForeignStamp::Read(line, length, modified);
///     if (stamp.length > 0)
///         ...;
struct ForeignStamp
{
    int length = 0;  ///< in bytes; 0 if there is no time stamp
    qint64 key = -1; ///< as in LogTimeReader::Stamp; as written, whatever the time zone
    bool hasDate = false;
    int resolution = 1000;        ///< as LogTimeReader::resolution()
    bool isFollowedByIds = false; ///< two numbers and a severity's letter usually follow

    /// Reads the time stamp at the start of a text.
    ///
    /// @param latest  about the day of the newest entry, to guess a year that is not written
    static ForeignStamp Read(char const* text, int length, QDate const& latest);

    /// Reads a compact one that only counts after a severity's letter, as in "1122 14:03:02".
    static ForeignStamp ReadAfterLetter(char const* text, int length, QDate const& latest);

    /// Reads seconds since the start of a system, as in "    12.345678".
    static ForeignStamp ReadSeconds(char const* text, int length);

    /// The key of a time since 1970 in milliseconds, in local time.
    static qint64 KeyOfEpoch(qint64 milliseconds);
};

} // namespace Velocor
