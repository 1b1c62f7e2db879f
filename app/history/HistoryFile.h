// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogFilter.h"
#include "app/logfile/LogLineParser.h"
#include "app/logfile/LogRows.h"

#include <QFile>
#include <QString>

#include <memory>
#include <vector>

namespace Velocor {

/// One of the files of a log, as it is at one moment: its runs, and the rows that a filter shows.
///
/// The file stays open. So it is read to its end even if the log rotates meanwhile. One thread at a
/// time.
///
///     HistoryFile file;
///     if (file.Open(path) && file.Read(parser, filter))
///         use(file.rows());
class HistoryFile
{
public:
    /// Opens a file; pipes, devices and folders are refused.
    ///
    /// @return false if it cannot be opened; see error()
    bool Open(QString const& path);

    /// Finds the lines and runs of the open file, and those lines that match.
    ///
    /// @param parser  the encoding and whose file it is are found out
    /// @return false if it cannot be read or is compressed; see error()
    bool Read(LogLineParser const& parser, LogFilter const& filter);

    /// Keeps the same file open as another object, without its lines.
    void Share(HistoryFile const& other)
    {
        m_path = other.m_path;
        m_file = other.m_file;
    }

    /// Whether Open() succeeded.
    bool isOpen() const { return m_file && m_file->isOpen(); }

    QString const& path() const { return m_path; }

    /// Why it could not be opened or read, for users; empty if it could.
    QString const& error() const { return m_error; }

    /// Knows how to read the lines.
    LogLineParser const& parser() const { return m_parser; }

    /// The lines that the log view would show, in its order and with its headings.
    LogRows const& rows() const { return m_rows; }

    /// The first line of each run, in the order of the file: the newest run first.
    std::vector<size_t> const& runStarts() const { return m_runStarts; }

    /// See LogIndex::slowLine().
    size_t slowLine() const { return m_slowLine; }

    /// When the file was written last, as LogTimeReader::Stamp::key.
    qint64 modified() const { return m_modified; }

    /// The open file.
    std::shared_ptr<QFile> const& file() const { return m_file; }

    /// Whether this is still the file of that path, and not one that the log has moved away.
    bool IsInPlace() const;

private:
    QString m_path;
    QString m_error;
    std::shared_ptr<QFile> m_file;
    LogLineParser m_parser;
    LogRows m_rows;
    std::vector<size_t> m_runStarts;
    size_t m_slowLine = 0;
    qint64 m_modified = 0;
};

} // namespace Velocor
