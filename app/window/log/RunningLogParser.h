// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogLineParser.h"

namespace Velocor {

/// A parser for the current format of the running program's log. GUI thread.
LogLineParser RunningLogParser();

} // namespace Velocor
