// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <vector>

namespace Velocor {

/// Which entries of a list are shown, by their numbers in the list: their rows are in the same
/// order, without gaps.
class SettingsRows
{
public:
    SettingsRows() = default;

    /// @param numbers  in ascending order
    explicit SettingsRows(std::vector<int> numbers) : m_numbers(std::move(numbers)) {}

    /// All entries of a list.
    static SettingsRows All(int count);

    /// The numbers of the entries that are shown, in ascending order.
    std::vector<int> const& numbers() const { return m_numbers; }

    int count() const { return static_cast<int>(m_numbers.size()); }

    /// The number of the entry in a row.
    int at(int row) const { return m_numbers[static_cast<std::size_t>(row)]; }

    /// The row of an entry; -1 if it is not shown.
    int RowOf(int number) const;

    /// The row that an entry has, or would have if it were shown.
    int RowFor(int number) const;

    /// The row that an entry that is shown would have after Move().
    int RowAfterMove(int from, int to) const;

    /// Shows an entry that is in the list, but not shown.
    void Show(int number);

    /// Follows the list. What is inserted is shown; what moves stays shown, or not.
    void Insert(int number);
    void Remove(int number);
    void Move(int from, int to);

private:
    std::vector<int> m_numbers; ///< ascending
};

} // namespace Velocor
