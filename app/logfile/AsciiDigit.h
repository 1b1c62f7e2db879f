// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

namespace Velocor {

/// Whether a byte of a log file is one of the digits 0 to 9, in every locale. Pure, any thread.
constexpr bool IsAsciiDigit(char c)
{
    return c >= '0' && c <= '9';
}

} // namespace Velocor
