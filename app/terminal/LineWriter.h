// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/HistoryCursor.h"
#include "app/terminal/OutputBuffer.h"
#include "app/terminal/TerminalOptions.h"

#include <memory>

namespace Velocor {

/// Prints lines of logs in a format.
///
///     const auto writer = LineWriter::Make(options, isTerminal, names, output);
///     while (cursor.Next())
///         writer->Write(name, cursor);
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

    /// Prints the current line of a cursor, which needs times unless the format is text or
    /// markdown.
    virtual void Write(QString const& program, HistoryCursor& cursor) = 0;

    /// Prints what follows the last line.
    virtual void End() {}
};

} // namespace Velocor
