// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogFilter.h"

#include <QStyledItemDelegate>

namespace Velocor {

/// Draws the cells of a log view: headings between runs, severity colors, and highlighted matches
/// of the filter text.
class LogDelegate : public QStyledItemDelegate
{
    Q_OBJECT

public:
    explicit LogDelegate(QObject* parent = nullptr);

    /// Highlights the matches of this filter.
    void SetFilter(LogFilter const& filter) { m_filter = filter; }

    void paint(QPainter* painter, QStyleOptionViewItem const& option,
               QModelIndex const& index) const override;

protected:
    void initStyleOption(QStyleOptionViewItem* option, QModelIndex const& index) const override;

private:
    void paintMarked(QPainter* painter, QStyleOptionViewItem const& option,
                     QVector<QPair<int, int>> const& ranges) const;
    static void paintHeading(QPainter* painter, QStyleOptionViewItem const& option);

    LogFilter m_filter;
};

} // namespace Velocor
