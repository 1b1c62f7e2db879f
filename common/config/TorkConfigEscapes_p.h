// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

/// Replaces each `escape`, "u" and four hexadecimal digits by their UTF-16 code unit, and leaves
/// everything else unchanged. Pure; any thread.
///
/// For TorkConfigText, which also rejects what it has not encoded itself, and for values that
/// earlier versions of the program have escaped differently. Inline, as the shared library does not
/// export it.
inline QString TorkUnescaped(QLatin1Char escape, QString const& text)
{
    constexpr int HexDigits = 4;

    QString unescaped;
    for (int i = 0; i < text.length(); ++i) {
        bool isHex = false;
        ushort unit = 0;
        if (text.at(i) == escape && text.mid(i + 1, 1) == QLatin1String("u"))
            unit = text.mid(i + 2, HexDigits).toUShort(&isHex, 16);
        unescaped += isHex ? QChar(unit) : text.at(i);
        if (isHex)
            i += 1 + HexDigits;
    }
    return unescaped;
}
