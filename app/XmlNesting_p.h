// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

namespace Velocor {

/// Whether an XML text nests elements deeper than `limit`, counted without recursion.
///
/// rapidxml recurses once per open element, so check this before parsing. The scan follows the
/// rapidxml grammar and stops where rapidxml would: at the end of the text or at the first error.
/// Pure; any thread.
///
/// @param xml  zero-terminated, in an encoding that is a superset of ASCII
bool NestedDeeperThan(char const* xml, int limit);

} // namespace Velocor
