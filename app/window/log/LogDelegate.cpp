// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/LogDelegate.h"

#include "app/window/log/LogModel.h"
#include "app/window/widgets/BlendedColor.h"
#include "app/window/widgets/SeverityIcons.h"

#include <QApplication>
#include <QPainter>
#include <QTextLayout>

namespace Velocor {

namespace {

QStyle const* StyleOf(QStyleOptionViewItem const& option)
{
    return option.widget ? option.widget->style() : QApplication::style();
}

// Dark text on yellow, readable on any background; underlined for users who cannot see yellow.
QTextCharFormat MarkFormat()
{
    QTextCharFormat format;
    format.setBackground(QColor(0xff, 0xe0, 0x66));
    format.setForeground(QColor(0x1a, 0x1a, 0x1a));
    format.setFontUnderline(true);
    return format;
}

} // namespace

LogDelegate::LogDelegate(QObject* parent) : QStyledItemDelegate(parent) {}

void LogDelegate::initStyleOption(QStyleOptionViewItem* option, QModelIndex const& index) const
{
    QStyledItemDelegate::initStyleOption(option, index);
    if (index.data(LogModel::HeadingRole).toBool()) {
        option->font.setBold(true);
        option->fontMetrics = QFontMetrics(option->font);
        return;
    }

    const auto severity =
        static_cast<LogEntry::Severity>(index.data(LogModel::SeverityRole).toInt());
    if (index.data(LogModel::EarlierRole).toBool())
        option->backgroundBrush =
            Blended(option->palette.color(option->features & QStyleOptionViewItem::Alternate
                                              ? QPalette::AlternateBase
                                              : QPalette::Base),
                    option->palette.color(QPalette::Text), 0.045);
    if (index.column() == LogModel::SeverityColumn)
        option->palette.setColor(QPalette::Text, SeverityIcons::Color(severity, option->palette));
}

void LogDelegate::paint(QPainter* painter, QStyleOptionViewItem const& option,
                        QModelIndex const& index) const
{
    QStyleOptionViewItem cell = option;
    initStyleOption(&cell, index);
    if (index.data(LogModel::HeadingRole).toBool()) {
        paintHeading(painter, cell);
        return;
    }

    // Not in the severity column, because the filter does not search translated names.
    const bool isMarkable = index.column() != LogModel::SeverityColumn;
    const QVector<QPair<int, int>> ranges =
        isMarkable ? m_filter.Ranges(cell.text) : QVector<QPair<int, int>>();
    if (ranges.isEmpty())
        StyleOf(cell)->drawControl(QStyle::CE_ItemViewItem, &cell, painter, cell.widget);
    else
        paintMarked(painter, cell, ranges);
}

void LogDelegate::paintHeading(QPainter* painter, QStyleOptionViewItem const& option)
{
    const QColor text = option.palette.color(QPalette::Text);
    const QColor background = Blended(option.palette.color(QPalette::Base), text, 0.14);
    painter->save();
    painter->fillRect(option.rect, background);
    painter->setFont(option.font);
    painter->setPen(text);
    painter->drawText(option.rect.adjusted(6, 0, -6, 0), Qt::AlignLeft | Qt::AlignVCenter,
                      option.text);
    if (option.state & QStyle::State_HasFocus) {
        QStyleOptionFocusRect focus;
        focus.QStyleOption::operator=(option);
        focus.backgroundColor = background;
        StyleOf(option)->drawPrimitive(QStyle::PE_FrameFocusRect, &focus, painter, option.widget);
    }
    painter->restore();
}

void LogDelegate::paintMarked(QPainter* painter, QStyleOptionViewItem const& option,
                              QVector<QPair<int, int>> const& ranges) const
{
    QStyle const* style = StyleOf(option);
    QStyleOptionViewItem background = option;
    background.text.clear();
    style->drawControl(QStyle::CE_ItemViewItem, &background, painter, option.widget);

    const QRect cell = style->subElementRect(QStyle::SE_ItemViewItemText, &option, option.widget);
    const int margin = style->pixelMetric(QStyle::PM_FocusFrameHMargin, nullptr, option.widget) + 1;
    const QRect area = cell.adjusted(margin, 0, -margin, 0);

    QVector<QTextLayout::FormatRange> formats;
    for (QPair<int, int> const& range : ranges) {
        QTextLayout::FormatRange format;
        format.start = range.first;
        format.length = range.second;
        format.format = MarkFormat();
        formats.append(format);
    }

    QTextLayout layout(option.text, option.font);
    QTextOption textOption(Qt::AlignLeft);
    textOption.setWrapMode(QTextOption::NoWrap);
    layout.setTextOption(textOption);
    layout.setFormats(formats);
    layout.beginLayout();
    QTextLine line = layout.createLine();
    if (line.isValid())
        line.setLineWidth(1 << 20);
    layout.endLayout();

    const bool selected = option.state & QStyle::State_Selected;
    const bool right = option.displayAlignment & Qt::AlignRight;
    const qreal x = right ? area.right() + 1 - line.naturalTextWidth() : area.left();
    painter->save();
    painter->setClipRect(area);
    painter->setPen(option.palette.color(selected ? QPalette::HighlightedText : QPalette::Text));
    layout.draw(painter, QPointF(x, area.top() + (area.height() - line.height()) / 2));
    painter->restore();
}

} // namespace Velocor
