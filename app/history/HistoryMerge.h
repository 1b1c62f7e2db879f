// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/HistoryCursor.h"

#include <vector>

namespace Velocor {

/// Goes through the lines of several logs by time.
///
/// The lines of each log keep their order; see HistoryCursor::key(). Where two logs have the same
/// time, the one that was given first comes first. One thread at a time.
///
///     HistoryMerge merge(std::move(cursors));
///     while (merge.Next())
///         print(merge.log(), merge.cursor().content());
class HistoryMerge
{
public:
    /// @param cursors  with times, before their first lines
    explicit HistoryMerge(std::vector<HistoryCursor> cursors);

    /// @return false if there are no more lines
    bool Next();

    /// Which of the cursors has the current line.
    size_t log() const { return m_log; }
    HistoryCursor& cursor() { return m_cursors[m_log]; }

private:
    bool isBefore(size_t log, size_t other) const;
    void sink(size_t position);

    std::vector<HistoryCursor> m_cursors;
    std::vector<size_t> m_heap; // of those that have a line; the first one has the next line
    bool m_isStarted = false;
    size_t m_log = 0;
};

} // namespace Velocor
