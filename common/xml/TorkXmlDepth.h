// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

/// The deepest nesting of elements that any reader of the family accepts; the root has depth 1.
///
/// The XML readers underneath call themselves once per open element, so a damaged or hostile file
/// of some ten kilobytes could exhaust the stack (on a 512 KiB thread from about 1,500 levels on).
/// No real file comes near this limit. What is deeper fails like any malformed document. Groups in
/// a document type are held to the same limit, see TorkXmlGuard.
constexpr int TorkXmlMaximumDepth = 1000;

/// The most entities that a document type may declare where TorkXmlGuard watches.
///
/// The XML reader compares each with all others, so some ten thousand would take it minutes.
constexpr int TorkXmlMaximumEntities = 1000;

/// The most characters that all references of a document may stand for where TorkXmlGuard watches.
///
/// Otherwise a file of 100 KB, half of it one entity and half of it references to that, would take
/// gigabytes of memory.
constexpr int TorkXmlMaximumExpansion = 16 * 1024 * 1024;
