// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/GrowingBlocks.h"

#include <QtGlobal>

#include <algorithm>
#include <vector>

namespace Velocor {

/// A list of numbers that grows at its end. Copies share what is full, as those of a LineTable do.
/// A plain value: several threads may each use their own copy.
class LineNumbers
{
public:
    size_t size() const { return m_blocks.size(); }

    quint32 at(size_t position) const
    {
        return m_blocks.at(position).numbers[position % BlockSize];
    }

    void Append(quint32 number) { m_blocks.Grow().numbers.push_back(number); }

    /// Removes the numbers from this position on.
    void Truncate(size_t count) { m_blocks.Truncate(count); }

    /// How many of the first numbers are the same in another list. Shared blocks are not compared.
    size_t CountSame(LineNumbers const& other) const
    {
        const size_t end = std::min(size(), other.size());
        size_t count = m_blocks.CountShared(other.m_blocks);
        while (count < end && at(count) == other.at(count))
            ++count;
        return count;
    }

    /// Numbers in a block.
    static constexpr size_t BlockSize = 16384;

private:
    struct Block
    {
        std::vector<quint32> numbers;

        static void reserve() {} // most lists are short
        void truncate(size_t count) { numbers.resize(count); }
        void pack() { numbers.shrink_to_fit(); }
        static void unpack() {}
    };

    GrowingBlocks<Block, BlockSize> m_blocks;
};

} // namespace Velocor
