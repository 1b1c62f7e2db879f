// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

/// The result codes of the XML writers' operations. 0 is success.
///
/// Write() of both writers reports no failure, so WriteFailed only comes from a class that
/// overrides it; to learn of a full disk, ask the device, or TorkXmlFile::errorString().
///
///     if (writer.WriteAttribute(name, value) == TorkXmlResult::EmptyName)
///         qWarning("An attribute without a name was left out.");
namespace TorkXmlResult {
enum Code : int {
    Success = 0,
    EmptyName = 1005,   ///< the element or attribute name is empty
    WriteFailed = 1006, ///< Write() reported a negative count
};
}

/// Where an XML writer stands: what each of the two writers keeps between calls.
struct TorkXmlLayout
{
    /// Indentation units before a tag that starts a line; may become negative.
    qint32 level = 0;

    /// What one level of indentation looks like.
    QString unit = QStringLiteral("  ");

    /// The attributes of the start tag that is open, and its closing characters, until they are
    /// written.
    QString pending = QLatin1String("");

    /// Memory for the next tag, kept from the last one.
    QString tag;
};
