// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogEntry.h"

#include <QtGlobal>

#include <cstddef>
#include <functional>
#include <vector>

namespace Velocor {

/// Where the problems are among the rows of a log: the worst severity of each few hundred rows.
///
/// A picture of all rows needs no more, and a change of some rows makes only their blocks unknown.
/// Look() finds out about those in portions of any size, because a log may have many millions of
/// rows. A plain value; one thread at a time.
///
///     blocks.Reset(rows.size());
///     while (!blocks.isComplete())
///         blocks.Look(marks, 100000);
///     worst = blocks.Worst(marks, height);
class ProblemBlocks
{
public:
    /// What a place without a problem has.
    static constexpr LogEntry::Severity NoProblem = LogEntry::None;

    /// The mark of a row, as LogRows::mark().
    using Marks = std::function<quint8(size_t row)>;

    /// The severity of a row that begins an entry and is a problem; NoProblem for others.
    ///
    /// @param mark  of the row
    static LogEntry::Severity ProblemOf(quint8 mark);

    /// The worse of two problems.
    static LogEntry::Severity Worse(LogEntry::Severity a, LogEntry::Severity b);

    /// Starts again with other rows, about which nothing is known.
    void Reset(size_t rows);

    /// Makes room for new rows, which are unknown, before row `first` or at the end.
    void Insert(size_t first, size_t count);

    /// Forgets rows, which must exist.
    void Remove(size_t first, size_t count);

    /// Tells that rows, which must exist, may have got other severities.
    void Change(size_t first, size_t count);

    /// Looks at unknown blocks, from the first one on.
    ///
    /// @param marks  of as many rows as this object has been told of
    /// @param limit  about how many rows to look at; at least one block is looked at
    void Look(Marks const& marks, size_t limit);

    /// Whether all rows are known.
    bool isComplete() const { return m_unknown == 0; }

    /// The number of rows.
    size_t size() const { return m_size; }

    /// The worst problem in each of several parts of equal height that all rows are divided into:
    /// row `r` is in part `r * parts / size()`. Unknown rows count as none. Looks at the rows of
    /// few blocks only.
    ///
    /// @param marks  of as many rows as this object has been told of
    std::vector<LogEntry::Severity> Worst(Marks const& marks, size_t parts) const;

private:
    static constexpr size_t BlockSize = 256; // at most

    struct Block
    {
        quint16 rows;
        bool isKnown;
        quint8 worst;
    };

    struct Place
    {
        size_t block;
        size_t offset; // in the block
    };

    Place placeOf(size_t row) const;
    void forget(Block& block);

    std::vector<Block> m_blocks; // without empty ones
    size_t m_size = 0;
    size_t m_unknown = 0; // blocks
};

} // namespace Velocor
