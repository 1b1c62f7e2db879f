// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogUpdate.h"

#include <algorithm>

namespace Velocor {

namespace {

bool SameRow(LogRows const& a, size_t i, LogRows const& b, size_t j)
{
    return a.starts[i] == b.starts[j] && a.marks[i] == b.marks[j] && a.checks[i] == b.checks[j];
}

} // namespace

void LogUpdate::Compare(LogRows const& before)
{
    LogRows const& after = *rows;
    const size_t newestBefore = before.size() - before.earlier;
    const size_t newestAfter = after.size() - after.earlier;
    isReset = (before.earlier == 0) != (after.earlier == 0) || newestAfter < newestBefore;
    if (isReset)
        return;

    const size_t shorter = std::min(before.earlier, after.earlier);
    size_t front = 0;
    while (front < shorter && SameRow(before, front, after, front))
        ++front;
    size_t back = 0;
    // cppcheck-suppress knownConditionTrueFalse ; the loop above may stop before `shorter`
    while (back < shorter - front &&
           SameRow(before, before.earlier - 1 - back, after, after.earlier - 1 - back))
        ++back;
    changeAt = front;
    removed = before.earlier - front - back;
    inserted = after.earlier - front - back;

    size_t same = 0;
    while (same < newestBefore &&
           SameRow(before, before.earlier + same, after, after.earlier + same))
        ++same;
    changedTail = newestBefore - same;
}

} // namespace Velocor
