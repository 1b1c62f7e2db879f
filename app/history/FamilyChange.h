// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/HistoryUpdate.h"
#include "app/logfile/LogRows.h"

#include <vector>

namespace Velocor {

/// Where the lines of one log are among those of several, before and after a change, and how many
/// of the first ones are the same.
struct FamilyLines
{
    size_t before = 0;
    size_t after = 0;
    size_t same = 0;
};

/// Finds what differs between two lists of merged rows: some rows in one place, and more at the
/// end. One thread at a time.
///
///     FamilyChange(before, after, lines).Find(update);
class FamilyChange
{
public:
    /// @param before, after  must exist, unchanged, as long as this
    /// @param logs  in the order of their lines
    FamilyChange(LogRows const& before, LogRows const& after, std::vector<FamilyLines> const& logs)
        : m_before(before), m_after(after), m_beforeStarts(before), m_afterStarts(after),
          m_logs(logs)
    {}

    /// Tells where rows were inserted or removed, or that all of them may have changed.
    void Find(HistoryUpdate& update);

private:
    bool isSameLine(size_t before, size_t after) const;
    bool isSame(size_t before, size_t after);
    bool isSameToEnd(size_t before, size_t after);
    bool findNext(HistoryUpdate& update);

    LogRows const& m_before;
    LogRows const& m_after;
    LogRows::Reader m_beforeStarts;
    LogRows::Reader m_afterStarts;
    std::vector<FamilyLines> m_logs;
};

} // namespace Velocor
