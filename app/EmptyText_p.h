// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

namespace Velocor {

/// The empty text that is not null, for what the frame returns: callers keep it in settings, and
/// TorkConfigFile::WriteItem() refuses a null text and would keep the old one.
inline QString EmptyText()
{
    return QStringLiteral(""); // clazy:exclude=empty-qstringliteral
}

} // namespace Velocor
