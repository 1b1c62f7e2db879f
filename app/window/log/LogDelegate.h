// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogFilter.h"

#include <QStyledItemDelegate>
#include <QTextLayout>

#include <memory>

namespace Velocor {

class HighlightRules;

/// Draws the cells of a log view: headings between runs, severity colors, and highlighted matches
/// of the filter text and of the text to find, the user's marks, and lines that rules highlight.
class LogDelegate : public QStyledItemDelegate
{
    Q_OBJECT

public:
    explicit LogDelegate(QObject* parent = nullptr);

    /// Highlights the matches of this filter.
    void SetFilter(LogFilter const& filter) { m_filter = filter; }

    /// Highlights the matches of this text in another color.
    void SetFound(LogFilter const& found) { m_found = found; }

    /// Highlights whole lines, except for their severity.
    void SetRules(std::shared_ptr<HighlightRules> const& rules) { m_rules = rules; }

    /// Wraps messages to several lines, at most to this number; 1: does not wrap them.
    void SetMostLines(int lines) { m_mostLines = lines; }

    /// The height of a row with a message in a column of a width, in pixels.
    ///
    /// @param gap  as LogModel::GapRole
    /// @param repeats  as LogModel::RepeatsRole
    int HeightOf(QString const& message, QString const& gap, QString const& repeats,
                 QFont const& font, int width) const;

    /// Where in the cell of a message it says how often it is repeated.
    ///
    /// @param repeats  as LogModel::RepeatsRole
    static QRect RepeatsArea(QString const& repeats, QFont const& font, QRect const& cell);

    void paint(QPainter* painter, QStyleOptionViewItem const& option,
               QModelIndex const& index) const override;

protected:
    void initStyleOption(QStyleOptionViewItem* option, QModelIndex const& index) const override;

private:
    void paintContent(QPainter* painter, QStyleOptionViewItem const& option,
                      QModelIndex const& index) const;
    int ruleColor(QModelIndex const& index) const;
    QVector<QTextLayout::FormatRange> marks(QString const& text, QString const& line) const;
    static void paintPlain(QPainter* painter, QStyleOptionViewItem const& option);
    static void paintMarked(QPainter* painter, QStyleOptionViewItem const& option,
                            QVector<QTextLayout::FormatRange> const& formats, int mostLines);
    static void paintEmpty(QPainter* painter, QStyleOptionViewItem const& option);
    static void paintUserMark(QPainter* painter, QStyleOptionViewItem const& option, bool hasNote);
    static void paintGap(QPainter* painter, QStyleOptionViewItem const& option,
                         QModelIndex const& index, QString const& gap);
    static void paintRepeats(QPainter* painter, QStyleOptionViewItem const& option,
                             QString const& repeats);
    static void paintHeading(QPainter* painter, QStyleOptionViewItem const& option);

    LogFilter m_filter;
    LogFilter m_found;
    std::shared_ptr<HighlightRules> m_rules;
    int m_mostLines = 1;
};

} // namespace Velocor
