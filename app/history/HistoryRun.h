// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogEntry.h"

#include <QtGlobal>

namespace Velocor {

/// One run of a program, as far as a file of its log still has it.
struct HistoryRun
{
    size_t file = 0; ///< in LogHistory::files()
    size_t firstLine = 0;
    size_t endLine = 0; ///< the line after the last one
    bool isCut = false; ///< the next run has overwritten its first entries

    // Known after LogHistory::ReadTimes().
    qint64 start = -1; ///< time of the first entry, see HistoryLine::time; -1 without times
    qint64 end = -1;   ///< time of the last entry
    LogCounts counts{};
};

} // namespace Velocor
