// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogLineParser.h"
#include "app/logfile/LogLineReader.h"
#include "app/logfile/LogRows.h"
#include "app/logfile/LogSource.h"
#include "app/logfile/LogSpan.h"

#include <functional>
#include <memory>
#include <vector>

namespace Velocor {

/// Keeps those rows of a log view whose entries are in a span of time.
///
/// Times are those of HistoryCursor::time(): a line without a stamp has the time of the line above,
/// and those before the first stamp of a run have the time of that. While a log grows at its end,
/// only its new lines are read. One thread at a time.
///
///     RowsInSpan rowsInSpan([] { return true; });
///     rows = rowsInSpan.Of(*update.rows, runs, source, parser, filter.span());
class RowsInSpan
{
public:
    /// The lines of a run, up to the one before `endLine`.
    struct Run
    {
        size_t firstLine;
        size_t endLine;
        qint64 modified; ///< when its file was written last, as LogTimeReader::Stamp::key
    };

    /// @param goesOn  asked now and then; false cancels
    explicit RowsInSpan(std::function<bool()> goesOn) : m_goesOn(std::move(goesOn)) {}

    /// The rows in a span. Context stays context; a heading goes with the last of its rows.
    ///
    /// @param runs  oldest first, with all lines of the rows
    /// @param parser  knows the type of the file
    /// @return null if it was canceled
    std::shared_ptr<LogRows const> Of(LogRows const& rows, std::vector<Run> const& runs,
                                      LogSource const& source, LogLineParser const& parser,
                                      LogSpan const& span);

    /// Frees what it knows of lines.
    void Forget();

private:
    bool read(LogRows const& rows, std::vector<Run> const& runs);
    bool readRun(Run const& run, qint64 firstDay, size_t known);
    size_t countKnown(LineTable const& lines, std::vector<Run> const& runs) const;
    qint64 findFirstDay(Run const& run, qint64& latest);
    LogLineParser::Parts partsOf(size_t line);
    bool isTimed(size_t line) const { return m_lines.mark(line) & LogRows::Timed; }
    LogRows select(LogRows const& rows) const;

    std::function<bool()> m_goesOn;
    LogSource m_source = QString();
    LogSpan m_span;
    LogLineParser m_parser;
    LogLineReader m_reader;
    LineTable m_lines;
    std::vector<Run> m_runs;
    std::vector<bool> m_isIn; // for each line
    bool m_isDated = true;    // all stamps so far have dates
};

} // namespace Velocor
