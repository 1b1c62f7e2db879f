// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogLineParser.h"
#include "app/logfile/LogPlace.h"
#include "app/logfile/LogRows.h"
#include "app/logfile/LogSource.h"

#include <QMetaType>
#include <QObject>
#include <QString>

#include <atomic>
#include <memory>

namespace Velocor {

/// What a LogLocator is to look for, and where.
struct LogLocateRequest
{
    int number = 0;
    LogSource source;
    LogLineParser parser;
    LogPlace place; ///< valid
    std::shared_ptr<LogRows const> rows;
    int currentRow = -1; ///< -1 if there is none
};

/// What a LogLocator has found.
struct LogLocation
{
    enum Answer {
        Found,   ///< `row` is the place, or the first entry after it
        Nearest, ///< the line is filtered out, and `row` is the nearest one
        Beyond,  ///< the log ends before the place, and `row` is its end
        NoTimes, ///< no entry has a time
        NoDates, ///< the entries have no date
        NoSuchLine
    };

    int number = 0; ///< that of the request
    Answer answer = Found;
    int row = -1;      ///< -1 if there is none
    qint64 start = -1; ///< where the line of the row starts in the file
};

/// Finds the row of a place in a log, in its own thread and with its own file handle.
///
/// A time is that of the first entry, from the top of the rows, that is not older. A time without a
/// date is on the day of the current entry or, without one, of the last entry. An interval counts
/// from the current entry: forward to the first entry that is not older, back to the first one that
/// is not newer.
///
/// SetCurrentRequest() with a later number cancels an earlier request, and may be called from any
/// thread, everything else only from the locator's.
class LogLocator : public QObject
{
    Q_OBJECT

public:
    explicit LogLocator(QObject* parent = nullptr);

    /// Makes earlier requests obsolete.
    void SetCurrentRequest(int request) { m_currentRequest = request; }

public Q_SLOTS:
    /// Emits located(), unless the request becomes obsolete.
    void Locate(Velocor::LogLocateRequest const& request);

Q_SIGNALS:
    void located(Velocor::LogLocation const& location);

    /// How many percent of the rows have been looked at for a time. Not emitted for short logs.
    void progressed(int request, int percent);

private:
    std::atomic<int> m_currentRequest{0};
};

} // namespace Velocor

Q_DECLARE_METATYPE(Velocor::LogLocateRequest)
Q_DECLARE_METATYPE(Velocor::LogLocation)
