// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/HistoryBytes.h"
#include "app/history/HistoryFile.h"
#include "app/logfile/LineTable.h"
#include "app/logfile/LogLineParser.h"

#include <QByteArray>

namespace Velocor {

/// The lines of a file by their numbers, starting at 0. Quick for lines in the order of the file.
/// One thread at a time.
class HistoryLines
{
public:
    /// @param file  must exist, unchanged, as long as this
    explicit HistoryLines(HistoryFile const& file);

    size_t size() const { return m_lines->size(); }
    quint8 mark(size_t line) const { return m_lines->mark(line); }
    LogEntry::Severity severity(size_t line) const
    {
        return static_cast<LogEntry::Severity>(mark(line) & LogRows::SeverityMask);
    }

    /// Where a line starts in the file; where the file ended for the line after the last one.
    qint64 start(size_t line);

    /// A line without its line end, as stored in the file; at most LogIndex::LineLimit bytes.
    ///
    /// @return refers to memory of this object: valid until the next call
    QByteArray const& Content(size_t line);

    /// The last Content().
    QByteArray const& content() const { return m_content; }

    /// The same with its line end, which the last line may lack.
    QByteArray const& bytes() const { return m_line; }

    /// Whether a line is the one that was indexed, so that the log has not overwritten it since.
    bool IsSame(size_t line, QByteArray const& content) const;

    /// The time, severity and so on of a line.
    LogLineParser::Parts Parts(QByteArray const& content);

    HistoryFile const& file() const { return *m_file; }

private:
    HistoryFile const* m_file;
    LineTable const* m_lines;
    LineTable::Reader m_starts;
    HistoryBytes m_bytes;
    QByteArray m_line; // always the same objects, so that a line takes no memory
    QByteArray m_content;
    LogLineEnd m_lineEnd;
    LogLineParser::Beginnings m_beginnings;
};

} // namespace Velocor
