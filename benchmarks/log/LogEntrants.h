// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

#include <memory>
#include <string>
#include <vector>

/// One logging library, set up to write one-line entries with date, time to the millisecond,
/// severity and message into a file, each flushed to the kernel before the call returns.
class LogEntrant
{
public:
    virtual ~LogEntrant() = default;

    /// Writes one entry whose message is LogMessage(). Any thread.
    virtual void write() = 0;

    /// Makes the next entry begin a new file, if the file is larger than its limit and the library
    /// does not look by itself. Any thread.
    virtual void reopen() {}
};

/// Creates an entrant that writes to `folder`, whose path ends in "/". One at a time in a process.
using LogEntrantFactory = std::unique_ptr<LogEntrant> (*)(QString const& folder);

struct LogEntrantDescription
{
    char const* name;
    LogEntrantFactory make;
};

/// All entrants, after checking that each has its entry in the file when the call returns.
std::vector<LogEntrantDescription> CheckedLogEntrants();

/// The maximum number of entries in one file of a folder, because some libraries write links and
/// further files next to their log.
int EntriesIn(QString const& folder);

/// The message of every entry: 100 characters.
std::string const& LogMessage();

std::unique_ptr<LogEntrant> MakeFloorEntrant(QString const& folder);
std::unique_ptr<LogEntrant> MakeFixedPartsEntrant(QString const& folder);
std::unique_ptr<LogEntrant> MakeTorkLogEntrant(QString const& folder);
std::unique_ptr<LogEntrant> MakeTorkLogBelowLimitEntrant(QString const& folder);
std::unique_ptr<LogEntrant> MakeTorkLogByQtMessagesEntrant(QString const& folder);
std::unique_ptr<LogEntrant> MakeTorkLogSmallEntrant(QString const& folder);
std::unique_ptr<LogEntrant> MakeSpdlogSmallEntrant(QString const& folder);
std::unique_ptr<LogEntrant> MakeSpdlogAsyncEntrant(QString const& folder);
std::unique_ptr<LogEntrant> MakeSpdlogBasicEntrant(QString const& folder);
std::unique_ptr<LogEntrant> MakeSpdlogRotatingEntrant(QString const& folder);
std::unique_ptr<LogEntrant> MakeLog4cplusEntrant(QString const& folder);
std::unique_ptr<LogEntrant> MakeLog4cxxEntrant(QString const& folder);
std::unique_ptr<LogEntrant> MakeBoostLogEntrant(QString const& folder);
std::unique_ptr<LogEntrant> MakeGlogEntrant(QString const& folder);
std::unique_ptr<LogEntrant> MakeQtHandlerEntrant(QString const& folder);
