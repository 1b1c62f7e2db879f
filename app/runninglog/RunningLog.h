// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

namespace Velocor {

/// The file that the running program's log writes to.
class RunningLog
{
public:
    /// Its path; empty if there is no log.
    ///
    /// The log opens its file when it makes its first entry, which tells of the loading of its
    /// settings, and keeps it open. A name that those settings change is therefore not the open
    /// file's: as long as nothing of that name is there, the log file that was written last is
    /// meant.
    static QString FileName();
};

} // namespace Velocor
