// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/HistoryRun.h"

#include <QByteArray>
#include <QString>

#include <vector>

namespace Velocor {

/// How a run of a program ended, as far as it is known.
struct RunEnd
{
    qint64 start = -1; ///< no entry of the run is earlier; see HistoryCursor::time()
    qint64 end = -1;   ///< no entry of the run is later
    HistoryRun::Exit exit = HistoryRun::Unknown;
};

/// What is known about the ends of a log's runs.
///
/// The log itself does not tell: a program writes no last entry. So each program that uses RunMark
/// has a mark while it runs, and when it ends, adds a line to a file next to the folder of the
/// logs. A mark of a program that is gone means that it could not do that. Any thread.
class RunEnds
{
public:
    /// Those of which there is a record or a mark.
    ///
    /// @param log  path of the current file
    static std::vector<RunEnd> Of(QString const& log);

    /// Sets the exit of each run of which it is certain.
    ///
    /// If several programs wrote to the log at the same time, a run may be that of any of them. It
    /// stays unknown unless they all ended alike or it is clear which of them it is.
    ///
    /// @param runs  of one log, with times
    static void Assign(std::vector<RunEnd> const& ends, std::vector<HistoryRun>& runs);

    /// How many of the last runs before a time, in a row, were killed or crashed no later than
    /// ShortRun after their start. Programs that are running do not count.
    static int ShortRunsBefore(std::vector<RunEnd> const& ends, qint64 start);

    /// The life of a run that ended soon after its start, in milliseconds.
    static constexpr qint64 ShortRun = 10000;

    /// The file with the records for a log. Empty if it is not in a folder "logs".
    static QString RecordFileOf(QString const& log);

    /// The folder with the marks for a log. Empty if it is not in a folder "logs".
    static QString MarkFolderOf(QString const& log);

    /// A record as a line of that file.
    static QByteArray Line(RunEnd const& end);

    /// What a line records.
    ///
    /// @return without a start if the line is damaged
    static RunEnd FromLine(QByteArray const& line);
};

} // namespace Velocor
