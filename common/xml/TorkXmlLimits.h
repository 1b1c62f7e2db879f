// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

/// The limits of the family's XML readers. No real file comes near any of them; what is beyond one
/// fails like any malformed document, and the reason names the limit.
///
/// A program that writes documents of its own can keep to them:
///
///     if (depth >= TorkXmlMaximumDepth)
///         qWarning("Deeper than anything here could read again.");

/// The deepest nesting of elements that any reader accepts; the root has depth 1.
///
/// The XML readers underneath call themselves once per open element, so a damaged or hostile file
/// of some ten kilobytes could exhaust the stack (on a 512 KiB thread from about 1,500 levels on).
/// TorkXmlGuard holds the groups in a document type to the same limit.
constexpr int TorkXmlMaximumDepth = 1000;

/// The most entities that a document type may declare where TorkXmlGuard watches.
///
/// Qt's reader compares each with all others, so some ten thousand would take it minutes.
constexpr int TorkXmlMaximumEntities = 1000;

/// The most characters in the names and texts of all entities that a document type declares, where
/// TorkXmlGuard watches. A parameter entity that is referenced in a text counts as its replacement
/// text.
///
/// Qt's reader searches each text for each name, so a thousand long ones would take it many
/// seconds.
constexpr int TorkXmlMaximumEntityCharacters = 1024 * 1024;

/// The most characters that all references to declared entities may expand to, where TorkXmlGuard
/// watches.
///
/// Otherwise a file of 100 KB, half of it one entity and half of it references to that, would take
/// gigabytes of memory.
constexpr int TorkXmlMaximumExpansion = 16 * 1024 * 1024;

/// The most characters of entities that may be read again for their references, where TorkXmlGuard
/// watches: the references in an entity and what each of them expands to both count.
///
/// Entities that reference each other and expand to nothing would take hours without it.
constexpr int TorkXmlMaximumReplacement = 2 * TorkXmlMaximumExpansion;

/// The most namespace prefixes in force at one place: those that open elements declare, or use
/// without declaring them. One of 16 characters or more counts once more for each 16.
///
/// Qt's reader keeps a table of them for each open element.
constexpr int TorkXmlMaximumPrefixes = 256;

/// The most comparisons of namespace prefixes that all elements of a document may need: each
/// element, those from entities included, needs the square of the prefixes in force at it, counted
/// in the same way.
///
/// Qt's reader compares each of them with all others at the end of each empty element, so ten
/// kilobytes that declare some dozens and have millions of elements in entities would take it
/// minutes. It is enough for 65,536 elements below 64 prefixes, or 2.6 million below 10.
constexpr int TorkXmlMaximumPrefixComparisons = 256 * 1024 * 1024;
