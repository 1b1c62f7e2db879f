// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QFile>

#include <memory>

namespace Velocor {

/// Reads parts of a file that stays open, so that it remains the same file when the log rotates.
/// One thread at a time; several may share the file.
///
///     HistoryBytes bytes(file);
///     QByteArray line = bytes.At(start, end - start);
class HistoryBytes
{
public:
    /// @param file  open for reading, unbuffered
    explicit HistoryBytes(std::shared_ptr<QFile> file) : m_file(std::move(file)) {}

    /// The bytes from an offset on; fewer if the file ends before.
    ///
    /// @param size  at most 2^30
    /// @return refers to memory of this object: valid until the next call
    QByteArray const& At(qint64 start, int size);

private:
    std::shared_ptr<QFile> m_file;
    QByteArray m_bytes;
    int m_readAhead = 0; // bytes
    qint64 m_start = 0;
    QByteArray m_part; // always the same object, so that a part takes no memory
};

} // namespace Velocor
