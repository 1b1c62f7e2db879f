// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/terminal/OutputBuffer.h"
#include "app/terminal/TerminalOptions.h"

#include <QString>
#include <QVector>

#include <vector>

namespace Velocor {

/// A table in the formats of velocor-log.
///
///     TextTable table({{"program", TextTable::Text}, {"lines", TextTable::Number}});
///     table.AddRow({"Notes", "12"});
///     table.Print(TerminalOptions::Text, output);
class TextTable
{
public:
    enum Kind {
        Text,
        Number,
        Time ///< cells as TextFormats::Time(); for people, a blank separates date and time
    };

    struct Column
    {
        char const* name;
        Kind kind;
    };

    explicit TextTable(QVector<Column> columns) : m_columns(std::move(columns)) {}

    void AddRow(QVector<QString> cells) { m_rows.push_back(std::move(cells)); }
    bool isEmpty() const { return m_rows.empty(); }

    /// Prints all rows: as text in columns, as a Markdown table, as CSV with a first line of names,
    /// or as a JSON object for each row, without members for empty cells.
    void Print(TerminalOptions::Format format, OutputBuffer& output) const;

private:
    QVector<QString> names() const;
    QVector<int> widths() const;
    QString shown(QVector<QString> const& row, int column) const;
    void printText(OutputBuffer& output) const;
    void printMarkdown(OutputBuffer& output) const;
    void printCsv(OutputBuffer& output) const;
    void printJson(OutputBuffer& output) const;

    QVector<Column> m_columns;
    std::vector<QVector<QString>> m_rows;
};

} // namespace Velocor
