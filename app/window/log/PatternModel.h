// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/window/log/PatternCounter.h"

#include <QAbstractTableModel>

#include <memory>
#include <vector>

namespace Velocor {

/// The list of message patterns, in an order that the user chooses. GUI thread.
class PatternModel : public QAbstractTableModel
{
    Q_OBJECT

public:
    enum Column { CountColumn, SeverityColumn, FirstColumn, LastColumn, PatternColumn };

    using QAbstractTableModel::QAbstractTableModel;

    /// Shows what has been counted, in the same order as before.
    void SetCounted(std::shared_ptr<CountedPatterns const> const& counted);

    PatternList::Pattern const& pattern(int row) const;

    /// The row of a pattern; -1 if it is not in the list.
    int RowOf(PatternList::Pattern const& pattern) const;

    int rowCount(QModelIndex const& parent = QModelIndex()) const override;
    int columnCount(QModelIndex const& parent = QModelIndex()) const override;
    QVariant data(QModelIndex const& index, int role) const override;
    QVariant headerData(int section, Qt::Orientation orientation, int role) const override;

    /// Patterns that are equal in this column are in the order of PatternList::Sorted().
    void sort(int column, Qt::SortOrder order) override;

private:
    QString cellText(PatternList::Pattern const& pattern, int column) const;
    QString timeText(qint64 time) const;
    void sortRows();

    std::shared_ptr<CountedPatterns const> m_counted = std::make_shared<CountedPatterns>();
    std::vector<size_t> m_order; // numbers of patterns, by row
    int m_column = CountColumn;
    Qt::SortOrder m_sortOrder = Qt::DescendingOrder;
};

} // namespace Velocor
