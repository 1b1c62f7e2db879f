// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QtGlobal>

/// Marks what the shared library exports; everything else in it is hidden. Empty with the static
/// library. TORK_SHARED comes from the CMake package or pkg-config.
#if !defined(TORK_SHARED)
#define TORK_EXPORT
#elif defined(TORK_BUILDING)
#define TORK_EXPORT Q_DECL_EXPORT
#else
#define TORK_EXPORT Q_DECL_IMPORT
#endif
