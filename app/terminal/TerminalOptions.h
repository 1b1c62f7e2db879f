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
    qint64 since = -1; ///< time of an entry, as HistoryCursor::time(); -1: no limit
    qint64 until = -1;
    bool isMerged = false;
    bool follows = false;
    bool showsRuns = false;
    bool showsPatterns = false;
    bool showsProgram = false;
    Format format = Text;

    QByteArray answer; ///< to --help and --version: print only this
    QString error;     ///< why the command line is wrong, for users; empty if it is right

    bool hasTimes() const { return since >= 0 || until >= 0; }

    /// Reads a command line, whose first argument is the name of the program.
    static TerminalOptions Parse(QStringList const& arguments);
};

} // namespace Velocor
