// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/HistoryClock.h"
#include "app/history/HistoryLines.h"
#include "app/history/LogHistory.h"

#include <QByteArray>

#include <optional>

namespace Velocor {

/// Goes through the lines of a log that its filter shows, oldest run first.
///
/// Lines are read as it goes, so memory does not grow with their number. One thread at a time.
///
///     HistoryCursor cursor(history, false);
///     while (cursor.Next())
///         print(cursor.content());
class HistoryCursor
{
public:
    /// @param history  must exist, unchanged, as long as this
    /// @param withTimes  whether time() and key() are needed: all lines are then read for them, not
    ///                   only those that are shown
    HistoryCursor(LogHistory const& history, bool withTimes);

    /// Proceeds to the next line. Lines that the log has overwritten since they were found are left
    /// out.
    ///
    /// @return false if there are no more
    bool Next();

    /// The line without its line end, as stored in the file.
    ///
    /// @return valid until the next call of Next()
    QByteArray const& content() const { return m_lines->content(); }

    /// The same with its line end, which the last line of a file may lack.
    QByteArray const& bytes() const { return m_lines->bytes(); }

    HistoryRun const& run() const { return m_history->runs()[m_run]; }
    HistoryFile const& file() const { return m_lines->file(); }
    size_t line() const { return m_line; } ///< its number in the file, starting at 0
    LogEntry::Severity severity() const { return m_lines->severity(m_line); } ///< of its entry

    /// Where the line starts in the file, and the one after it.
    qint64 start() { return m_lines->start(m_line); }
    qint64 end() { return m_lines->start(m_line + 1); }

    /// The time of the line's entry, counted as LogTimeReader::Stamp::key; -1 if it is unknown.
    ///
    /// A line without a stamp has the time of the line above; those before the first stamp of a run
    /// have the time of that.
    qint64 time() const { return m_time; }

    /// The position among lines of other logs: the latest time up to this line. While a clock that
    /// was set back catches up, lines thus keep the order in which they were written. In a log
    /// without any times, it is the time when the file was written last.
    qint64 key() const { return m_key; }

private:
    bool enterRun();
    size_t nextShownLine();
    void noteTime(size_t line, QByteArray const& content);
    void findFirstTime();

    LogHistory const* m_history;
    bool m_withTimes;
    size_t m_run = 0;
    bool m_isInRun = false;
    std::optional<HistoryLines> m_lines; // of the file that the run is in
    size_t m_row = 0;                    // the next one of that file
    size_t m_timed = 0;                  // the next line whose time has not been noted
    HistoryClock m_clock;

    size_t m_line = 0;
    qint64 m_time = -1;
    qint64 m_key = -1;
};

} // namespace Velocor
