// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QDateTime>
#include <QString>

namespace Velocor {

/// Converts between the times of log entries and dates. Times of entries are local times, counted
/// in milliseconds as LogTimeReader::Stamp::key; around a change of clocks they are as they were
/// written. Pure, any thread.
class HistoryTime
{
public:
    /// The date and time of day of an entry; invalid if its time is unknown.
    ///
    /// @return in UTC, although it is a local time: local times that a change of clocks skips exist
    static QDateTime DateTime(qint64 time);

    /// The time of an entry that is written now.
    static qint64 Now();

    /// The time of an entry that is written at this moment.
    ///
    /// @param milliseconds  since 1970, in UTC
    static qint64 OfEpoch(qint64 milliseconds);

    /// The time that a user means: a date, a time of today, both, or an interval until now such as
    /// "-2h"; see LogPlace.
    ///
    /// @param now  as Now()
    /// @return -1 if the text is none
    static qint64 OfUser(QString const& text, qint64 now);

    /// A time for files, such as "2026-11-20T14:03:02.007". Uses no locale, so that it works while
    /// a program exits.
    static QByteArray Text(qint64 time);

    /// Reads such a text.
    ///
    /// @return -1 if it is none
    static qint64 FromText(QByteArray const& text);
};

} // namespace Velocor
