// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogUpdate.h"

#include <algorithm>

namespace Velocor {

namespace {

// Two lists of rows, which are compared row by row.
class Pair
{
public:
    Pair(LogRows const& before, LogRows const& after)
        : m_before(before), m_after(after), m_beforeReader(before), m_afterReader(after)
    {}

    bool isSame(size_t before, size_t after)
    {
        return m_before.mark(before) == m_after.mark(after) &&
               m_before.check(before) == m_after.check(after) &&
               m_beforeReader.start(before) == m_afterReader.start(after);
    }

private:
    LogRows const& m_before;
    LogRows const& m_after;
    LogRows::Reader m_beforeReader;
    LogRows::Reader m_afterReader;
};

} // namespace

void LogUpdate::Compare(LogRows const& before)
{
    LogRows const& after = *rows;
    const size_t newestBefore = before.size() - before.earlier();
    const size_t newestAfter = after.size() - after.earlier();
    isReset = (before.earlier() == 0) != (after.earlier() == 0) || newestAfter < newestBefore;
    if (isReset)
        return;

    Pair pair(before, after);
    const size_t shorter = std::min(before.earlier(), after.earlier());
    size_t front = shorter > 0 ? std::min(before.CountSameFirst(after), shorter) : 0;
    while (front < shorter && pair.isSame(front, front))
        ++front;
    size_t back = 0;
    // cppcheck-suppress knownConditionTrueFalse ; the loop above may stop before `shorter`
    while (back < shorter - front &&
           pair.isSame(before.earlier() - 1 - back, after.earlier() - 1 - back))
        ++back;
    changeAt = front;
    removed = before.earlier() - front - back;
    inserted = after.earlier() - front - back;

    size_t same = before.CountSame(after);
    while (same < newestBefore && pair.isSame(before.earlier() + same, after.earlier() + same))
        ++same;
    changedTail = newestBefore - same;
}

} // namespace Velocor
