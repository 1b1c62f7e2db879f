// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QString>

#include <cstring>

namespace Velocor {

/// The encoding of a log file. A plain value; any thread.
///
///     LogEncoding encoding = LogEncoding::Detect(file.read(65536));
///     QString text = encoding.Decode(line, length);
class LogEncoding
{
public:
    enum Kind {
        Automatic, ///< not known yet, treated as Latin-1
        Latin1,
        Utf8,
        Utf16Le,
        Utf16Be
    };

    // cppcheck-suppress noExplicitConstructor ; a kind is all that an encoding is
    LogEncoding(Kind kind = Latin1) : m_kind(kind) {} // NOLINT(google-explicit-constructor)
    Kind kind() const { return m_kind; }

    /// Whether a character takes at least two bytes.
    bool isWide() const { return m_kind == Utf16Le || m_kind == Utf16Be; }

    /// The encoding that the start of a file says it has, by a byte order mark or, in UTF-16, by
    /// its many zero bytes; Automatic if it says nothing.
    static LogEncoding Declared(QByteArray const& head);

    /// As Declared(), but guesses otherwise: UTF-8 if the text is valid UTF-8, else Latin-1.
    static LogEncoding Detect(QByteArray const& head);

    /// The text of a line, without a byte order mark. Bytes that are not valid become U+FFFD.
    QString Decode(char const* bytes, int length) const;

    /// Replaces a line by one that has ASCII in single bytes, without a byte order mark.
    ///
    /// @param line  points into `buffer` afterwards if the bytes had to be changed
    void Narrow(char const*& line, int& length, QByteArray& buffer) const
    {
        if (m_kind != Automatic && m_kind != Latin1)
            narrowUnicode(line, length, buffer);
    }

    /// The length of a line without a carriage return at its end, in bytes.
    int WithoutReturn(char const* line, int length) const
    {
        const int unit = isWide() ? 2 : 1;
        const int low = m_kind == Utf16Be ? 1 : 0;
        char const* const last = line + length - unit;
        const bool isReturn =
            length >= unit && last[low] == '\r' && (unit == 1 || last[1 - low] == '\0');
        return isReturn ? length - unit : length;
    }

    /// The encoding of lines from Narrow().
    LogEncoding narrowed() const { return isWide() ? LogEncoding(Utf8) : *this; }

    bool operator==(LogEncoding const& other) const { return m_kind == other.m_kind; }
    bool operator!=(LogEncoding const& other) const { return m_kind != other.m_kind; }

private:
    void narrowUnicode(char const*& line, int& length, QByteArray& buffer) const;
    QString decodeWide(char const* bytes, int length) const;

    Kind m_kind;
};

/// Where lines end: after one byte or after a pair of bytes. A plain value; any thread.
class LogLineEnd
{
public:
    /// A line feed.
    LogLineEnd() = default;

    /// A pair of bytes.
    ///
    /// @param unit  the pair starts at a multiple of this many bytes from the start of the file
    LogLineEnd(char first, char last, int unit)
        : m_first(first), m_last(last), m_size(2), m_unit(unit)
    {}

    /// Its length in bytes.
    int size() const { return m_size; }

    QByteArray bytes() const
    {
        char const pair[] = {m_first, m_last};
        return QByteArray(pair + 2 - m_size, m_size);
    }

    /// Finds the last byte of the first line end in [at, end).
    ///
    /// @param offset  where `at` is in the file
    /// @param before  the byte before `at`; 0 if a line starts there
    /// @return nullptr if there is none
    char const* Find(char const* at, char const* end, qint64 offset, char before) const
    {
        return m_size == 1 ? findLast(at, end) : findPair(at, end, offset, before);
    }

private:
    char const* findLast(char const* at, char const* end) const
    {
        return static_cast<char const*>(std::memchr(at, m_last, static_cast<size_t>(end - at)));
    }
    char const* findPair(char const* at, char const* end, qint64 offset, char before) const;

    char m_first = '\0';
    char m_last = '\n';
    int m_size = 1;
    int m_unit = 1;
};

} // namespace Velocor
