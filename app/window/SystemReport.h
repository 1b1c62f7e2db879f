// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

namespace Velocor {

/// Information for bug reports: versions, system, screens, directories, sizes, and the end of the
/// log.
class SystemReport
{
public:
    /// Everything but the log, one fact per line.
    ///
    /// @param settingsFile  the window's settings file
    static QString Facts(QString const& settingsFile);

    /// The licenses of the program and of what it uses, one per line.
    static QString Licenses();

    /// The last lines of the current log, oldest first. Those of the newest run come last, even if
    /// older ones follow in the file. The whole file is read to find them. If it has fewer lines,
    /// the last ones of the older files precede them.
    ///
    /// Lines longer than LineLimit bytes are cut and end with an ellipsis.
    static QString LogTail(int lines);

    /// The facts and the end of the log, with headings.
    static QString Whole(QString const& settingsFile);

    /// The longest line that LogTail() includes in full, in bytes.
    static constexpr int LineLimit = 64 * 1024;

    /// The number of log lines in Whole().
    static constexpr int TailLines = 200;
};

} // namespace Velocor
