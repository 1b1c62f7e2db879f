// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogFilter.h"

#include <QByteArray>
#include <QString>
#include <QStringList>

namespace Velocor {

/// What the command line of velocor-log asks for. A plain record.
struct TerminalOptions
{
    enum Format { Text, Markdown, Csv, Json };

    QStringList names; ///< of files and programs; "-" is standard input
    LogFilter filter;
    LogSpan span; ///< of times as HistoryCursor::time() gives them
    bool isMerged = false;
    bool follows = false;
    bool showsRuns = false;
    bool showsPatterns = false;
    bool showsProgram = false;
    Format format = Text;

    QByteArray answer; ///< to --help and --version: print only this
    QString error;     ///< why the command line is wrong, for users; empty if it is right

    /// Reads a command line, whose first argument is the name of the program.
    static TerminalOptions Parse(QStringList const& arguments);
};

} // namespace Velocor
