// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QtGlobal>

/// Converts one character as QString::toLatin1() does, for texts that are built without temporary
/// byte arrays. For the framework's own sources.
constexpr char TorkToLatin1(ushort character)
{
    return character > 0xff ? '?' : static_cast<char>(character);
}
