// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/LogHistory.h"
#include "app/history/MessagePattern.h"
#include "app/terminal/TextTable.h"

#include <vector>

namespace Velocor {

/// The runs of logs as a table.
///
///     RunTable runs;
///     runs.Add("Notes", history);
///     runs.Table().Print(TerminalOptions::Text, output);
class RunTable
{
public:
    /// Adds the runs of a log.
    ///
    /// @param history  with times
    void Add(QString const& program, LogHistory const& history);

    /// Puts the runs of all logs in the order in which they began.
    void SortByTime();

    TextTable Table() const;

private:
    struct Row
    {
        QString program;
        QString file;
        HistoryRun run;
        qint64 key; // never less than that of the run before of the same log
    };

    std::vector<Row> m_rows;
};

/// Patterns of messages as a table, the most frequent first.
TextTable PatternTable(PatternList const& patterns);

} // namespace Velocor
