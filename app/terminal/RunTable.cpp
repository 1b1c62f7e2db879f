// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/terminal/RunTable.h"

#include "app/logfile/LogSeverities.h"
#include "app/terminal/TextFormats.h"

#include <QObject>

#include <algorithm>

namespace Velocor {

namespace {

size_t ErrorsOf(HistoryRun const& run)
{
    return run.counts[LogEntry::Error] + run.counts[LogEntry::Fatal];
}

QString ExitName(HistoryRun::Exit exit)
{
    switch (exit) {
    case HistoryRun::Unknown:
        break;
    case HistoryRun::Normal:
        return QStringLiteral("normal");
    case HistoryRun::Abnormal:
        return QStringLiteral("abnormal");
    case HistoryRun::Running:
        return QStringLiteral("running");
    }
    return QStringLiteral("unknown");
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

TextTable RunTable::Table() const
{
    TextTable table({{"program", TextTable::Text},
                     {"start", TextTable::Time},
                     {"end", TextTable::Time},
                     {"exit", TextTable::Text},
                     {"warnings", TextTable::Number},
                     {"errors", TextTable::Number},
                     {"lines", TextTable::Number},
                     {"note", TextTable::Text},
                     {"file", TextTable::Text}});
    for (Row const& row : m_rows)
        table.AddRow({row.program, TextFormats::Time(row.run.start), TextFormats::Time(row.run.end),
                      ExitName(row.run.exit), QString::number(row.run.counts[LogEntry::Warning]),
                      QString::number(ErrorsOf(row.run)),
                      QString::number(row.run.endLine - row.run.firstLine),
                      row.run.isCut ? QObject::tr("start overwritten") : QString(), row.file});
    return table;
}

TextTable PatternTable(PatternList const& patterns)
{
    TextTable table({{"count", TextTable::Number},
                     {"first", TextTable::Time},
                     {"last", TextTable::Time},
                     {"severity", TextTable::Text},
                     {"pattern", TextTable::Text}});
    for (PatternList::Pattern const& pattern : patterns.Sorted())
        table.AddRow({QString::number(pattern.count), TextFormats::Time(pattern.first),
                      TextFormats::Time(pattern.last),
                      QString::fromLatin1(LogSeverities::LoggedName(pattern.severity)),
                      pattern.text});
    return table;
}

} // namespace Velocor
