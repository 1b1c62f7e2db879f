// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QString>

namespace Velocor {

/// Makes a ZIP archive of a few files in memory.
///
/// Qt has no public class for that, and what a report needs of the format is two headers: the
/// compressed data is that of qCompress(). One thread at a time.
///
///     ZipArchive archive;
///     archive.Add("report.md", text.toUtf8());
///     file.write(archive.Bytes());
class ZipArchive
{
public:
    /// @param name  with "/" between folders; each only once
    /// @param content  of less than 1 GiB
    void Add(QString const& name, QByteArray const& content);

    /// The whole archive. Equal files make an equal archive: their time is 1980.
    QByteArray Bytes() const;

private:
    QByteArray m_files;
    QByteArray m_directory;
    int m_count = 0;
};

} // namespace Velocor
