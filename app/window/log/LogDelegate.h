// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogFilter.h"

#include <QStyledItemDelegate>
#include <QTextLayout>

namespace Velocor {

/// Draws the cells of a log view: headings between runs, severity colors, and highlighted matches
/// of the filter text and of the text to find, and the user's marks.
class LogDelegate : public QStyledItemDelegate
{
    Q_OBJECT

public:
    explicit LogDelegate(QObject* parent = nullptr);

    /// Highlights the matches of this filter.
    void SetFilter(LogFilter const& filter) { m_filter = filter; }

    /// Highlights the matches of this text in another color.
    void SetFound(LogFilter const& found) { m_found = found; }

    void paint(QPainter* painter, QStyleOptionViewItem const& option,
               QModelIndex const& index) const override;

protected:
    void initStyleOption(QStyleOptionViewItem* option, QModelIndex const& index) const override;

private:
    QVector<QTextLayout::FormatRange> marks(QString const& text) const;
    void paintMarked(QPainter* painter, QStyleOptionViewItem const& option,
                     QVector<QTextLayout::FormatRange> const& formats) const;
    static void paintUserMark(QPainter* painter, QStyleOptionViewItem const& option, bool hasNote);
    static void paintHeading(QPainter* painter, QStyleOptionViewItem const& option);

    LogFilter m_filter;
    LogFilter m_found;
};

} // namespace Velocor
