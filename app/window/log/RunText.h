// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/RunHeading.h"

#include <QString>

namespace Velocor {

/// The heading of a run: whether it is folded, the program, when it ran, how it ended, and how many
/// warnings and errors it logged.
QString RunText(RunHeading const& run, QString const& program);

} // namespace Velocor
