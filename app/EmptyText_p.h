// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

namespace Velocor {

/// The empty text that is not null, for what the frame hands out: callers keep it in settings, and
/// TorkConfigFile::WriteItem() refuses a null text and would keep the old one.
constexpr QLatin1String EmptyText("", 0);

} // namespace Velocor
