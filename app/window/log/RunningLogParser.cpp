// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/RunningLogParser.h"

#include "app/runninglog/LogPreferences.h"

namespace Velocor {

LogLineParser RunningLogParser()
{
    const LogPreferences preferences = LogPreferences::Read();
    return LogLineParser({preferences.dateFormat}, {preferences.elapsedPrefix});
}

} // namespace Velocor
