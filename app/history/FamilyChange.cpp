// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/FamilyChange.h"

#include <algorithm>

namespace Velocor {

namespace {

// How far apart two changes may be for the rows between them to be found again.
constexpr size_t MostChanged = 64;

// Otherwise, lines that are in both lists would get the rows of others, and a view would lose the
// current one. At the end, any rows could be said to be removed.
bool IsOnePlace(size_t removed, size_t inserted, bool isAtEnd)
{
    return (removed <= 1 && inserted <= 1) || (!isAtEnd && (removed == 0 || inserted == 0));
}

} // namespace

void FamilyChange::Find(HistoryUpdate& update)
{
    const size_t shorter = std::min(m_before.size(), m_after.size());
    size_t same = 0;
    while (same < shorter && isSame(same, same))
        ++same;
    update.changeAt = same;
    update.removed = 0;
    update.inserted = 0;
    update.changedTail = 0;
    update.isReset = same < m_before.size() && !findNext(update);
}

// The fast path for following, see docs/performance.md: rows next to each other are of different
// logs, so that finding their starts takes long. tst_FamilyChange compares with the starts.
bool FamilyChange::isSameLine(size_t before, size_t after) const
{
    const size_t line = m_before.line(before);
    const auto next =
        std::upper_bound(m_logs.begin(), m_logs.end(), line,
                         [](size_t number, FamilyLines const& log) { return number < log.before; });
    FamilyLines const& log = *(next - 1);
    const size_t number = line - log.before;
    return number < log.same && m_after.line(after) == log.after + number &&
           m_before.isContext(before) == m_after.isContext(after);
}

bool FamilyChange::isSame(size_t before, size_t after)
{
    return isSameLine(before, after) ||
           (m_before.mark(before) == m_after.mark(after) &&
            m_before.check(before) == m_after.check(after) &&
            m_beforeStarts.start(before) == m_afterStarts.start(after));
}

bool FamilyChange::isSameToEnd(size_t before, size_t after)
{
    if (m_after.size() - after < m_before.size() - before)
        return false;
    while (before < m_before.size() && isSame(before, after)) {
        ++before;
        ++after;
    }
    return before == m_before.size();
}

// Where the rows are the same again.
bool FamilyChange::findNext(HistoryUpdate& update)
{
    const size_t at = update.changeAt;
    const size_t mostRemoved = std::min(MostChanged, m_before.size() - at);
    const size_t mostInserted = std::min(MostChanged, m_after.size() - at);
    for (size_t removed = 0; removed <= mostRemoved; ++removed) {
        for (size_t inserted = 0; inserted <= mostInserted; ++inserted) {
            if (!IsOnePlace(removed, inserted, at + removed == m_before.size()) ||
                !isSameToEnd(at + removed, at + inserted))
                continue;
            update.removed = removed;
            update.inserted = inserted;
            return true;
        }
    }
    return false;
}

} // namespace Velocor
