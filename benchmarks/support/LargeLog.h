// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QString>

#include <random>
#include <vector>

/// Makes the lines of a log in TorkLog's default format, of 106 bytes on average, always the same
/// ones. They look like those of a busy server: one every eight milliseconds, half of them with a
/// number and a time.
class LargeLog
{
public:
    /// In one of about a thousand lines.
    static constexpr char const* Text = "connection reset by peer";
    /// In one of about two hundred lines. Every program here understands it in the same way.
    static constexpr char const* Expression = "took [0-9]+77 ms";

    /// @param firstLine  the number of the first line, from which its time follows
    explicit LargeLog(qint64 firstLine = 0);

    /// Appends the next line.
    void Append(QByteArray& text);

    /// The number of lines so far, with those before the first one.
    qint64 lines() const { return m_number; }

    /// Writes a file of at least this many bytes; exits if that fails.
    ///
    /// @return its number of lines
    static qint64 Write(QString const& fileName, qint64 bytes);

private:
    quint32 below(quint32 limit) { return quint32(m_random()) % limit; }
    void makeTexts();

    std::mt19937 m_random{20260303};
    qint64 m_number;
    std::vector<QByteArray> m_texts; // of many lengths
};
