// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/OlderLogFiles.h"

#include <algorithm>
#include <utility>

namespace Velocor {

void OlderLogFiles::Add(QString const& path, std::shared_ptr<QFile> file, qint64 size,
                        QByteArray const& separator)
{
    m_files.push_back({path, std::move(file), m_size, size, separator});
    m_size += size + separator.size();
}

size_t OlderLogFiles::FileAt(qint64 offset) const
{
    if (m_files.empty() || offset >= m_size)
        return m_files.size();
    size_t file = m_files.size() - 1;
    while (file > 0 && m_files[file].start > offset)
        --file;
    return file;
}

qint64 OlderLogFiles::Read(qint64 offset, char* data, qint64 count) const
{
    const size_t number = FileAt(offset);
    if (number == m_files.size())
        return 0;
    File const& file = m_files[number];
    const qint64 at = offset - file.start;
    if (at >= file.size) {
        const QByteArray rest = file.separator.mid(static_cast<int>(at - file.size));
        const qint64 most = std::min<qint64>(count, rest.size());
        std::copy(rest.constBegin(), rest.constBegin() + most, data);
        return most;
    }
    const QMutexLocker lock(&m_mutex);
    return file.file->seek(at) ? file.file->read(data, std::min(count, file.size - at)) : -1;
}

} // namespace Velocor
