// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <cstddef>

namespace Velocor {

/// Rows of the log view, the first one to the one before `end`, whose entries repeat each other.
struct RepeatGroup
{
    size_t first;
    size_t end;
    size_t entries; ///< at least two; an entry may have several rows
};

} // namespace Velocor
