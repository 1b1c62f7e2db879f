// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/PatternModel.h"

#include "app/history/HistoryTime.h"
#include "app/logfile/LogSeverities.h"
#include "app/window/log/ShownText.h"
#include "app/window/widgets/PlainText.h"
#include "app/window/widgets/SeverityIcons.h"

#include <QGuiApplication>
#include <QLocale>

#include <algorithm>
#include <numeric>

namespace Velocor {

namespace {

using Pattern = PatternList::Pattern;

constexpr int LongestShownPattern = 1000; // characters

// Those without a severity are the least severe.
int RankOf(LogEntry::Severity severity)
{
    return severity == LogEntry::None ? -1 : static_cast<int>(severity);
}

bool IsBefore(Pattern const& a, Pattern const& b, int column)
{
    switch (column) {
    case PatternModel::SeverityColumn:
        return RankOf(a.severity) < RankOf(b.severity);
    case PatternModel::FirstColumn:
        return a.first < b.first;
    case PatternModel::LastColumn:
        return a.last < b.last;
    case PatternModel::PatternColumn:
        return a.text < b.text;
    default:
        return a.count < b.count;
    }
}

} // namespace

void PatternModel::SetCounted(std::shared_ptr<CountedPatterns const> const& counted)
{
    beginResetModel();
    m_counted = counted;
    sortRows();
    endResetModel();
}

void PatternModel::sortRows()
{
    std::vector<Pattern> const& patterns = m_counted->patterns;
    m_order.resize(patterns.size());
    std::iota(m_order.begin(), m_order.end(), size_t(0));
    std::stable_sort(m_order.begin(), m_order.end(), [&](size_t a, size_t b) {
        return m_sortOrder == Qt::AscendingOrder ? IsBefore(patterns[a], patterns[b], m_column)
                                                 : IsBefore(patterns[b], patterns[a], m_column);
    });
}

void PatternModel::sort(int column, Qt::SortOrder order)
{
    Q_EMIT layoutAboutToBeChanged();
    const QModelIndexList before = persistentIndexList();
    std::vector<size_t> numbers;
    for (QModelIndex const& index : before)
        numbers.push_back(m_order[static_cast<size_t>(index.row())]);
    m_column = column;
    m_sortOrder = order;
    sortRows();
    std::vector<int> rows(m_order.size());
    for (size_t row = 0; row < m_order.size(); ++row)
        rows[m_order[row]] = static_cast<int>(row);
    QModelIndexList after;
    for (int i = 0; i < before.size(); ++i)
        after.append(index(rows[numbers[static_cast<size_t>(i)]], before[i].column()));
    changePersistentIndexList(before, after);
    Q_EMIT layoutChanged();
}

PatternList::Pattern const& PatternModel::pattern(int row) const
{
    return m_counted->patterns[m_order[static_cast<size_t>(row)]];
}

int PatternModel::RowOf(PatternList::Pattern const& pattern) const
{
    for (size_t row = 0; row < m_order.size(); ++row) {
        Pattern const& other = m_counted->patterns[m_order[row]];
        if (other.severity == pattern.severity && other.text == pattern.text)
            return static_cast<int>(row);
    }
    return -1;
}

int PatternModel::rowCount(QModelIndex const& parent) const
{
    return parent.isValid() ? 0 : static_cast<int>(m_order.size());
}

int PatternModel::columnCount(QModelIndex const& parent) const
{
    return parent.isValid() ? 0 : PatternColumn + 1;
}

QString PatternModel::timeText(qint64 time) const
{
    if (time < 0)
        return QString();
    return HistoryTime::DateTime(time).toString(m_counted->isDated
                                                    ? QStringLiteral("yyyy-MM-dd HH:mm:ss.zzz")
                                                    : QStringLiteral("HH:mm:ss.zzz"));
}

QString PatternModel::cellText(Pattern const& pattern, int column) const
{
    switch (column) {
    case CountColumn:
        return QLocale().toString(static_cast<qulonglong>(pattern.count));
    case SeverityColumn:
        return LogSeverities::Name(pattern.severity);
    case FirstColumn:
        return timeText(pattern.first);
    case LastColumn:
        return timeText(pattern.last);
    default:
        if (PatternList::IsRest(pattern))
            return tr("\u2026 (other messages)");
        return ShownText(Shortened(pattern.text, LongestShownPattern));
    }
}

QVariant PatternModel::data(QModelIndex const& index, int role) const
{
    if (!index.isValid())
        return QVariant();
    Pattern const& shown = pattern(index.row());
    switch (role) {
    case Qt::DisplayRole:
        return cellText(shown, index.column());
    case Qt::ToolTipRole:
        return PlainToolTip(LeftToRight(cellText(shown, index.column())));
    case Qt::DecorationRole:
        return index.column() == SeverityColumn
                   ? QVariant(SeverityIcons::Icon(shown.severity, QGuiApplication::palette()))
                   : QVariant();
    case Qt::TextAlignmentRole:
        return index.column() == CountColumn ? QVariant(int(Qt::AlignRight | Qt::AlignVCenter))
                                             : QVariant();
    default:
        return QVariant();
    }
}

QVariant PatternModel::headerData(int section, Qt::Orientation orientation, int role) const
{
    if (orientation != Qt::Horizontal || role != Qt::DisplayRole)
        return QVariant();
    switch (section) {
    case CountColumn:
        return tr("Count");
    case SeverityColumn:
        return tr("Severity");
    case FirstColumn:
        return tr("First");
    case LastColumn:
        return tr("Last");
    default:
        return tr("Pattern");
    }
}

} // namespace Velocor
