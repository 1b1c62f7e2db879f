// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/HistoryFile.h"
#include "app/history/HistoryRun.h"

#include <QStringList>

#include <vector>

namespace Velocor {

/// All of one log: what its numbered files and its current file hold, as one list of runs.
///
/// Oldest first: the files from the highest number down to the current one, and in each file what
/// earlier runs left behind its seams before its newest run. One thread at a time.
///
///     LogHistory history(parser, filter);
///     history.ReadLog("/home/ada/.local/share/Tork/Notes/logs/notes.log");
///     HistoryCursor cursor(history, true);
///     while (cursor.Next())
///         print(cursor.content());
class LogHistory
{
public:
    explicit LogHistory(LogLineParser parser = LogLineParser(), LogFilter filter = LogFilter());

    /// Reads a log with its numbered files.
    ///
    /// If the log rotates while the files are opened, they are opened again, so that no line is
    /// missing. For a moment, though, a log that rotates has its newest file twice.
    ///
    /// @param path  the current file, which need not exist if there are numbered ones
    /// @return false if a file cannot be read; the others have been
    bool ReadLog(QString const& path);

    /// Reads exactly these files of a log.
    ///
    /// @param paths  the oldest first
    bool ReadFiles(QStringList const& paths);

    /// "PATH: what is wrong with it", for users, of each file that could not be read.
    QStringList const& errors() const { return m_errors; }

    /// Those that could be read.
    std::vector<HistoryFile> const& files() const { return m_files; }

    /// Oldest first. There are none without lines.
    std::vector<HistoryRun> const& runs() const { return m_runs; }

    /// The midnight from which a run's stamps without dates count; see HistoryClock.
    qint64 FirstDay(size_t run) const { return m_firstDays[run]; }

    /// Finds out when the runs began and ended, and what they logged, which takes as long as
    /// reading all files again.
    void ReadTimes();

    /// Finds out how the runs ended, as far as RunEnds tells. After ReadTimes().
    ///
    /// @param path  the current file of the log, even if only others have been read
    void ReadEnds(QString const& path);

private:
    void open(QStringList const& paths);
    bool isInPlace() const;
    bool readOpenFiles();
    void addRuns(size_t file);
    void findFirstDays();
    qint64 findFirstDay(size_t run, qint64& latest) const;

    LogLineParser m_parser;
    LogFilter m_filter;
    std::vector<HistoryFile> m_files;
    std::vector<HistoryRun> m_runs;
    std::vector<qint64> m_firstDays;
    QStringList m_errors;
};

} // namespace Velocor
