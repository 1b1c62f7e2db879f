// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogLineReader.h"

#include <algorithm>

namespace Velocor {

namespace {

constexpr int SliceSize = 64 << 10;

} // namespace

bool LogLineReader::Open(LogSource const& source, LogFileType const& type)
{
    m_type = type;
    m_lineEnd = type.lineEnd();
    m_bytes.clear();
    m_start = 0;
    return m_file.Open(source);
}

bool LogLineReader::readMore()
{
    const int size = m_bytes.size();
    if (!m_file.Seek(m_start + size))
        return false;
    m_bytes.resize(size + SliceSize);
    const qint64 count = m_file.Read(m_bytes.data() + size, SliceSize);
    m_bytes.resize(size + static_cast<int>(std::max<qint64>(count, 0)));
    return count > 0;
}

// Where the line end after a line is in the bytes; -1 if it has not been read yet.
//
// @param searched  where it cannot be before
int LogLineReader::endAfter(int at, int searched) const
{
    const int from = std::max(at, searched - 1);
    char const* const found =
        m_lineEnd.Find(m_bytes.constData() + from, m_bytes.constEnd(), m_start + from,
                       from > at ? m_bytes.at(from - 1) : '\0');
    return found ? static_cast<int>(found - m_bytes.constData()) + 1 - m_lineEnd.size() : -1;
}

QByteArray LogLineReader::Line(qint64 start)
{
    if (start < m_start || start > m_start + m_bytes.size()) {
        m_bytes.clear();
        m_start = start;
    }
    auto at = static_cast<int>(start - m_start);
    int end = endAfter(at, at);
    if (end < 0) {
        m_bytes.remove(0, at);
        m_start = start;
        at = 0;
    }
    while (end < 0 && m_bytes.size() < LineLimit) {
        const int size = m_bytes.size();
        if (!readMore())
            break;
        end = endAfter(0, size);
    }
    const int length = (end < 0 ? m_bytes.size() : end) - at;
    m_next = start + length + (end < 0 ? 0 : m_lineEnd.size());
    char const* const line = m_bytes.constData() + at;
    return QByteArray::fromRawData(line,
                                   end < 0 ? length : m_type.encoding.WithoutReturn(line, length));
}

} // namespace Velocor
