// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QString>

namespace Velocor {

/// The bytes of a settings file as text to be edited, and back: UTF-8 or, for bytes that are not,
/// Latin-1, with line feeds as the only line breaks. A plain record.
///
///     SettingsText file = SettingsText::Of(bytes);
///     if (file.FirstUnwritable(edited) < 0)
///         bytes = file.ToBytes(edited);
struct SettingsText
{
    QString text;
    bool isLatin1 = false;
    bool hasMark = false;            ///< whether the bytes start with a byte order mark
    bool hasCarriageReturns = false; ///< whether a carriage return precedes every line feed

    static SettingsText Of(QByteArray const& bytes);

    /// A text in the same encoding, and with the same line breaks. For the text itself, the bytes
    /// that it was made from.
    QByteArray ToBytes(QString const& edited) const;

    /// The position of the first character that the encoding lacks; -1 if there is none.
    int FirstUnwritable(QString const& edited) const;
};

} // namespace Velocor
