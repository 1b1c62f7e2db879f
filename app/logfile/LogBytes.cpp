// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogBytes.h"

#include <QFileInfo>

#include <algorithm>

namespace Velocor {

bool LogBytes::Open(LogSource const& source)
{
    Close();
    m_file.setFileName(source.path);
    m_older = source.older;
    m_start = source.start();
    m_position = 0;
    // Opening a pipe would block.
    m_isOpen =
        QFileInfo(source.path).isFile() && m_file.open(QIODevice::ReadOnly | QIODevice::Unbuffered);
    m_isOpen = m_isOpen || m_start > 0;
    return m_isOpen;
}

void LogBytes::Close()
{
    m_file.close();
    m_older.reset();
    m_start = 0;
    m_isOpen = false;
}

bool LogBytes::Seek(qint64 offset)
{
    m_position = offset;
    return offset >= 0;
}

qint64 LogBytes::Read(char* data, qint64 count)
{
    qint64 total = 0;
    while (total < count && m_position < m_start) {
        const qint64 more = m_older->Read(m_position, data + total, count - total);
        if (more <= 0) // the file was truncated
            return total > 0 ? total : more;
        total += more;
        m_position += more;
    }
    if (total == count || !m_file.isOpen() || !m_file.seek(m_position - m_start))
        return total;
    const qint64 more = m_file.read(data + total, count - total);
    m_position += std::max<qint64>(more, 0);
    return more < 0 && total == 0 ? more : total + std::max<qint64>(more, 0);
}

QByteArray LogBytes::Read(qint64 count)
{
    QByteArray bytes(static_cast<int>(count), Qt::Uninitialized);
    const qint64 read = Read(bytes.data(), count);
    if (read < 0)
        return QByteArray();
    bytes.truncate(static_cast<int>(read));
    return bytes;
}

} // namespace Velocor
