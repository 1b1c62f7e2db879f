// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QtGlobal>

namespace Velocor {

/// Intervals in milliseconds, as the time keys of log entries count them.
namespace Milliseconds {

constexpr qint64 Second = 1000;
constexpr qint64 Minute = 60 * Second;
constexpr qint64 Hour = 60 * Minute;
constexpr qint64 Day = 24 * Hour;

} // namespace Milliseconds

} // namespace Velocor
