// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/RepeatGroup.h"

#include <functional>
#include <memory>
#include <vector>

namespace Velocor {

/// Which rows of a log a table shows, while entries that repeat the one above are folded: of each
/// group, only the first row is shown, unless the group is open.
///
/// A row of the log is counted among all of them, a table row among those that are shown. Without
/// groups, both are the same. A plain value.
class FoldedRows
{
public:
    using Groups = std::vector<RepeatGroup>;

    /// All rows are shown.
    ///
    /// @param rows  how many the log has
    explicit FoldedRows(int rows = 0) : m_rows(rows), m_count(rows) {}

    /// @param groups  by their first rows
    /// @param isOpen  whether all rows of a group are shown
    FoldedRows(int rows, std::shared_ptr<Groups const> groups,
               std::function<bool(RepeatGroup const&)> const& isOpen);

    /// The number of table rows.
    int count() const { return m_count; }

    /// The row of the log that a table row shows. The number of rows for the number of table rows.
    int RowAt(int tableRow) const;

    /// The table row that shows a row of the log or, if that is hidden, the first one of its group.
    int TableRowOf(int row) const;

    bool IsHidden(int row) const { return TableRowOf(row) == TableRowOf(row - 1); }

    /// The group that a row of the log is in; null if there is none.
    // Cppcheck does not see that the groups are a member.
    // cppcheck-suppress functionStatic
    RepeatGroup const* GroupOf(int row) const;

    /// What differs between the rows of a log and later ones, among all rows.
    struct Change
    {
        int at;       ///< the first row that differs
        int removed;  ///< the number of rows removed there
        int inserted; ///< the number of rows inserted there
        int tail;     ///< the number of rows at the former end that differ
        int newTail;  ///< how many are there now
    };

    /// The same for the table rows. Which groups are open must not have changed, except for those
    /// that differ.
    static Change ChangeOf(FoldedRows const& before, FoldedRows const& after, Change const& rows);

private:
    // The rows of a group but the first.
    struct Hidden
    {
        int first;
        int end;
        int above; // how many others there are above
    };

    int overlapAt(int row) const;
    static int uncertainAbove(FoldedRows const& before, int row, FoldedRows const& after,
                              int newRow);

    std::shared_ptr<Groups const> m_groups;
    std::vector<Hidden> m_hidden;
    int m_rows;
    int m_count;
};

} // namespace Velocor
