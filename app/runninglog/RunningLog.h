// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

namespace Velocor {

/// The file and the formats of the running program's log.
class RunningLog
{
public:
    /// The path of the open file, whatever the settings are by now, or of the file that the next
    /// entry will open. Empty if there is no log.
    static QString FileName();

    /// The format of time stamps, for QDateTime::toString(), and the text before elapsed times,
    /// both as currently in effect; without a log, its defaults.
    static QString DateFormat();
    static QString ElapsedPrefix();
};

} // namespace Velocor
