// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/LinesAsText.h"

#include "app/logfile/LogIndex.h"
#include "app/window/log/LogModel.h"

#include <algorithm>

namespace Velocor {

namespace {

constexpr QLatin1Char Quote('"');

// What is in the line. The time since another entry depends on what else is shown.
constexpr LogModel::Column CopiedColumns[] = {LogModel::TimeColumn, LogModel::SeverityColumn,
                                              LogModel::ElapsedColumn, LogModel::MessageColumn};

bool IsHeading(LogModel const& model, int row)
{
    return model.LineStart(row) < 0;
}

int LongestRun(QString const& text, QChar character)
{
    int longest = 0;
    int length = 0;
    for (QChar c : text) {
        length = c == character ? length + 1 : 0;
        longest = std::max(longest, length);
    }
    return longest;
}

QString Field(QString text)
{
    return Quote + text.replace(Quote, QLatin1String("\"\"")) + Quote;
}

QString Record(QStringList const& fields)
{
    return fields.join(QLatin1Char(',')) + QLatin1String("\r\n");
}

QString ColumnName(LogModel const& model, int column)
{
    return model.headerData(column, Qt::Horizontal, Qt::DisplayRole).toString();
}

QString CellText(LogModel const& model, int row, int column)
{
    return column == LogModel::MessageColumn ? model.MessageWithProgram(row)
                                             : model.CellText(row, column);
}

} // namespace

QString LinesAsText::Entries(LogModel const& model, QList<int> const& rows, int limit, int& count)
{
    QString text;
    count = 0;
    int next = 0; // the lines before are in the text
    for (int row : rows) {
        if (IsHeading(model, row))
            continue;
        const QPair<int, int> entry = model.EntryRows(row);
        for (next = std::max(next, entry.first); next <= entry.second && count < limit; ++next) {
            const QString line = model.LineText(next, LogIndex::LineLimit + 1);
            text += line.left(LogIndex::LineLimit);
            text += line.size() > LogIndex::LineLimit ? QStringLiteral("\u2026\n")
                                                      : QStringLiteral("\n");
            ++count;
        }
    }
    return text;
}

QString LinesAsText::Markdown(LogModel const& model, QList<int> const& rows)
{
    QString lines;
    for (int row : rows) {
        if (!IsHeading(model, row))
            lines += model.LineText(row, LogIndex::LineLimit) + QLatin1Char('\n');
    }
    const QChar tick = QLatin1Char('`');
    const QString fence(std::max(3, LongestRun(lines, tick) + 1), tick);
    return fence + QLatin1Char('\n') + lines + fence + QLatin1Char('\n');
}

QString LinesAsText::Csv(LogModel const& model, QList<int> const& rows)
{
    QStringList names;
    for (int column : CopiedColumns)
        names.append(Field(ColumnName(model, column)));
    QString text = Record(names);
    for (int row : rows) {
        if (IsHeading(model, row))
            continue;
        QStringList fields;
        for (int column : CopiedColumns)
            fields.append(Field(CellText(model, row, column)));
        text += Record(fields);
    }
    return text;
}

} // namespace Velocor
