// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

namespace Velocor {

/// Whether a byte of a log file is one of the digits 0 to 9, in every locale. Pure, any thread.
constexpr bool IsAsciiDigit(char c)
{
    return c >= '0' && c <= '9';
}

/// Whether a byte of a log file is one of the letters A to Z or a to z. Pure, any thread.
constexpr bool IsAsciiLetter(char c)
{
    return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z');
}

} // namespace Velocor
