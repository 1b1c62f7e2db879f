// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

namespace Velocor {

/// What a bug report needs: versions, system, screens, directories, sizes, and the end of the log.
class SystemReport
{
public:
    /// All but the log, one fact a line.
    ///
    /// @param settingsFile  the window's settings file
    static QString Facts(QString const& settingsFile);

    /// The last lines of the current log, oldest first. Those of the newest run come last, whatever
    /// stands behind them in the file. The whole file is read to find them.
    ///
    /// Of a line longer than LogIndex::LineLimit bytes comes the start, followed by an ellipsis.
    static QString LogTail(int lines);

    /// Both under headings.
    static QString Whole(QString const& settingsFile);

    /// How many lines of the log a whole report has.
    static constexpr int TailLines = 200;
};

} // namespace Velocor
