// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/RunHeading.h"

#include <QString>

namespace Velocor {

/// The times of the first and of the last entry, with one date if both have the same; only the
/// first if they are equal, nothing without times.
QString TimesText(QString const& start, QString const& end);

/// The heading of a run: the program, when it ran, how it ended, and how many warnings and errors
/// it logged.
QString RunText(RunHeading const& run, QString const& program);

/// The same after an arrow, which shows whether the run is folded.
QString RunTextWithArrow(RunHeading const& run, QString const& program);

} // namespace Velocor
