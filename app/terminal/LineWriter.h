// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogLineParser.h"
#include "app/terminal/OutputBuffer.h"
#include "app/terminal/TerminalOptions.h"

#include <QByteArray>
#include <QString>
#include <QStringList>

#include <memory>

namespace Velocor {

/// A line of a log and what is known about it. Refers to what it was made of.
struct PrintedLine
{
    QString const& program;
    QString const& path;
    LogLineParser const& parser;
    QByteArray const& bytes;     ///< as stored in the file, with its line end
    QByteArray const& content;   ///< the same without its line end
    LogEntry::Severity severity; ///< of its entry
    size_t number;               ///< in the file, starting at 1
    qint64 time;                 ///< see HistoryCursor::time()
};

/// Prints lines of logs in a format.
///
///     const auto writer = LineWriter::Make(options, isTerminal, names, output);
///     writer->Write(line);
///     writer->End();
class LineWriter
{
public:
    LineWriter() = default;
    virtual ~LineWriter() = default;
    LineWriter(LineWriter const&) = delete;
    LineWriter& operator=(LineWriter const&) = delete;

    /// @param isTerminal  whether people read the output as it is: in colors, and with symbols
    ///                    instead of characters that control a terminal
    /// @param names  of all programs, which make the column of programs as wide as it has to be
    /// @param output  must exist as long as the writer
    static std::unique_ptr<LineWriter> Make(TerminalOptions const& options, bool isTerminal,
                                            QStringList const& names, OutputBuffer& output);

    /// Prints a line. Only CSV and JSON need its time.
    virtual void Write(PrintedLine const& line) = 0;

    /// Prints what follows the last line.
    virtual void End() {}
};

} // namespace Velocor
