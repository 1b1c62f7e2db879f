// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogLineReader.h"

#include <QFileInfo>

#include <algorithm>

namespace Velocor {

namespace {

constexpr int SliceSize = 64 << 10;

} // namespace

bool LogLineReader::Open(QString const& path)
{
    m_file.close();
    m_bytes.clear();
    m_start = 0;
    m_file.setFileName(path);
    // Opening a pipe would block.
    return QFileInfo(path).isFile() && m_file.open(QIODevice::ReadOnly | QIODevice::Unbuffered);
}

bool LogLineReader::readMore()
{
    const int size = m_bytes.size();
    if (!m_file.seek(m_start + size))
        return false;
    m_bytes.resize(size + SliceSize);
    const qint64 count = m_file.read(m_bytes.data() + size, SliceSize);
    m_bytes.resize(size + static_cast<int>(std::max<qint64>(count, 0)));
    return count > 0;
}

QByteArray LogLineReader::Line(qint64 start)
{
    if (start < m_start || start > m_start + m_bytes.size()) {
        m_bytes.clear();
        m_start = start;
    }
    auto at = static_cast<int>(start - m_start);
    int end = m_bytes.indexOf('\n', at);
    if (end < 0) {
        m_bytes.remove(0, at);
        m_start = start;
        at = 0;
    }
    while (end < 0 && m_bytes.size() < LineLimit) {
        const int size = m_bytes.size();
        if (!readMore())
            break;
        end = m_bytes.indexOf('\n', size);
    }
    int length = (end < 0 ? m_bytes.size() : end) - at;
    m_next = start + length + (end < 0 ? 0 : 1);
    if (end >= 0 && length > 0 && m_bytes.at(at + length - 1) == '\r')
        --length;
    return QByteArray::fromRawData(m_bytes.constData() + at, length);
}

} // namespace Velocor
