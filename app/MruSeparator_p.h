// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QChar>

namespace Velocor {

/// Separates the entries of a most-recently-used list; see AppUtils.
constexpr QLatin1Char MruSeparator('|');

} // namespace Velocor
