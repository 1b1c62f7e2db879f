// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/SharedBlocks.h"

#include <cstddef>
#include <utility>

namespace Velocor {

/// A list that grows at its end, in blocks of the same number of items. A full block does not
/// change; copies share it. A plain value: several threads may each use their own copy.
///
/// @tparam Block  a copyable type with reserve() for a full block, truncate(count), pack() for one
///                that is full, and unpack(), after which the other two may be called again
/// @tparam BlockSize  items in a block
template <class Block, size_t BlockSize>
class GrowingBlocks
{
public:
    size_t size() const { return m_size; }

    /// The block of an item, which is its item number `item % BlockSize`.
    Block const& at(size_t item) const
    {
        const size_t block = item / BlockSize;
        return block < m_full.size() ? m_full.at(block) : m_last;
    }

    /// Makes room for another item, and returns the block to add it to.
    Block& Grow()
    {
        const size_t count = m_size % BlockSize;
        if (count == 0) {
            if (m_size > 0) {
                m_last.pack();
                m_full.Append(std::move(m_last));
                m_last = Block();
            }
            m_last.reserve();
        }
        ++m_size;
        return m_last;
    }

    /// Changes the block of an item: `change` gets it unpacked.
    template <class Change>
    void Edit(size_t item, Change change)
    {
        const size_t block = item / BlockSize;
        if (block >= m_full.size()) {
            change(m_last);
            return;
        }
        Block changed = m_full.at(block);
        changed.unpack();
        change(changed);
        changed.pack();
        m_full.Replace(block, std::move(changed));
    }

    /// Removes the items from this one on.
    void Truncate(size_t count)
    {
        if (count >= m_size)
            return;
        // As if it were not full yet, the last block may have all of its items.
        const size_t block = count > 0 ? (count - 1) / BlockSize : 0;
        if (block < m_full.size()) {
            m_last = m_full.at(block);
            m_last.unpack();
            m_full.Truncate(block);
        }
        m_last.truncate(count - block * BlockSize);
        m_size = count;
    }

    /// How many of the first items are in blocks that are shared with another list.
    size_t CountShared(GrowingBlocks const& other) const
    {
        return m_full.CountShared(other.m_full) * BlockSize;
    }

private:
    SharedBlocks<Block> m_full; // packed
    Block m_last;               // not packed, even if it is full
    size_t m_size = 0;
};

} // namespace Velocor
