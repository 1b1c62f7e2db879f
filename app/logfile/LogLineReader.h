// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogBytes.h"
#include "app/logfile/LogFileType.h"

#include <QByteArray>

namespace Velocor {

/// Reads lines of a log file by where they start, with a file handle of its own.
///
/// Lines that are asked for in the order of the file are read only once. One thread at a time.
///
///     LogLineReader reader;
///     if (reader.Open(path, parser.fileType()))
///         text = parser.Text(reader.Line(start));
class LogLineReader
{
public:
    /// Opens a log, and forgets what was read before.
    ///
    /// @param type  how lines end, and how their bytes are decoded
    /// @return false if it cannot be read or is not a regular file
    bool Open(LogSource const& source, LogFileType const& type = LogFileType());

    /// The bytes of the line that starts there, without its line end; none at the end of the file.
    ///
    /// @return refers to memory of the reader: valid until the next call
    QByteArray Line(qint64 start);

    /// Where the line after the last Line() starts; the end of the file after its last line.
    qint64 nextStart() const { return m_next; }

    /// How much of a line is read, in bytes.
    static constexpr int LineLimit = 16 << 20;

private:
    bool readMore();
    int endAfter(int at, int searched) const;

    LogBytes m_file;
    QByteArray m_bytes;
    qint64 m_start = 0; // of the bytes in the file
    qint64 m_next = 0;
    LogFileType m_type;
    LogLineEnd m_lineEnd;
};

} // namespace Velocor
