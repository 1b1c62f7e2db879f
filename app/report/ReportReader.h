// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/report/ReportPart.h"

#include <QString>
#include <QStringList>

namespace Velocor {

/// Reads what a report can have, as it is: a Redactor comes later. Any thread.
class ReportReader
{
public:
    /// The versions of the program, of Qt and of the system, one per line, as far as they are known
    /// without a display.
    static QString Versions();

    /// The identity and the folders of the program, one per line.
    static QString Places();

    /// A part with settings files. Those that do not exist are left out, and so are the values
    /// whose names look secret.
    static ReportPart Settings(QString const& title, QStringList const& paths);

    /// Parts of a log: how its last two runs ended, with the end of each in a file; and the last
    /// problems of the log with the entries around them.
    ///
    /// @param path  the current file; an empty one has no runs
    static QList<ReportPart> Log(QString const& path);

    /// The last lines of the last run of a log that did not end normally; of the run before the
    /// last one if it is not known which that is, and empty if there is none.
    static QString EndOfAbnormalRun(QString const& path);

    /// The text of a settings file without the values whose names look secret. Where an element
    /// does not end, the rest of the text counts as its value.
    static QString WithoutSecretValues(QString const& text);

    static constexpr int MaximumRunLines = 2000;    ///< of each run
    static constexpr int LastLines = 200;           ///< of a run that did not end normally
    static constexpr int MaximumProblems = 50;      ///< in a report
    static constexpr int EntriesAround = 10;        ///< before and after each problem
    static constexpr int LineLimit = 64 * 1024;     ///< longer lines are cut, in bytes
    static constexpr int MaximumFileSize = 1 << 20; ///< of a settings file, in bytes
};

} // namespace Velocor
