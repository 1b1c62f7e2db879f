// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/HistoryMerge.h"

#include <utility>

namespace Velocor {

HistoryMerge::HistoryMerge(std::vector<HistoryCursor> cursors) : m_cursors(std::move(cursors)) {}

bool HistoryMerge::isBefore(size_t log, size_t other) const
{
    const qint64 key = m_cursors[log].key();
    const qint64 otherKey = m_cursors[other].key();
    return key < otherKey || (key == otherKey && log < other);
}

// Moves down the log that is at this position, until none below is before it.
void HistoryMerge::sink(size_t position)
{
    const size_t log = m_heap[position];
    for (size_t below = 2 * position + 1; below < m_heap.size(); below = 2 * position + 1) {
        if (below + 1 < m_heap.size() && isBefore(m_heap[below + 1], m_heap[below]))
            ++below;
        if (!isBefore(m_heap[below], log))
            break;
        m_heap[position] = m_heap[below];
        position = below;
    }
    m_heap[position] = log;
}

bool HistoryMerge::Next()
{
    if (!m_isStarted) {
        m_isStarted = true;
        for (size_t log = 0; log < m_cursors.size(); ++log) {
            if (m_cursors[log].Next())
                m_heap.push_back(log);
        }
        for (size_t position = m_heap.size(); position > 0; --position)
            sink(position - 1);
    } else if (!m_heap.empty()) {
        if (!m_cursors[m_heap[0]].Next()) {
            m_heap[0] = m_heap.back();
            m_heap.pop_back();
        }
        if (!m_heap.empty())
            sink(0);
    }
    m_log = m_heap.empty() ? m_log : m_heap[0];
    return !m_heap.empty();
}

} // namespace Velocor
