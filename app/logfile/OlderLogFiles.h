// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QFile>
#include <QMutex>
#include <QString>

#include <memory>
#include <vector>

namespace Velocor {

/// The older files of a log, one after the other as if they were one file.
///
/// They stay open, so they can be read even after the log has rotated, and only as far as they went
/// when they were added. Any thread, once all have been added.
class OlderLogFiles
{
public:
    /// Adds a file after those that are there.
    ///
    /// @param file  open; nobody else may read it in another thread
    /// @param size  how much of it there is, in bytes
    /// @param separator  follows it: a line end if its last line has none
    void Add(QString const& path, std::shared_ptr<QFile> file, qint64 size,
             QByteArray const& separator);

    /// How many bytes they have together.
    qint64 size() const { return m_size; }

    size_t count() const { return m_files.size(); }
    QString const& path(size_t file) const { return m_files[file].path; }

    /// Where a file starts among the bytes of all.
    qint64 start(size_t file) const { return m_files[file].start; }

    /// The file that has this byte; count() if there is none.
    size_t FileAt(qint64 offset) const;

    /// Reads some bytes, which may be fewer than there are.
    ///
    /// @return how many have been read; 0 at the end, -1 if they cannot be read
    qint64 Read(qint64 offset, char* data, qint64 count) const;

private:
    struct File
    {
        QString path;
        std::shared_ptr<QFile> file;
        qint64 start;
        qint64 size;
        QByteArray separator;
    };

    std::vector<File> m_files;
    qint64 m_size = 0;
    mutable QMutex m_mutex; // reading moves a file's position
};

} // namespace Velocor
