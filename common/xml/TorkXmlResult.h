// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

/// The result codes of the XML classes.
namespace TorkXmlResult {
enum Code : int {
    Success = 0,        ///< of a writer's operation
    EmptyName = 1005,   ///< the element or attribute name is empty
    WriteFailed = 1006, ///< Write() reported a negative count
    NoParseState = 1016 ///< of a parse manager: no state knows the element
};
}
