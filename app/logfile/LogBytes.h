// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogSource.h"

#include <QByteArray>
#include <QFile>

#include <memory>
#include <vector>

namespace Velocor {

/// Reads the bytes of a log, without a buffer and with a file handle of its own. One thread at a
/// time.
///
///     LogBytes bytes;
///     if (bytes.Open(source) && bytes.Seek(start))
///         line = bytes.Read(100);
class LogBytes
{
public:
    /// @return false if it is not a regular file or cannot be read. If there are older ones, a log
    ///         need not have a current file; of several logs, one that can be read is enough
    bool Open(LogSource const& source);

    void Close();
    bool isOpen() const { return m_isOpen; }

    /// Why the file could not be opened.
    QString error() const { return m_file.errorString(); }

    /// The number of bytes now; of several logs, the offset of the last one's end.
    qint64 size() const;

    /// The offset of the next byte to read.
    qint64 position() const { return m_position; }

    /// @return false if the offset is negative; it may be beyond the end
    bool Seek(qint64 offset);

    /// Reads up to `count` bytes, fewer only at the end of a log.
    ///
    /// @return how many have been read, or -1 if they cannot be read
    qint64 Read(char* data, qint64 count);

    /// The same; null if nothing can be read.
    QByteArray Read(qint64 count);

private:
    qint64 readLog(char* data, qint64 count);

    QFile m_file;
    std::shared_ptr<OlderLogFiles const> m_older;
    qint64 m_start = 0; // of the file
    qint64 m_position = 0;
    bool m_isOpen = false;
    std::vector<std::unique_ptr<LogBytes>> m_logs; // if there are several
};

} // namespace Velocor
