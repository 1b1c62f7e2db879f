// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/RepeatGroup.h"
#include "app/logfile/LogLineParser.h"
#include "app/logfile/LogSource.h"
#include "app/logfile/LogUpdate.h"

#include <functional>
#include <memory>
#include <vector>

namespace Velocor {

/// Finds entries of a log view that repeat the entry above: of the same severity and log, and with
/// the same MessagePattern in each of their lines.
///
/// Lines that belong to no entry are compared, too. Headings, torn lines and lines that are no
/// longer in the file repeat nothing, nor do entries of more than MostCompared bytes. Of an update
/// that changes some rows, only these are read. One thread at a time.
///
///     RepeatGroups repeats([] { return true; });
///     groups = repeats.Of(update, source, parser);
class RepeatGroups
{
public:
    using List = std::vector<RepeatGroup>;

    /// @param goesOn  asked now and then; false cancels
    explicit RepeatGroups(std::function<bool()> goesOn) : m_goesOn(std::move(goesOn)) {}

    /// The groups of all rows, from the first one on.
    ///
    /// @param update  unless it is a reset, it tells what differs from the rows of the last call
    /// @param source  where the lines are
    /// @param parser  knows the type of the file
    /// @return null if it was canceled
    std::shared_ptr<List const> Of(LogUpdate const& update, LogSource const& source,
                                   LogLineParser const& parser);

    /// Whether the next call need not read all rows, unless its update is a reset.
    // Cppcheck does not see that the groups are a member, here and below.
    // cppcheck-suppress functionStatic
    bool isKnown() const { return bool(m_groups); }

    /// Makes the next call read all rows.
    // cppcheck-suppress functionStatic
    void Forget();

    static constexpr int MostCompared = 1 << 20;

private:
    std::function<bool()> m_goesOn;
    std::shared_ptr<List const> m_groups; // of the last call; null if it is not known
    size_t m_rowCount = 0;                // then
};

} // namespace Velocor
