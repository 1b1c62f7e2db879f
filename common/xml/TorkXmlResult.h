// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

/// The result codes of the XML classes. 0 is success.
///
/// Write() of both writers reports no failure, so WriteFailed only comes from a class that
/// overrides it; to learn of a full disk, ask the device, or TorkXmlFile::errorString().
///
///     if (writer.WriteAttribute(name, value) == TorkXmlResult::EmptyName)
///         qWarning("An attribute without a name was left out.");
namespace TorkXmlResult {
enum Code : int {
    Success = 0,        ///< of a writer's operation
    EmptyName = 1005,   ///< the element or attribute name is empty
    WriteFailed = 1006, ///< Write() reported a negative count
    NoParseState = 1016 ///< of a parse manager: no state knows the element
};
}
