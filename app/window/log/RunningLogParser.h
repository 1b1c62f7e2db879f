// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogLineParser.h"

namespace Velocor {

/// A parser for what the log of this run writes, in the format that is in force. GUI thread.
LogLineParser RunningLogParser();

} // namespace Velocor
