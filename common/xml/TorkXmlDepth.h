// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

/// The deepest nesting of elements that any reader of the family accepts; the root has depth 1.
///
/// The XML readers underneath call themselves once per open element, so a damaged or hostile file
/// of some ten kilobytes could exhaust the stack (on a 512 KiB thread from about 1,500 levels on).
/// No real file comes near this limit. What is deeper fails like any malformed document.
constexpr int TorkXmlMaximumDepth = 1000;
