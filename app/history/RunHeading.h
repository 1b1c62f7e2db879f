// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/HistoryRun.h"

#include <QString>

namespace Velocor {

/// What the heading of a run tells.
struct RunHeading
{
    quint64 id = 0; ///< the same for a run while it grows, is written over, or its file is renamed
    QString start;  ///< the stamp of the first entry, as written; empty without times
    QString end;    ///< that of the last one
    HistoryRun::Exit exit = HistoryRun::Unknown;
    size_t warnings = 0;
    size_t errors = 0; ///< and worse
    bool isFolded = false;
};

} // namespace Velocor
