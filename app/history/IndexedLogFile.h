// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/HistoryFile.h"
#include "app/logfile/LogIndex.h"
#include "app/logfile/OlderLogFiles.h"

#include <QDateTime>

#include <functional>

namespace Velocor {

/// An older file of a log with an index of its lines, to be searched for one text after the other.
/// One thread at a time.
class IndexedLogFile
{
public:
    /// @return false if it cannot be opened
    bool Open(QString const& path);

    /// Finds the lines of the file, as far as it went when it was opened, and those that match.
    ///
    /// @param parser  knows the type of the file
    /// @param goesOn  called now and then; false stops reading
    /// @return false if it was stopped
    bool Read(LogLineParser const& parser, LogFilter const& filter,
              std::function<bool()> const& goesOn);

    /// Finds the lines that match another filter.
    ///
    /// @param files  have this file
    /// @param start  of the file among their bytes
    /// @return false if it was stopped; then, only Read() may follow, or this again with another
    ///         text
    bool Search(OlderLogFiles const& files, qint64 start, LogFilter const& filter,
                std::function<bool()> const& goesOn);

    /// Takes a table with the same lines instead of its own, because it shares memory with others.
    void TakeLines(LineTable const& lines);

    /// Finds the rows of a filter with the same text.
    void MakeRows(LogFilter const& filter) { m_rows = m_index.Rows(filter); }

    QString const& path() const { return m_file.path(); }
    std::shared_ptr<QFile> const& file() const { return m_file.file(); }
    qint64 size() const { return m_size; }
    LogIndex const& index() const { return m_index; }
    LogRows const& rows() const { return m_rows; }

    /// A line end, if the last line lacks it.
    QByteArray Separator() const;

    /// Whether the file is still what it was, under the same name.
    bool IsUnchanged() const;

    /// Tells files apart, whatever their names; 0 if there is none.
    static quint64 IdentityOf(QString const& path);

private:
    HistoryFile m_file;
    qint64 m_size = 0;      // of what is read
    qint64 m_wholeSize = 0; // when it was opened
    QDateTime m_modified;
    LogIndex m_index;
    LogRows m_rows;
    LogLineEnd m_lineEnd;
};

} // namespace Velocor
