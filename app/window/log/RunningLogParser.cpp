// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/RunningLogParser.h"

#include "app/runninglog/RunningLog.h"

namespace Velocor {

LogLineParser RunningLogParser()
{
    return LogLineParser({RunningLog::DateFormat()}, {RunningLog::ElapsedPrefix()});
}

} // namespace Velocor
