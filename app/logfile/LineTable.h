// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/GrowingBlocks.h"

#include <QtGlobal>

#include <array>
#include <vector>

namespace Velocor {

/// The lines of a file in the order of the file: where each starts, and a mark and a check of each,
/// whose meaning is that of LogRows.
///
/// For a line of usual length, this takes less than four bytes. Lines are kept in blocks; a full
/// block never changes, and copies of the table share it. A copy is therefore cheap, and remains
/// what it is while lines are added to the original. A plain value: several threads may each use
/// their own copy.
///
///     LineTable lines;
///     lines.Append(0, mark, check);
///     lines.Append(120, mark, check);
///     const LineTable now = lines;
class LineTable
{
    struct Block;
    static constexpr size_t GroupSize = 128;

public:
    size_t size() const { return m_size; }
    bool isEmpty() const { return size() == 0; }

    /// Where a line starts in the file, in bytes. Takes longer than the other two; see Reader.
    qint64 start(size_t line) const;
    quint8 mark(size_t line) const
    {
        const size_t number = m_first + line;
        return m_blocks.at(number).mark(number % BlockSize);
    }
    quint16 check(size_t line) const
    {
        const size_t number = m_first + line;
        return m_blocks.at(number).checks[number % BlockSize];
    }

    /// Adds a line.
    ///
    /// @param start  after that of the last line
    void Append(qint64 start, quint8 mark, quint16 check);

    void SetMark(size_t line, quint8 mark);

    /// Removes the lines from this one on.
    void Truncate(size_t line);

    /// The last line that starts at an offset or before it; the first line if there is none. The
    /// table must not be empty.
    size_t LineAt(qint64 offset) const;

    /// How many of the first lines are the same in another table. Shared blocks are not compared.
    size_t CountSame(LineTable const& other) const;

    /// The lines from `first` to the one before `end` as a table of their own, which shares all
    /// blocks.
    ///
    /// @param offset  what the starts are less by
    LineTable Part(size_t first, size_t end, qint64 offset) const;

    /// Lines in a block.
    static constexpr size_t BlockSize = 16384;

    /// Reads the starts of many lines that are near each other, in any order.
    class Reader
    {
    public:
        /// @param lines  must exist, unchanged, as long as the reader
        explicit Reader(LineTable const& lines) : m_lines(&lines) {}

        qint64 start(size_t line);

    private:
        LineTable const* m_lines;
        size_t m_first = 0; // in the blocks
        size_t m_count = 0;
        std::array<qint64, GroupSize> m_starts{};
    };

private:
    // Some lines, and where their lengths are in the block.
    struct Group
    {
        qint64 start;
        size_t position;
    };

    struct Block
    {
        std::vector<Group> groups;
        std::vector<quint8> lengths; // of all lines but the last; see PutLength()
        std::vector<quint8> marks;   // with a palette: two numbers in each byte
        std::vector<quint8> palette;
        std::vector<quint16> checks;

        quint8 mark(size_t line) const
        {
            return palette.empty() ? marks[line]
                                   : palette[(marks[line / 2] >> (line % 2 * 4)) & 0xf];
        }
        qint64 start(size_t line, size_t& position) const;
        size_t lineAt(qint64 offset) const;
        bool hasSame(size_t group, Block const& other) const;
        void reserve();
        void truncate(size_t line);
        void pack();
        void unpack();
    };

    qint64 startInBlocks(size_t number) const;
    void cut();
    bool hasSameGroup(size_t line, LineTable const& other) const;

    // There may be other lines before the first one and after the last one.
    GrowingBlocks<Block, BlockSize> m_blocks;
    size_t m_first = 0;
    size_t m_size = 0;
    qint64 m_offset = 0;    // of the starts in the blocks
    qint64 m_lastStart = 0; // of the last line in the blocks
};

} // namespace Velocor
