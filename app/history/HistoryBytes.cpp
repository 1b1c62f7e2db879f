// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/HistoryBytes.h"

#include <algorithm>

namespace Velocor {

namespace {

constexpr int ReadAhead = 256 << 10;

} // namespace

QByteArray const& HistoryBytes::At(qint64 start, int size)
{
    if (start < m_start || start + size > m_start + m_bytes.size()) {
        m_bytes.resize(std::max(size, ReadAhead));
        m_start = start;
        const qint64 count =
            m_file->seek(start) ? m_file->read(m_bytes.data(), m_bytes.size()) : -1;
        m_bytes.resize(static_cast<int>(std::max<qint64>(count, 0)));
    }
    const auto at = static_cast<int>(start - m_start);
    m_part.setRawData(m_bytes.constData() + at,
                      static_cast<uint>(std::min<int>(size, m_bytes.size() - at)));
    return m_part;
}

} // namespace Velocor
