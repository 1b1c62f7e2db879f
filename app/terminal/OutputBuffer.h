// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>

namespace Velocor {

/// Standard output, written in large pieces. One thread at a time.
///
/// A reader that has gone, as `head` does, ends the program by SIGPIPE, like other programs in a
/// pipeline. Where that signal is ignored, writing fails.
class OutputBuffer
{
public:
    /// Enlarges the pipe that standard output may be, for all who use it.
    OutputBuffer();

    void Write(char const* bytes, int size);
    void Write(QByteArray const& bytes) { Write(bytes.constData(), bytes.size()); }

    /// Writes what is in the buffer.
    ///
    /// @return false if this or an earlier write failed; see error()
    bool Flush();

    /// The system's number of the first failure; 0 if there was none.
    int error() const { return m_error; }

private:
    QByteArray m_bytes;
    int m_error = 0;
};

} // namespace Velocor
