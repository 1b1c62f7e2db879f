// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

/// Turns any text into one that a configuration file gives back, and back again.
///
/// What TorkConfigFile saves comes back only if it is plain: see its warning. Text that users or
/// other programs supply (file names, addresses, titles) goes through this class on its way into
/// the file and on its way out. Every QString survives: NUL, line breaks, unpaired surrogates, and
/// the empty text; a null text comes back as an empty one.
///
///     settings.WriteItem("Recent", TorkConfigText::EncodeName(user),
///                        TorkConfigText::EncodeValue(path));
///     settings.SaveAtomically();
///
///     QString none, stored;
///     if (settings.ReadItem("Recent", TorkConfigText::EncodeName(user), none, stored))
///         path = TorkConfigText::DecodeValue(stored);
///
/// Both encodings keep ASCII letters and digits, and write a UTF-16 unit that they do not keep as
/// an escape character, "u", and four hexadecimal digits in lower case. The escape character alone
/// is the empty text.
///
/// - In a value the escape character is the backslash, and the space and all ASCII signs but
///   % & ' < > " ] stay too: `50% of C++` becomes `50\u0025 of C++`.
/// - In a name the escape character is "_", and "." and "-" stay too; what is first stays only if
///   it is a letter: `50% of C++` becomes `_u00350_u0025_u0020of_u0020C_u002b_u002b`.
///
/// Different texts never get the same encoding. Nothing here depends on the locale. Any thread.
class TorkConfigText
{
public:
    /// Whether a file gives a value back as it is, without encoding: at least one character, ASCII
    /// only, no "]]>", and no "%" or "%L" with a number from 0 to 3 after it.
    static bool IsPlainValue(QString const& text);

    /// Whether a file gives a section name or key back as it is, without encoding: ASCII letters,
    /// digits, "_", "-" and ".", with a letter or "_" first. The name of the file's root element
    /// does not come back although it is plain.
    static bool IsPlainName(QString const& text);

    /// Encodes a text for the place of a value.
    static QString EncodeValue(QString const& text);

    /// Decodes what EncodeValue() made.
    ///
    /// @param ok  receives whether EncodeValue() can have made `encoded`; may be null
    /// @return the text; `encoded` itself if EncodeValue() cannot have made it, so values that were
    ///         stored without encoding usually come back as they are
    static QString DecodeValue(QString const& encoded, bool* ok = nullptr);

    /// Encodes a text for the place of a section name or a key, or of a value.
    ///
    /// The name of the default root element is encoded too, as an item of that name would not be
    /// loaded. A root element name of your own is safe from this if it holds "_" and a letter other
    /// than "u", which no encoded name does.
    static QString EncodeName(QString const& text);

    /// Decodes what EncodeName() made. Parameters and result as for DecodeValue().
    static QString DecodeName(QString const& encoded, bool* ok = nullptr);
};
