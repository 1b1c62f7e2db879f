// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/LogHistory.h"
#include "app/terminal/OutputBuffer.h"
#include "app/terminal/TerminalOptions.h"

#include <QPair>
#include <QString>
#include <QVector>

#include <vector>

namespace Velocor {

/// The runs of logs as a table.
///
///     RunTable table;
///     table.Add("Notes", history);
///     table.Print(TerminalOptions::Text, output);
class RunTable
{
public:
    /// Adds the runs of a log.
    ///
    /// @param history  with times
    void Add(QString const& program, LogHistory const& history);

    /// Puts the runs of all logs in the order in which they began.
    void SortByTime();

    bool isEmpty() const { return m_rows.empty(); }

    /// Prints all runs.
    void Print(TerminalOptions::Format format, OutputBuffer& output) const;

private:
    struct Row
    {
        QString program;
        QString file;
        HistoryRun run;
        qint64 key; ///< never less than that of the run before of the same log
    };

    static QVector<QString> cells(Row const& row);
    static QVector<QPair<char const*, QString>> members(Row const& row);
    void printText(OutputBuffer& output) const;
    void printMarkdown(OutputBuffer& output) const;

    std::vector<Row> m_rows;
};

} // namespace Velocor
