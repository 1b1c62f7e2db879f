// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogEntry.h"

#include <QHash>
#include <QString>

#include <vector>

namespace Velocor {

/// What messages have in common that differ only in numbers, addresses and quoted names. Pure, any
/// thread.
///
///     MessagePattern::Of("Page 12 of \"a.txt\" at 0x7f31c0"); // Page # of "…" at #
class MessagePattern
{
public:
    /// The message with "#" for each number and address, and "…" for what is quoted.
    ///
    /// A number may have points, colons, commas and hyphens between its digits: times, versions,
    /// network addresses and identifiers are one. Digits at the end of a word are one, too. Quotes
    /// are "", '' and ``; an apostrophe in a word is none.
    static QString Of(QString const& message);

    /// A regular expression that finds the messages with a pattern. It finds some others, too:
    /// longer messages, and those with other punctuation in a number.
    static QString Expression(QString const& pattern);
};

/// Counts messages by severity and pattern. One thread at a time.
class PatternList
{
public:
    struct Pattern
    {
        LogEntry::Severity severity = LogEntry::None;
        QString text;
        size_t count = 0;
        qint64 first = -1;      ///< time of the first one, as HistoryCursor::time(); -1 if unknown
        qint64 last = -1;       ///< time of the last one
        qint64 firstPlace = -1; ///< where the first one is, as Add() was told
        qint64 lastPlace = -1;  ///< where the last one is
    };

    /// Adds a message. A message with a pattern of its own that comes after MaximumPatterns others
    /// counts to a last pattern, "…".
    ///
    /// The first message is that of the earliest time, and the last one that of the latest. Where
    /// times are equal or unknown, the order of the calls decides.
    ///
    /// @param time  of its entry; -1 if it is unknown
    /// @param place  any number by which the caller finds the entry again
    void Add(LogEntry::Severity severity, QString const& message, qint64 time, qint64 place = -1);

    /// The most frequent first; those that are equally frequent in the order of their first
    /// messages.
    std::vector<Pattern> Sorted() const;

    /// Whether this is the pattern that stands for all after MaximumPatterns others.
    static bool IsRest(Pattern const& pattern);

    /// So that a file in which each line is different takes little memory.
    static constexpr int MaximumPatterns = 100000;

private:
    QHash<QString, size_t> m_numbers; // in m_patterns
    std::vector<Pattern> m_patterns;
};

} // namespace Velocor
