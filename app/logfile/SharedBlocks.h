// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <algorithm>
#include <cstddef>
#include <memory>
#include <utility>
#include <vector>

namespace Velocor {

/// A sequence of blocks that never change. Copies share them, and copying costs the same however
/// many there are. A plain value: several threads may each use their own copy.
template <class Block>
class SharedBlocks
{
    using Pointers = std::vector<std::shared_ptr<Block const>>;

public:
    // cppcheck-suppress functionStatic ; it overlooks that m_blocks is read
    size_t size() const { return m_blocks ? m_blocks->size() : 0; }
    // cppcheck-suppress functionStatic ; it overlooks that m_blocks is read
    Block const& at(size_t position) const { return *(*m_blocks)[position]; }

    /// Copies of the sequence do not change.
    void Append(Block block)
    {
        Pointers blocks = firstOnes(size(), 1);
        blocks.push_back(std::make_shared<Block const>(std::move(block)));
        m_blocks = std::make_shared<Pointers const>(std::move(blocks));
    }

    /// Removes the blocks from a position on.
    void Truncate(size_t count)
    {
        if (count < size())
            m_blocks = std::make_shared<Pointers const>(firstOnes(count, 0));
    }

    void Replace(size_t position, Block block)
    {
        Pointers blocks = firstOnes(size(), 0);
        blocks[position] = std::make_shared<Block const>(std::move(block));
        m_blocks = std::make_shared<Pointers const>(std::move(blocks));
    }

    /// How many of the first blocks are shared with another sequence.
    size_t CountShared(SharedBlocks const& other) const
    {
        const size_t most = std::min(size(), other.size());
        if (m_blocks == other.m_blocks)
            return most;
        size_t count = 0;
        while (count < most && (*m_blocks)[count] == (*other.m_blocks)[count])
            ++count;
        return count;
    }

private:
    // cppcheck-suppress functionStatic ; it overlooks that m_blocks is read
    Pointers firstOnes(size_t count, size_t more) const
    {
        Pointers blocks;
        blocks.reserve(count + more);
        if (count > 0)
            blocks.assign(m_blocks->begin(),
                          m_blocks->begin() + static_cast<std::ptrdiff_t>(count));
        return blocks;
    }

    std::shared_ptr<Pointers const> m_blocks; // null if there are none
};

} // namespace Velocor
