// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/HistoryRun.h"
#include "app/history/RunHeading.h"
#include "app/logfile/LogLineParser.h"
#include "app/logfile/LogRows.h"
#include "app/logfile/LogSource.h"

#include <QSet>

#include <vector>

namespace Velocor {

/// The runs of a log with their headings, oldest first, and the rows that show them. A plain value.
class RunList
{
public:
    size_t size() const { return m_runs.size(); }
    bool isEmpty() const { return m_runs.empty(); }

    std::vector<HistoryRun>& runs() { return m_runs; }
    std::vector<HistoryRun> const& runs() const { return m_runs; }
    std::vector<RunHeading>& headings() { return m_headings; }
    std::vector<RunHeading> const& headings() const { return m_headings; }

    /// Adds the runs of a file.
    ///
    /// @param starts  as LogIndex::RunStarts()
    /// @param first, end  the lines of the file among all lines
    /// @param file  as IndexedLogFile::IdentityOf()
    void Add(std::vector<size_t> const& starts, size_t first, size_t end, quint64 file);

    /// The entries of a run by severity.
    ///
    /// @param lines  of all files
    LogCounts CountsOf(size_t run, LineTable const& lines) const;

    /// Tells the heading of a run how many problems there are.
    void NoteCounts(size_t run, LogCounts const& counts);

    /// Reads when runs started and ended. Runs without times, and those of a log that cannot be
    /// read, stay as they are.
    ///
    /// @param first  the first run to do this for
    /// @param lines  of all files
    void NoteTimes(size_t first, LineTable const& lines, LogSource const& source,
                   LogLineParser const& parser);

    /// Adds the rows of the runs that the newest one of a file has written over.
    ///
    /// @param run  the number of the first one; is increased by how many there are
    /// @param from, starts  of the file
    /// @param offset  the first line of the file among all lines
    /// @param folded  the runs of which only the heading is shown, as RunHeading::id
    void AddEarlierRows(size_t& run, LogRows const& from, std::vector<size_t> const& starts,
                        size_t offset, QSet<quint64> const& folded, LogRows& rows) const;

    /// Adds the rows of the newest run of an older file. The parameters are as above.
    void AddNewestRows(size_t run, LogRows const& from, size_t offset, QSet<quint64> const& folded,
                       LogRows& rows) const;

private:
    std::vector<HistoryRun> m_runs;
    std::vector<RunHeading> m_headings;
};

} // namespace Velocor
