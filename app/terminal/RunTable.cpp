// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/terminal/RunTable.h"

#include "app/terminal/TextFormats.h"

#include <QStringList>

#include <algorithm>

namespace Velocor {

namespace {

QVector<QString> ColumnNames()
{
    return {QStringLiteral("program"),  QStringLiteral("start"),  QStringLiteral("end"),
            QStringLiteral("warnings"), QStringLiteral("errors"), QStringLiteral("lines"),
            QStringLiteral("file")};
}

constexpr int FirstNumber = 3; // columns of numbers
constexpr int EndOfNumbers = 6;

size_t ErrorsOf(HistoryRun const& run)
{
    return run.counts[LogEntry::Error] + run.counts[LogEntry::Fatal];
}

QString TableTime(qint64 time)
{
    return TextFormats::Time(time).replace(QLatin1Char('T'), QLatin1Char(' '));
}

// A start that is not known exactly: the entries before it have been overwritten.
QString StartOf(HistoryRun const& run)
{
    const QString time = TableTime(run.start);
    return run.isCut && !time.isEmpty() ? QLatin1Char('<') + time : time;
}

QString InTable(QString text)
{
    return TextFormats::Harmless(text.replace(QLatin1Char('|'), QLatin1String("\\|")));
}

} // namespace

void RunTable::Add(QString const& program, LogHistory const& history)
{
    qint64 key = -1;
    for (HistoryRun const& run : history.runs()) {
        key = std::max(key, run.start);
        m_rows.push_back({program, history.files()[run.file].path(), run, key});
    }
}

void RunTable::SortByTime()
{
    std::stable_sort(m_rows.begin(), m_rows.end(),
                     [](Row const& a, Row const& b) { return a.key < b.key; });
}

QVector<QString> RunTable::cells(Row const& row)
{
    return {row.program,
            StartOf(row.run),
            TableTime(row.run.end),
            QString::number(row.run.counts[LogEntry::Warning]),
            QString::number(ErrorsOf(row.run)),
            QString::number(row.run.endLine - row.run.firstLine),
            row.file};
}

QVector<QPair<char const*, QString>> RunTable::members(Row const& row)
{
    QVector<QPair<char const*, QString>> all = {{"program", TextFormats::JsonText(row.program)}};
    if (row.run.start >= 0) {
        all.append({"start", TextFormats::JsonText(TextFormats::Time(row.run.start))});
        all.append({"end", TextFormats::JsonText(TextFormats::Time(row.run.end))});
    }
    all.append({"isCut", QString::fromLatin1(row.run.isCut ? "true" : "false")});
    all.append({"warnings", QString::number(row.run.counts[LogEntry::Warning])});
    all.append({"errors", QString::number(ErrorsOf(row.run))});
    all.append({"lines", QString::number(row.run.endLine - row.run.firstLine)});
    all.append({"file", TextFormats::JsonText(row.file)});
    return all;
}

void RunTable::printText(OutputBuffer& output) const
{
    std::vector<QVector<QString>> table = {ColumnNames()};
    for (Row const& row : m_rows)
        table.push_back(cells(row));
    QVector<int> widths(table.front().size());
    for (QVector<QString> const& line : table) {
        for (int column = 0; column < widths.size(); ++column)
            widths[column] = std::max(widths[column], line[column].size());
    }
    for (QVector<QString> const& line : table) {
        QString text;
        for (int column = 0; column < widths.size(); ++column) {
            const bool isNumber = column >= FirstNumber && column < EndOfNumbers;
            const QString cell = TextFormats::Harmless(line[column]);
            text += isNumber ? cell.rightJustified(widths[column])
                             : cell.leftJustified(column + 1 < widths.size() ? widths[column] : 0);
            text += column + 1 < widths.size() ? QLatin1String("  ") : QLatin1String("\n");
        }
        output.Write(text.toLocal8Bit());
    }
}

void RunTable::printMarkdown(OutputBuffer& output) const
{
    const auto print = [&output](QVector<QString> const& fields) {
        QString text(QLatin1Char('|'));
        for (QString const& field : fields)
            text += QLatin1Char(' ') + InTable(field) + QLatin1String(" |");
        output.Write(text.toUtf8() + '\n');
    };
    print(ColumnNames());
    print(QVector<QString>(ColumnNames().size(), QStringLiteral("---")));
    for (Row const& row : m_rows)
        print(cells(row));
}

void RunTable::Print(TerminalOptions::Format format, OutputBuffer& output) const
{
    if (format == TerminalOptions::Text && !isEmpty())
        printText(output);
    if (format == TerminalOptions::Markdown)
        printMarkdown(output);
    if (format == TerminalOptions::Csv) {
        output.Write(TextFormats::CsvRecord(ColumnNames()));
        for (Row const& row : m_rows)
            output.Write(TextFormats::CsvRecord(cells(row)));
    }
    if (format != TerminalOptions::Json)
        return;
    for (Row const& row : m_rows)
        output.Write(TextFormats::JsonLine(members(row)));
}

} // namespace Velocor
