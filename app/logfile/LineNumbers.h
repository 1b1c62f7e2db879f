// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/SharedBlocks.h"

#include <QtGlobal>

#include <algorithm>
#include <vector>

namespace Velocor {

/// A list of numbers that grows at its end. Copies share what is full, as those of a LineTable do.
/// A plain value: several threads may each use their own copy.
class LineNumbers
{
public:
    size_t size() const { return m_full.size() * BlockSize + m_last.size(); }

    quint32 at(size_t position) const
    {
        const size_t block = position / BlockSize;
        return (block < m_full.size() ? m_full.at(block) : m_last)[position % BlockSize];
    }

    void Append(quint32 number)
    {
        if (m_last.size() == BlockSize) {
            m_last.shrink_to_fit();
            m_full.Append(std::move(m_last));
            m_last = std::vector<quint32>();
        }
        m_last.push_back(number);
    }

    /// Removes the numbers from this position on.
    void Truncate(size_t count)
    {
        const size_t block = count / BlockSize;
        if (count >= size())
            return;
        if (block < m_full.size()) {
            m_last = m_full.at(block);
            m_full.Truncate(block);
        }
        m_last.resize(count % BlockSize);
    }

    /// How many of the first numbers are the same in another list. Shared blocks are not compared.
    size_t CountSame(LineNumbers const& other) const
    {
        const size_t end = std::min(size(), other.size());
        size_t count = std::min(end, m_full.CountShared(other.m_full) * BlockSize);
        while (count < end && at(count) == other.at(count))
            ++count;
        return count;
    }

    /// Numbers in a block.
    static constexpr size_t BlockSize = 16384;

private:
    using Block = std::vector<quint32>;

    SharedBlocks<Block> m_full;
    Block m_last;
};

} // namespace Velocor
