// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

/// The version of these headers as a number that grows, 0xMMNNPP: major, minor and patch.
///
///     #if TORK_VERSION >= 0x000200
#define TORK_VERSION 0x000100

/// The same as text.
#define TORK_VERSION_STR "0.1.0"
