// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogLineParser.h"

#include <QString>

namespace Velocor {

/// How a log says that it writes its lines. Any thread.
class LogFormats
{
public:
    /// A parser that knows the formats in the log's settings file, "logsettings.cfg" in the same
    /// folder, besides the default ones.
    static LogLineParser ParserFor(QString const& logFile);
};

} // namespace Velocor
