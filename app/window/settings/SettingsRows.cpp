// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/SettingsRows.h"

#include <algorithm>
#include <numeric>

namespace Velocor {

SettingsRows SettingsRows::All(int count)
{
    std::vector<int> numbers(static_cast<std::size_t>(count));
    std::iota(numbers.begin(), numbers.end(), 0);
    return SettingsRows(std::move(numbers));
}

int SettingsRows::RowFor(int number) const
{
    const auto place = std::lower_bound(m_numbers.begin(), m_numbers.end(), number);
    return static_cast<int>(place - m_numbers.begin());
}

int SettingsRows::RowOf(int number) const
{
    const int row = RowFor(number);
    return row < count() && at(row) == number ? row : -1;
}

int SettingsRows::RowAfterMove(int from, int to) const
{
    return to > from ? RowFor(to + 1) - 1 : RowFor(to);
}

void SettingsRows::Show(int number)
{
    m_numbers.insert(m_numbers.begin() + RowFor(number), number);
}

void SettingsRows::Insert(int number)
{
    const auto place = m_numbers.begin() + RowFor(number);
    std::for_each(place, m_numbers.end(), [](int& later) { ++later; });
    m_numbers.insert(place, number);
}

void SettingsRows::Remove(int number)
{
    auto place = m_numbers.begin() + RowFor(number);
    if (place != m_numbers.end() && *place == number)
        place = m_numbers.erase(place);
    std::for_each(place, m_numbers.end(), [](int& later) { --later; });
}

void SettingsRows::Move(int from, int to)
{
    const bool isShown = RowOf(from) >= 0;
    Remove(from);
    Insert(to);
    if (!isShown)
        m_numbers.erase(m_numbers.begin() + RowFor(to));
}

} // namespace Velocor
