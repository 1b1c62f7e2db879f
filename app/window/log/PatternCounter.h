// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/HistoryClock.h"
#include "app/history/MessagePattern.h"
#include "app/logfile/LogLineParser.h"
#include "app/logfile/LogRows.h"
#include "app/logfile/LogSource.h"

#include <QMetaType>
#include <QObject>

#include <atomic>
#include <memory>
#include <vector>

namespace Velocor {

/// What a PatternCounter has counted so far.
struct CountedPatterns
{
    std::vector<PatternList::Pattern> patterns; ///< the most frequent first
    size_t rows = 0;                            ///< how many have been counted, from the first
    size_t entries = 0;                         ///< how many of them are entries
    bool isDated = true;                        ///< whether times have dates
    bool isComplete = false;                    ///< whether all rows have been counted
};

/// Counts the messages of some rows by pattern, in its own thread and with its own file handle.
///
/// The place of an entry is where its line starts. An entry without a time has that of the row
/// above or, at the start of a run, of the next row that has one. Lines that are no longer in the
/// file, and those that continue an entry, do not count.
///
/// Stop() may be called from any thread, everything else only from the counter's.
class PatternCounter : public QObject
{
    Q_OBJECT

public:
    /// @param parser  with the type of the file
    PatternCounter(LogSource source, LogLineParser parser, std::shared_ptr<LogRows const> rows);

    /// Makes Count() return soon, with what has been counted until then.
    void Stop() { m_isStopped = true; }

public Q_SLOTS:
    /// Counts, and emits counted() several times a second and at the end.
    void Count();

Q_SIGNALS:
    void counted(std::shared_ptr<Velocor::CountedPatterns const> const& patterns);

private:
    bool isThere(size_t row, QByteArray const& line) const;
    void add(PatternList& patterns, size_t row, QByteArray const& line, qint64 start);
    qint64 timeBelow(size_t row) const;
    void report(PatternList const& patterns, size_t rows);

    LogSource m_source;
    LogLineParser m_parser;
    std::shared_ptr<LogRows const> m_rows;
    std::atomic<bool> m_isStopped{false};
    HistoryClock m_clock;
    qint64 m_time =
        -1; // of the row above; of those before the first one of a run, the time of that
    bool m_isAtStart = true; // of a run
    bool m_isDated = true;
    size_t m_entries = 0;
};

} // namespace Velocor

Q_DECLARE_METATYPE(std::shared_ptr<Velocor::CountedPatterns const>)
