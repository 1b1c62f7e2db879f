// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/LogDelegate.h"

#include "app/window/log/HighlightColors.h"
#include "app/window/log/HighlightRules.h"
#include "app/window/log/LogModel.h"
#include "app/window/log/TickScrollBar.h"
#include "app/window/widgets/BlendedColor.h"
#include "app/window/widgets/SeverityIcons.h"

#include <QApplication>
#include <QPainter>

namespace Velocor {

namespace {

constexpr int MarkWidth = 3; // pixels

// Dimmed, but still with a contrast of more than 4.5:1.
constexpr qreal ContextFade = 0.4;

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

// Dark text on light blue, which nobody mistakes for the yellow of the filter.
QTextCharFormat FoundFormat()
{
    QTextCharFormat format;
    format.setBackground(QColor(0x74, 0xe0, 0xef));
    format.setForeground(QColor(0x1a, 0x1a, 0x1a));
    return format;
}

void AddFormats(QVector<QTextLayout::FormatRange>& formats, QVector<QPair<int, int>> const& ranges,
                QTextCharFormat const& format)
{
    for (QPair<int, int> const& range : ranges) {
        QTextLayout::FormatRange added;
        added.start = range.first;
        added.length = range.second;
        added.format = format;
        formats.append(added);
    }
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
    const bool isAlternate = option->features & QStyleOptionViewItem::Alternate;
    if (index.data(LogModel::EarlierRole).toBool())
        option->backgroundBrush =
            Blended(option->palette.color(isAlternate ? QPalette::AlternateBase : QPalette::Base),
                    option->palette.color(QPalette::Text), 0.045);
    if (index.data(LogModel::ContextRole).toBool())
        option->palette.setColor(QPalette::Text,
                                 Blended(option->palette.color(QPalette::Text),
                                         option->palette.color(QPalette::Base), ContextFade));
    const int color = ruleColor(index);
    if (color >= 0) {
        option->backgroundBrush = HighlightColors::Background(color, option->palette);
        option->palette.setColor(QPalette::Text, HighlightColors::Text(option->palette));
    }
    if (index.column() == LogModel::TimeColumn && index.data(LogModel::MarkedRole).toBool())
        option->backgroundBrush =
            Blended(option->palette.color(QPalette::Base),
                    TickScrollBar::Color(TickScrollBar::Marked, option->palette), 0.2);
    if (index.column() == LogModel::SeverityColumn && !index.data(LogModel::ContextRole).toBool())
        option->palette.setColor(QPalette::Text, SeverityIcons::Color(severity, option->palette));
}

// Not in the severity column, which has colors of its own.
int LogDelegate::ruleColor(QModelIndex const& index) const
{
    if (!m_rules || m_rules->isIdle() || index.column() == LogModel::SeverityColumn)
        return -1;
    return m_rules->ColorOf(index.data(LogModel::LineRole).toString());
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
    const QVector<QTextLayout::FormatRange> formats =
        isMarkable ? marks(cell.text) : QVector<QTextLayout::FormatRange>();
    if (formats.isEmpty())
        StyleOf(cell)->drawControl(QStyle::CE_ItemViewItem, &cell, painter, cell.widget);
    else
        paintMarked(painter, cell, formats);
    if (index.column() == LogModel::TimeColumn && index.data(LogModel::MarkedRole).toBool())
        paintUserMark(painter, cell, !index.data(LogModel::NoteRole).toString().isEmpty());
}

// A bar at the edge of the row, and a folded corner if there is a note.
void LogDelegate::paintUserMark(QPainter* painter, QStyleOptionViewItem const& option, bool hasNote)
{
    const QRect cell = option.rect;
    const QColor color = TickScrollBar::Color(TickScrollBar::Marked, option.palette);
    painter->save();
    painter->fillRect(cell.left(), cell.top(), MarkWidth, cell.height(), color);
    if (hasNote) {
        const int size = cell.height() / 2;
        const QPoint corner(cell.right() + 1, cell.top());
        painter->setPen(Qt::NoPen);
        painter->setBrush(color);
        painter->drawPolygon(QPolygon(
            QVector<QPoint>({corner, corner - QPoint(size, 0), corner + QPoint(0, size)})));
    }
    painter->restore();
}

// Later formats are drawn over earlier ones.
QVector<QTextLayout::FormatRange> LogDelegate::marks(QString const& text) const
{
    QVector<QTextLayout::FormatRange> formats;
    AddFormats(formats, m_filter.Ranges(text), MarkFormat());
    AddFormats(formats, m_found.Ranges(text), FoundFormat());
    return formats;
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
                              QVector<QTextLayout::FormatRange> const& formats) const
{
    QStyle const* style = StyleOf(option);
    QStyleOptionViewItem background = option;
    background.text.clear();
    style->drawControl(QStyle::CE_ItemViewItem, &background, painter, option.widget);

    const QRect cell = style->subElementRect(QStyle::SE_ItemViewItemText, &option, option.widget);
    const int margin = style->pixelMetric(QStyle::PM_FocusFrameHMargin, nullptr, option.widget) + 1;
    const QRect area = cell.adjusted(margin, 0, -margin, 0);

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
