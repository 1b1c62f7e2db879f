// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogBytes.h"

#include <QFileInfo>

#include <algorithm>

namespace Velocor {

bool LogBytes::Open(LogSource const& source)
{
    Close();
    m_position = 0;
    for (size_t log = 0; source.logs && log < source.logs->size(); ++log) {
        m_logs.push_back(std::make_unique<LogBytes>());
        m_isOpen = m_logs.back()->Open((*source.logs)[log]) || m_isOpen;
    }
    if (source.logs)
        return m_isOpen;
    m_file.setFileName(source.path);
    m_older = source.older;
    m_start = source.start();
    // Opening a pipe would block.
    m_isOpen =
        QFileInfo(source.path).isFile() && m_file.open(QIODevice::ReadOnly | QIODevice::Unbuffered);
    m_isOpen = m_isOpen || m_start > 0;
    return m_isOpen;
}

void LogBytes::Close()
{
    m_file.close();
    m_logs.clear();
    m_older.reset();
    m_start = 0;
    m_isOpen = false;
}

qint64 LogBytes::size() const
{
    if (m_logs.empty())
        return m_start + m_file.size();
    return static_cast<qint64>(m_logs.size() - 1) * LogSource::LogSize + m_logs.back()->size();
}

bool LogBytes::Seek(qint64 offset)
{
    m_position = offset;
    return offset >= 0;
}

qint64 LogBytes::readLog(char* data, qint64 count)
{
    const qint64 log = m_position / LogSource::LogSize;
    if (log >= static_cast<qint64>(m_logs.size()))
        return 0;
    LogBytes& bytes = *m_logs[static_cast<size_t>(log)];
    if (!bytes.isOpen() || !bytes.Seek(m_position - log * LogSource::LogSize))
        return 0;
    const qint64 read = bytes.Read(data, count);
    m_position += std::max<qint64>(read, 0);
    return read;
}

qint64 LogBytes::Read(char* data, qint64 count)
{
    if (!m_logs.empty())
        return readLog(data, count);
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
