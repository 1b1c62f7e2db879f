// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogEntry.h"

#include <QDate>

namespace Velocor {

/// A line of another program's log, split into its parts.
///
/// There is no list of programs: a line is an entry if it starts with a time stamp (ForeignStamp),
/// perhaps in brackets or after a syslog priority, or with a severity (LevelNames); or if it is a
/// JSON object, `name=value` pairs or an entry of a journal export with one of these or a message.
/// Pure, any thread.
struct ForeignLine
{
    /// Bytes from the start of the line.
    struct Span
    {
        int start = 0;
        int length = 0;
    };

    bool isEntry = false;
    bool isSure = false;  ///< has a time or named parts; a severity alone may be an accident
    Span time;            ///< empty if there is no time stamp
    bool isEpoch = false; ///< the time is a number: seconds since 1970, or a fraction of them
    qint64 timeKey = -1;  ///< see ForeignStamp::key
    bool hasDate = false;
    int resolution = 1000;
    LogEntry::Severity severity = LogEntry::None;
    Span message;           ///< what the other parts leave; the whole line if it is not an entry
    Span program;           ///< who wrote it, in entries of the journal; may be empty
    bool isEscaped = false; ///< the message has the escapes of JSON

    /// Splits a line, in any encoding that has ASCII in single bytes.
    ///
    /// @param latest  see ForeignStamp::Read()
    static ForeignLine Read(char const* line, int length, QDate const& latest);

    /// Whether a file starts like a journal export, whose entries are separated by empty lines.
    static bool IsJournalExport(char const* text, int length);

    /// A time that is a number, as text in local time; empty if it is out of range.
    static QString EpochText(char const* number, int length);
};

} // namespace Velocor
