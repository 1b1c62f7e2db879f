// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/TorkExport.h"

#include <QString>

/// Encodes any text so that it survives in a configuration file, and decodes it again.
///
/// Only plain text survives being saved by TorkConfigFile: see its warning. Encode text that users
/// or other programs supply (file names, addresses, titles) when you write it, and decode it when
/// you read it. Every QString survives: NUL, line breaks, unpaired surrogates, and the empty text;
/// a null text becomes an empty one.
///
///     settings.WriteItem("Recent", TorkConfigText::EncodeName(user),
///                        TorkConfigText::EncodeValue(path));
///     settings.SaveAtomically();
///
///     QString none, stored;
///     if (settings.ReadItem("Recent", TorkConfigText::EncodeName(user), none, stored))
///         path = TorkConfigText::DecodeValue(stored);
///
/// Both encodings keep ASCII letters and digits, and write any UTF-16 code unit that they do not
/// keep as an escape character, "u", and four lowercase hexadecimal digits. The escape character
/// alone is the empty text.
///
/// - In a value the escape character is the backslash, and spaces and all ASCII punctuation except
///   % & ' < > " ] are kept too: `50% of C++` becomes `50\u0025 of C++`.
/// - In a name the escape character is "_", and "." and "-" are kept too; the first character is
///   kept only if it is a letter: `50% of C++` becomes
///   `_u00350_u0025_u0020of_u0020C_u002b_u002b`.
///
/// Different texts never get the same encoding. Nothing here depends on the locale. Any thread.
class TORK_EXPORT TorkConfigText
{
public:
    /// Whether a value survives in a file without encoding: at least one character, ASCII
    /// only, no "]]>", and no "%" or "%L" with a number from 0 to 3 after it.
    static bool IsPlainValue(QString const& text);

    /// Whether a section name or key survives in a file without encoding: ASCII letters, digits,
    /// "_", "-" and ".", starting with a letter or "_". The name of the file's root element does
    /// not survive although it is plain.
    static bool IsPlainName(QString const& text);

    /// Encodes a text for use as a value.
    static QString EncodeValue(QString const& text);

    /// Decodes what EncodeValue() returned.
    ///
    /// @param ok  set to whether `encoded` is a result of EncodeValue(); may be null
    /// @return the text; `encoded` itself if it is not a result of EncodeValue(), so values that
    ///         were stored without encoding are usually returned unchanged
    static QString DecodeValue(QString const& encoded, bool* ok = nullptr);

    /// Encodes a text for use as a section name or key, or as a value.
    ///
    /// The name of the default root element is encoded too, as an item of that name would not be
    /// loaded. A root element name of your own cannot collide if it contains "_" and a letter other
    /// than "u", which no encoded name does.
    static QString EncodeName(QString const& text);

    /// Decodes what EncodeName() returned. Parameters and result as for DecodeValue().
    static QString DecodeName(QString const& encoded, bool* ok = nullptr);
};
