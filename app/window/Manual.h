// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

namespace Velocor {

/// Shows the installed manual in the program that the desktop has for such files.
///
/// @return false if it is not installed, or there is no such program
bool OpenManual();

} // namespace Velocor
