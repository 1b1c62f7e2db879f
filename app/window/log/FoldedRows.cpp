// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/FoldedRows.h"

#include <algorithm>

namespace Velocor {

FoldedRows::FoldedRows(int rows, std::shared_ptr<Groups const> groups,
                       std::function<bool(RepeatGroup const&)> const& isOpen)
    : m_groups(std::move(groups)), m_rows(rows), m_count(rows)
{
    if (!m_groups)
        return;
    for (RepeatGroup const& group : *m_groups) {
        if (isOpen(group))
            continue;
        const int first = static_cast<int>(group.first) + 1;
        const int end = static_cast<int>(group.end);
        m_hidden.push_back({first, end, m_rows - m_count});
        m_count -= end - first;
    }
}

int FoldedRows::RowAt(int tableRow) const
{
    const auto isAfter = [](int row, Hidden const& hidden) {
        return row < hidden.first - hidden.above;
    };
    const auto next = std::upper_bound(m_hidden.begin(), m_hidden.end(), tableRow, isAfter);
    if (next == m_hidden.begin())
        return tableRow;
    Hidden const& last = *(next - 1);
    return tableRow + last.above + last.end - last.first;
}

int FoldedRows::TableRowOf(int row) const
{
    const auto isAfter = [](int other, Hidden const& hidden) {
        return other < hidden.first;
    };
    const auto next = std::upper_bound(m_hidden.begin(), m_hidden.end(), row, isAfter);
    if (next == m_hidden.begin())
        return row;
    Hidden const& last = *(next - 1);
    return std::max(row, last.end) - last.above - (last.end - last.first) - (row < last.end);
}

RepeatGroup const* FoldedRows::GroupOf(int row) const
{
    if (!m_groups || row < 0)
        return nullptr;
    const auto position = static_cast<size_t>(row);
    const auto isAfter = [](size_t other, RepeatGroup const& group) {
        return other < group.first;
    };
    const auto next = std::upper_bound(m_groups->begin(), m_groups->end(), position, isAfter);
    if (next == m_groups->begin() || (next - 1)->end <= position)
        return nullptr;
    return &*(next - 1);
}

// How far a group that begins above a row reaches below it.
int FoldedRows::overlapAt(int row) const
{
    RepeatGroup const* const group = GroupOf(row);
    return group && static_cast<int>(group->first) < row ? static_cast<int>(group->end) - row : 0;
}

// How many of the rows above this one may be in another group among other rows: those of the last
// group or, if it is the same and goes no further, none.
int FoldedRows::uncertainAbove(FoldedRows const& before, int row, FoldedRows const& after,
                               int newRow)
{
    RepeatGroup const* const group = before.GroupOf(row - 1);
    RepeatGroup const* const newGroup = after.GroupOf(newRow - 1);
    const int length = group ? row - static_cast<int>(group->first) : 0;
    const int newLength = newGroup ? newRow - static_cast<int>(newGroup->first) : 0;
    const bool endsThere = (!group || static_cast<int>(group->end) == row) &&
                           (!newGroup || static_cast<int>(newGroup->end) == newRow);
    return length == newLength && endsThere ? 0 : std::max(length, newLength);
}

// Rows that are the same may now be in another group, but only next to others.
FoldedRows::Change FoldedRows::ChangeOf(FoldedRows const& before, FoldedRows const& after,
                                        Change const& rows)
{
    const int at = before.TableRowOf(rows.at - uncertainAbove(before, rows.at, after, rows.at));
    int first = rows.at + rows.removed;
    int newFirst = rows.at + rows.inserted;
    int end = before.m_rows - rows.tail;
    int newEnd = after.m_rows - rows.newTail;
    const int overlap = std::max(before.overlapAt(first), after.overlapAt(newFirst));
    const int uncertain = uncertainAbove(before, end, after, newEnd);
    first += overlap;
    newFirst += overlap;
    end -= uncertain;
    newEnd -= uncertain;
    if (first >= end) // no row between is certain
        return {at, 0, 0, before.count() - at, after.count() - at};
    return {at, before.TableRowOf(first) - at, after.TableRowOf(newFirst) - at,
            before.count() - before.TableRowOf(end), after.count() - after.TableRowOf(newEnd)};
}

} // namespace Velocor
