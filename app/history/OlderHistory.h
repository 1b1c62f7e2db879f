// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/HistoryUpdate.h"
#include "app/history/IndexedLogFile.h"
#include "app/history/RunList.h"
#include "app/logfile/LogFilter.h"
#include "app/logfile/LogLineParser.h"

#include <QSet>
#include <QStringList>

#include <functional>
#include <memory>
#include <vector>

namespace Velocor {

/// The older files of a log, read for a view: their lines in one table, their runs with headings,
/// and the rows that match a filter. They are read again only when that is asked for. One thread at
/// a time.
class OlderHistory
{
public:
    /// @param goesOn  called now and then; false stops reading
    /// @param progressed  told how much of the log has been read, in percent
    OlderHistory(std::function<bool()> goesOn, std::function<void(int)> progressed);

    /// Starts with another log, without reading more of it than tells its type.
    ///
    /// @param path  the current file, which need not exist
    void Open(QString const& path, LogLineParser const& parser, LogFilter const& filter);

    /// Forgets the log.
    void Close();

    void SetFilter(LogFilter const& filter);

    /// Takes another type for all files, which makes Prepare() read them again.
    void SetFileType(LogFileType const& type);

    /// Makes Prepare() read the files again.
    void ReadAgain();

    /// Whether files have come, gone or changed since they were read.
    bool IsChanged() const;

    /// Does what is missing to know the rows.
    ///
    /// @param folded  as RunList::AddEarlierRows()
    /// @return false if it was stopped; then, the rows are not known
    bool Prepare(QSet<quint64> const& folded);

    /// Makes the rows again, if they are known, for other folded runs.
    void Fold(QSet<quint64> const& folded);

    /// Whether the rows, and all else, are known.
    bool isPrepared() const { return m_hasRows; }

    LogLineParser const& parser() const { return m_parser; } ///< with the type of all files
    LineTable const& lines() const { return m_lines; }
    LogRows const& rows() const { return m_rows; }
    RunList const& runs() const { return m_runs; }

    /// Another one whenever the files have been read again.
    std::shared_ptr<OlderLogFiles const> const& files() const { return m_older; }

    /// How much of the log these files are, as far as they have been read.
    int percent() const { return m_percent; }

    /// Adds what is known about these files to that about the current one.
    void AddTo(HistoryUpdate& update) const;

private:
    void forget();
    QStringList list() const;
    void openFiles();
    bool read();
    bool search();
    void reportProgress(qint64 done, qint64 total);
    void joinLines();
    void joinRuns();
    size_t endOfFile(size_t file) const;
    void makeRows(QSet<quint64> const& folded);

    std::function<bool()> m_goesOn;
    std::function<void(int)> m_progressed;
    QString m_path;
    LogLineParser m_parser;
    LogFilter m_filter;

    std::vector<IndexedLogFile> m_files; // oldest first
    std::vector<size_t> m_firstLines;    // of each, in the table
    QStringList m_listed;                // also those that cannot be read
    QStringList m_unreadable;
    std::shared_ptr<OlderLogFiles const> m_older;
    bool m_isRead = false;
    bool m_isSearched = false; // for the text of the filter
    bool m_hasRows = false;
    int m_percent = 0;
    LineTable m_lines;
    RunList m_runs;
    LogRows m_rows;
};

} // namespace Velocor
