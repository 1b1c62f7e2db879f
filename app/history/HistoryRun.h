// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogEntry.h"

#include <QtGlobal>

namespace Velocor {

/// One run of a program, as far as a file of its log still has it.
struct HistoryRun
{
    enum Exit {
        Unknown,  ///< nothing tells
        Normal,   ///< the program ended by itself, or with the session
        Abnormal, ///< it was killed or crashed, or the power failed
        Running   ///< it has not ended
    };

    size_t file = 0; ///< in LogHistory::files()
    size_t firstLine = 0;
    size_t endLine = 0; ///< the line after the last one
    bool isCut = false; ///< the next run has overwritten its first entries

    // Known after LogHistory::ReadTimes().
    qint64 start = -1; ///< time of the first entry, see HistoryCursor::time(); -1 without times
    qint64 end = -1;   ///< time of the last entry
    LogCounts counts{};

    Exit exit = Unknown; ///< known after LogHistory::ReadEnds()
};

} // namespace Velocor
