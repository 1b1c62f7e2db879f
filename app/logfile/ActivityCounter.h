// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogBytes.h"
#include "app/logfile/LogEntry.h"
#include "app/logfile/LogLineParser.h"
#include "app/logfile/LogRows.h"
#include "app/logfile/LogSource.h"

#include <QMetaType>
#include <QObject>

#include <atomic>
#include <memory>
#include <unordered_map>
#include <vector>

namespace Velocor {

/// Of which rows an ActivityCounter is to count the entries, and over which time.
struct ActivityRequest
{
    int number = 0;
    LogSource source;
    LogLineParser parser;
    std::shared_ptr<LogRows const> rows;
    qint64 from = -1; ///< the time to begin with, as LogTimeReader::Stamp::key; -1 for all times
    qint64 to = -1;   ///< the time to end before; later than `from`
    int parts = 1;    ///< how many bars; at least one
};

/// How many entries there are, by time and severity.
struct Activity
{
    enum State {
        Known,
        NoTimes, ///< no row has a time that could be read
        NoDates  ///< the times have no dates
    };

    struct Bar
    {
        LogCounts counts{};
        qint64 start =
            -1; ///< where the first line of the bar starts in the file; -1 if it has none

        size_t problems() const
        {
            return counts[LogEntry::Warning] + counts[LogEntry::Error] + counts[LogEntry::Fatal];
        }
        size_t entries() const;
    };

    int number = 0; ///< that of the request
    State state = NoTimes;
    qint64 first = -1; ///< time of the first row
    qint64 last = -1;  ///< time of the last row
    qint64 from = -1;  ///< where the first bar begins
    qint64 to = -1;    ///< where the last bar ends; bars have the same length
    std::vector<Bar> bars;

    /// Where a bar begins; of the one after the last, `to`.
    qint64 TimeOf(int bar) const;
};

/// Counts the entries of a log by time, in its own thread and with its own file handle.
///
/// An index keeps no times. Where the rows of a bar begin is found by halving the rows, for which
/// only some of their times have to be read; how many there are by severity is added up for every
/// thousand rows, which is kept for the next request. This takes rows in the order of their times:
/// entries that are out of order by more than the length of a bar may be counted to another one. A
/// row without a time has that of the row above.
///
/// SetCurrentRequest() with a later number cancels an earlier request, and may be called from any
/// thread, everything else only from the counter's.
class ActivityCounter : public QObject
{
    Q_OBJECT

public:
    explicit ActivityCounter(QObject* parent = nullptr);

    /// Makes earlier requests obsolete.
    void SetCurrentRequest(int request) { m_currentRequest = request; }

public Q_SLOTS:
    /// Emits counted(), unless the request becomes obsolete.
    void Count(Velocor::ActivityRequest const& request);

Q_SIGNALS:
    void counted(Velocor::Activity const& activity);

private:
    static constexpr size_t BlockSize = 1024; // rows

    struct Place
    {
        qint64 row;
        int bar; // -1 before the first one, the number of bars after the last one
    };

    bool isCancelled() const { return m_currentRequest > m_request.number; }
    void addUp();
    void forgetTimes(size_t same);
    void addRow(size_t row, LogCounts& counts) const;
    LogCounts countsBefore(size_t row) const;
    LogLineParser::Parts read(size_t row);
    qint64 timeAt(size_t row);
    LogLineParser::Parts firstTimed(size_t from, int step);
    int barOf(qint64 time, Activity const& activity) const;
    void findBars(Activity const& activity);
    void divide(Place low, Place high, Activity const& activity);
    void fill(Activity& activity) const;

    std::atomic<int> m_currentRequest{0};
    ActivityRequest m_request;
    LogBytes m_file;
    std::shared_ptr<LogRows const> m_rows;      // of the last request
    std::vector<LogCounts> m_sums;              // of the rows before each block
    std::unordered_map<size_t, qint64> m_times; // of rows, as known from them or those above
    std::vector<size_t> m_firstRows;            // of the bars, and the row after the last one
};

} // namespace Velocor

Q_DECLARE_METATYPE(Velocor::ActivityRequest)
Q_DECLARE_METATYPE(Velocor::Activity)
