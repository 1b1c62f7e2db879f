// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

namespace Velocor {

/// What the running program's log writes, and where.
class RunningLog
{
public:
    /// Its path: of the open file, whatever the settings say by now, or of the one that the next
    /// entry opens. Empty if there is no log.
    static QString FileName();

    /// The format of its time stamps, as QDateTime::toString() takes it, and the text before its
    /// elapsed times, both as they are in force; without a log the log's defaults.
    static QString DateFormat();
    static QString ElapsedPrefix();
};

} // namespace Velocor
