// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

namespace Velocor {

/// Whether an XML text nests elements deeper than `limit`, counted without recursion.
///
/// rapidxml calls itself once per open element, so this is asked before it gets to see a text. The
/// scan follows its grammar and stops where it would stop: at the end of the text or at the first
/// thing that it rejects. Pure, any thread.
///
/// @param xml  zero-terminated, in an encoding that leaves ASCII alone
bool NestedDeeperThan(char const* xml, int limit);

} // namespace Velocor
