// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

/// The empty text that is not null. For the framework's own sources.
///
/// TorkConfigFile::WriteItem() refuses a null text, so a null one would leave the old value in a
/// settings file. Callers store what the framework returns: where it has no text, it is this one.
inline QString TorkEmptyText()
{
    return QStringLiteral(""); // clazy:exclude=empty-qstringliteral
}
