// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/runninglog/RunningLog.h"

#include "common/log/TorkLog.h"

namespace Velocor {

QString RunningLog::FileName()
{
    TorkLog const* log = TorkLog::logger();
    return log ? log->currentLogFile() : QString();
}

QString RunningLog::DateFormat()
{
    TorkLog const* log = TorkLog::logger();
    return log ? log->dateTimeFormat() : TorkLog().dateTimeFormat();
}

QString RunningLog::ElapsedPrefix()
{
    TorkLog const* log = TorkLog::logger();
    return log ? log->elapsedTimePrefix() : TorkLog().elapsedTimePrefix();
}

} // namespace Velocor
