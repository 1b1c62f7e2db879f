// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/ProblemBlocks.h"

#include "app/logfile/LogRows.h"
#include "app/logfile/LogSeverities.h"

#include <algorithm>

namespace Velocor {

LogEntry::Severity ProblemBlocks::ProblemOf(quint8 mark)
{
    const auto severity = static_cast<LogEntry::Severity>(mark & LogRows::SeverityMask);
    return LogSeverities::IsProblem(severity) && !(mark & LogRows::Continued) ? severity
                                                                              : NoProblem;
}

LogEntry::Severity ProblemBlocks::Worse(LogEntry::Severity a, LogEntry::Severity b)
{
    if (a == NoProblem || b == NoProblem)
        return a == NoProblem ? b : a;
    return std::max(a, b);
}

void ProblemBlocks::Reset(size_t rows)
{
    m_blocks.clear();
    m_size = 0;
    m_unknown = 0;
    Insert(0, rows);
}

// From the end, where most changes are. The row after the last one is in the last block.
ProblemBlocks::Place ProblemBlocks::placeOf(size_t row) const
{
    size_t block = m_blocks.size() - 1;
    size_t start = m_size - m_blocks[block].rows;
    while (row < start)
        start -= m_blocks[--block].rows;
    return {block, row - start};
}

void ProblemBlocks::forget(Block& block)
{
    m_unknown += block.isKnown ? 1 : 0;
    block.isKnown = false;
}

// A full block is split evenly, or rows that arrive one by one would make a block each.
void ProblemBlocks::Insert(size_t first, size_t count)
{
    if (count == 0)
        return;
    if (m_blocks.empty())
        m_blocks.push_back({0, true, NoProblem});
    const size_t block = placeOf(first).block;
    size_t rows = m_blocks[block].rows + count;
    size_t blocks = (rows - 1) / BlockSize + 1;
    m_size += count;
    m_blocks.insert(m_blocks.begin() + static_cast<std::ptrdiff_t>(block), blocks - 1,
                    {0, true, NoProblem});
    for (size_t changed = block; blocks > 0; ++changed, --blocks) {
        const size_t taken = rows / blocks;
        m_blocks[changed].rows = static_cast<quint16>(taken);
        forget(m_blocks[changed]);
        rows -= taken;
    }
}

void ProblemBlocks::Remove(size_t first, size_t count)
{
    if (count == 0)
        return;
    const Place place = placeOf(first);
    size_t offset = place.offset;
    m_size -= count;
    for (size_t block = place.block; count > 0; ++block) {
        const size_t taken = std::min(count, m_blocks[block].rows - offset);
        m_blocks[block].rows = static_cast<quint16>(m_blocks[block].rows - taken);
        forget(m_blocks[block]);
        count -= taken;
        offset = 0;
    }
    const auto isEmpty = [](Block const& block) {
        return block.rows == 0;
    };
    const auto kept = std::remove_if(m_blocks.begin(), m_blocks.end(), isEmpty);
    m_unknown -= static_cast<size_t>(m_blocks.end() - kept);
    m_blocks.erase(kept, m_blocks.end());
}

void ProblemBlocks::Change(size_t first, size_t count)
{
    if (count == 0)
        return;
    const Place place = placeOf(first);
    size_t reached = 0;
    for (size_t block = place.block; reached < place.offset + count; ++block) {
        reached += m_blocks[block].rows;
        forget(m_blocks[block]);
    }
}

void ProblemBlocks::Look(Marks const& marks, size_t limit)
{
    size_t first = 0;
    size_t looked = 0;
    for (Block& block : m_blocks) {
        if (m_unknown == 0 || (looked > 0 && looked >= limit))
            return;
        if (!block.isKnown) {
            LogEntry::Severity worst = NoProblem;
            for (size_t row = first; row < first + block.rows; ++row)
                worst = Worse(worst, ProblemOf(marks(row)));
            block.worst = static_cast<quint8>(worst);
            block.isKnown = true;
            --m_unknown;
            looked += block.rows;
        }
        first += block.rows;
    }
}

std::vector<LogEntry::Severity> ProblemBlocks::Worst(Marks const& marks, size_t parts) const
{
    std::vector<LogEntry::Severity> worst(parts, NoProblem);
    if (parts == 0)
        return worst;
    size_t first = 0;
    for (Block const& block : m_blocks) {
        const size_t end = first + block.rows;
        if (block.isKnown && block.worst != NoProblem) {
            const size_t firstPart = first * parts / m_size;
            const size_t lastPart = (end - 1) * parts / m_size;
            if (firstPart == lastPart) {
                worst[firstPart] =
                    Worse(worst[firstPart], static_cast<LogEntry::Severity>(block.worst));
            } else {
                for (size_t row = first; row < end; ++row) {
                    const size_t part = row * parts / m_size;
                    worst[part] = Worse(worst[part], ProblemOf(marks(row)));
                }
            }
        }
        first = end;
    }
    return worst;
}

} // namespace Velocor
