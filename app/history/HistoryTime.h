// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QDateTime>

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
};

} // namespace Velocor
