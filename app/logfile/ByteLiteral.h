// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>

#include <array>

namespace Velocor {

/// A text to find in bytes, perhaps with ASCII letters in either case. A plain value; any thread.
///
///     ByteLiteral literal("disk full", true);
///     if (literal.IsIn(line, length))
class ByteLiteral
{
public:
    /// @param bytes  not empty
    /// @param isAnyCase  whether ASCII letters are found in upper and lower case
    ByteLiteral(QByteArray const& bytes, bool isAnyCase);

    int size() const { return m_bytes.size(); }

    /// The first place in [at, end) where the whole text is; `end` if there is none.
    char const* Find(char const* at, char const* end) const;

    bool IsIn(char const* text, int length) const
    {
        return Find(text, text + length) != text + length;
    }

    /// How often each byte occurs in some text.
    using Frequencies = std::array<int, 256>;

    /// Makes searching faster in texts that have bytes with similar frequencies.
    void Learn(Frequencies const& frequencies);

private:
    bool isAt(char const* text) const;
    bool mayBeginIn(char const* block) const;
    char const* findPlainly(char const* at, char const* end) const;
    unsigned frequencyOf(int index, Frequencies const& frequencies) const;

    QByteArray m_bytes; // in lower case if m_masks says so
    QByteArray m_masks; // what makes a byte of a text lower case: 0 if its case matters

    // The two bytes that are looked for first.
    int m_first = 0;
    int m_second = 0;
};

} // namespace Velocor
