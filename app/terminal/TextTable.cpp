// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/terminal/TextTable.h"

#include "app/terminal/TextFormats.h"

#include <algorithm>

namespace Velocor {

namespace {

QByteArray MarkdownRow(QVector<QString> const& cells)
{
    QString text(QLatin1Char('|'));
    for (QString cell : cells) {
        cell.replace(QLatin1Char('|'), QLatin1String("\\|"));
        text += QLatin1Char(' ') + TextFormats::Harmless(cell) + QLatin1String(" |");
    }
    return text.toUtf8() + '\n';
}

} // namespace

QVector<QString> TextTable::names() const
{
    QVector<QString> names;
    for (Column const& column : m_columns)
        names.append(QString::fromLatin1(column.name));
    return names;
}

// A cell for people.
QString TextTable::shown(QVector<QString> const& row, int column) const
{
    QString cell = row[column];
    return m_columns[column].kind == Time ? cell.replace(QLatin1Char('T'), QLatin1Char(' ')) : cell;
}

// The last column is as wide as each of its cells.
QVector<int> TextTable::widths() const
{
    QVector<int> widths;
    for (int column = 0; column + 1 < m_columns.size(); ++column) {
        int width = QString::fromLatin1(m_columns[column].name).size();
        for (QVector<QString> const& row : m_rows)
            width = std::max<int>(width, row[column].size());
        widths.append(width);
    }
    return widths << 0;
}

void TextTable::printText(OutputBuffer& output) const
{
    const QVector<int> columns = widths();
    const auto print = [&](QVector<QString> const& row) {
        QString text;
        for (int column = 0; column < columns.size(); ++column) {
            const QString cell = TextFormats::Harmless(shown(row, column));
            text += column > 0 ? QLatin1String("  ") : QLatin1String("");
            text += m_columns[column].kind == Number ? cell.rightJustified(columns[column])
                                                     : cell.leftJustified(columns[column]);
        }
        output.Write(text.toLocal8Bit() + '\n');
    };
    if (m_rows.empty())
        return;
    print(names());
    for (QVector<QString> const& row : m_rows)
        print(row);
}

void TextTable::printMarkdown(OutputBuffer& output) const
{
    output.Write(MarkdownRow(names()));
    QVector<QString> lines;
    for (Column const& column : m_columns)
        lines.append(QString::fromLatin1(column.kind == Number ? "---:" : "---"));
    output.Write(MarkdownRow(lines));
    for (QVector<QString> const& row : m_rows) {
        QVector<QString> cells;
        for (int column = 0; column < row.size(); ++column)
            cells.append(shown(row, column));
        output.Write(MarkdownRow(cells));
    }
}

void TextTable::printCsv(OutputBuffer& output) const
{
    output.Write(TextFormats::CsvRecord(names()));
    for (QVector<QString> const& row : m_rows)
        output.Write(TextFormats::CsvRecord(row));
}

void TextTable::printJson(OutputBuffer& output) const
{
    for (QVector<QString> const& row : m_rows) {
        QVector<QPair<char const*, QString>> members;
        for (int column = 0; column < row.size(); ++column) {
            const bool isNumber = m_columns[column].kind == Number;
            if (!row[column].isEmpty())
                members.append({m_columns[column].name,
                                isNumber ? row[column] : TextFormats::JsonText(row[column])});
        }
        output.Write(TextFormats::JsonLine(members));
    }
}

void TextTable::Print(TerminalOptions::Format format, OutputBuffer& output) const
{
    switch (format) {
    case TerminalOptions::Text:
        printText(output);
        break;
    case TerminalOptions::Markdown:
        printMarkdown(output);
        break;
    case TerminalOptions::Csv:
        printCsv(output);
        break;
    case TerminalOptions::Json:
        printJson(output);
        break;
    }
}

} // namespace Velocor
