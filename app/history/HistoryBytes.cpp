// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/HistoryBytes.h"

#include <algorithm>

namespace Velocor {

namespace {

// Bytes that are read at once: few where parts are far from each other, as the lines that an
// expression finds, or the whole file would be read for them. For the goal "filter by expression in
// a terminal" in docs/performance.md.
constexpr int LeastReadAhead = 4 << 10;
constexpr int MostReadAhead = 256 << 10;

} // namespace

QByteArray const& HistoryBytes::At(qint64 start, int size)
{
    if (start < m_start || start + size > m_start + m_bytes.size()) {
        const bool isNext = start >= m_start && start <= m_start + m_bytes.size();
        m_readAhead =
            isNext ? qBound(LeastReadAhead, 2 * m_readAhead, MostReadAhead) : LeastReadAhead;
        m_bytes.resize(std::max(size, m_readAhead));
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
