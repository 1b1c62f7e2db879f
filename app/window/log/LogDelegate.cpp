// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/LogDelegate.h"

#include "app/window/log/HighlightColors.h"
#include "app/window/log/HighlightRules.h"
#include "app/window/log/LogModel.h"
#include "app/window/log/TickColors.h"
#include "app/window/widgets/BlendedColor.h"
#include "app/window/widgets/Contrast.h"
#include "app/window/widgets/RowHeight.h"
#include "app/window/widgets/SeverityIcons.h"

#include <QApplication>
#include <QPainter>
#include <QtMath>

#include <algorithm>

namespace Velocor {

namespace {

constexpr int MarkWidth = 3; // pixels, as is the next one
constexpr int GapMargin = 8;
constexpr int RepeatsMargin = 3;

constexpr qreal ContextFade = 0.4;

// Of the line above a gap.
constexpr qreal GapStrength = 0.55;
constexpr qreal RepeatsStrength = 0.16;

QStyle const* StyleOf(QStyleOptionViewItem const& option)
{
    return option.widget ? option.widget->style() : QApplication::style();
}

// What a text is painted on if it is not selected.
QColor GroundOf(QStyleOptionViewItem const& option)
{
    if (option.backgroundBrush.style() != Qt::NoBrush)
        return option.backgroundBrush.color();
    const bool isAlternate = option.features & QStyleOptionViewItem::Alternate;
    return option.palette.color(isAlternate ? QPalette::AlternateBase : QPalette::Base);
}

// Dimmed, but not too pale to be read.
QColor Faded(QColor const& text, QColor const& ground)
{
    return WithContrast(Blended(text, ground, ContextFade), ground, TextContrast);
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

// The room beside a message for the gap before it. None in a narrow column: the line above the row
// has to do.
int GapWidth(QString const& gap, QFontMetrics const& metrics, int width)
{
    if (gap.isEmpty())
        return 0;
    const int wanted = metrics.boundingRect(gap).width() + 2 * GapMargin;
    return 2 * wanted <= width ? wanted : 0;
}

// The room before a message for the number of entries that repeat it.
int RepeatsWidth(QString const& repeats, QFontMetrics const& metrics)
{
    return repeats.isEmpty() ? 0 : metrics.boundingRect(repeats).width() + 4 * RepeatsMargin;
}

int TextMargin(QStyle const* style, QWidget const* widget)
{
    return style->pixelMetric(QStyle::PM_FocusFrameHMargin, nullptr, widget) + 1;
}

// Lays out a text in one line, as the style does. False if it does not fit.
bool LayOutFitting(QTextLayout& layout, QStyleOptionViewItem const& option, int width)
{
    layout.setCacheEnabled(true); // or drawing would shape the text again
    QTextOption textOption(QStyle::visualAlignment(option.direction, option.displayAlignment));
    textOption.setWrapMode(QTextOption::ManualWrap);
    textOption.setTextDirection(option.direction);
    layout.setTextOption(textOption);
    layout.beginLayout();
    QTextLine line = layout.createLine();
    if (line.isValid())
        line.setLineWidth(width);
    const bool isOneLine = line.isValid() && !layout.createLine().isValid();
    layout.endLayout();
    return isOneLine && line.naturalTextWidth() <= width;
}

QPalette::ColorGroup ColorGroupOf(QStyle::State state)
{
    if (!(state & QStyle::State_Enabled))
        return QPalette::Disabled;
    return (state & QStyle::State_Active) ? QPalette::Normal : QPalette::Inactive;
}

void LayOutLines(QTextLayout& layout, qreal width, int mostLines)
{
    qreal y = 0;
    layout.beginLayout();
    while (layout.lineCount() < mostLines) {
        QTextLine line = layout.createLine();
        if (!line.isValid())
            break;
        line.setLineWidth(width);
        line.setPosition(QPointF(0, y));
        y += line.height();
    }
    layout.endLayout();
}

// One line is clipped by the cell; of several, the last one is elided.
void LayOut(QTextLayout& layout, int width, int mostLines)
{
    QTextOption option(Qt::AlignLeft);
    option.setTextDirection(Qt::LeftToRight);
    option.setWrapMode(mostLines == 1 ? QTextOption::NoWrap
                                      : QTextOption::WrapAtWordBoundaryOrAnywhere);
    layout.setTextOption(option);
    LayOutLines(layout, mostLines == 1 ? 1 << 20 : std::max(1, width), mostLines);
    if (mostLines == 1 || layout.lineCount() < mostLines)
        return;
    const QTextLine last = layout.lineAt(mostLines - 1);
    if (last.textStart() + last.textLength() >= layout.text().size())
        return;
    const QString rest = QFontMetrics(layout.font())
                             .elidedText(layout.text().mid(last.textStart()), Qt::ElideRight,
                                         std::max(1, width - 1));
    layout.setText(layout.text().left(last.textStart()) + rest);
    LayOutLines(layout, std::max(1, width), mostLines);
}

qreal HeightOfLines(QTextLayout const& layout)
{
    qreal height = 0;
    for (int i = 0; i < layout.lineCount(); ++i)
        height += layout.lineAt(i).height();
    return height;
}

// The matches in a cell. A match may begin before the message that ends the line, with the blank
// in front of it or in another cell.
QVector<QPair<int, int>> RangesIn(QString const& text, QString const& line, LogFilter const& filter)
{
    const int before = line.size() - text.size();
    if (before <= 0 || !line.endsWith(text))
        return filter.Ranges(text);
    QVector<QPair<int, int>> ranges;
    const QVector<QPair<int, int>> all = filter.Ranges(line);
    for (QPair<int, int> const& range : all) {
        const int start = std::max(0, range.first - before);
        const int end = range.first + range.second - before;
        if (end > start)
            ranges.append(qMakePair(start, end - start));
    }
    return ranges;
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
                                 Faded(option->palette.color(QPalette::Text), GroundOf(*option)));
    const int color = ruleColor(index);
    if (color >= 0) {
        option->backgroundBrush = HighlightColors::Background(color, option->palette);
        option->palette.setColor(QPalette::Text, HighlightColors::Text(option->palette));
    }
    if (index.column() == LogModel::TimeColumn && index.data(LogModel::MarkedRole).toBool())
        option->backgroundBrush = Blended(option->palette.color(QPalette::Base),
                                          TickColors::Marked(option->palette), 0.2);
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
    paintContent(painter, cell, index);
    if (index.column() == LogModel::MessageColumn)
        paintRepeats(painter, cell, index.data(LogModel::RepeatsRole).toString());
    const QString gap = index.data(LogModel::GapRole).toString();
    if (!gap.isEmpty())
        paintGap(painter, cell, index, gap);
    if (index.column() == LogModel::TimeColumn && index.data(LogModel::MarkedRole).toBool())
        paintUserMark(painter, cell, !index.data(LogModel::NoteRole).toString().isEmpty());
}

void LogDelegate::paintContent(QPainter* painter, QStyleOptionViewItem const& option,
                               QModelIndex const& index) const
{
    QStyleOptionViewItem cell = option;
    const bool isMessage = index.column() == LogModel::MessageColumn;
    if (m_mostLines > 1 && !isMessage) { // beside the first line of the message
        paintEmpty(painter, cell);
        cell.rect.setHeight(RowHeight(cell.fontMetrics));
        cell.state &= ~QStyle::State_HasFocus;
    }
    const int gapWidth = isMessage ? GapWidth(index.data(LogModel::GapRole).toString(),
                                              cell.fontMetrics, cell.rect.width())
                                   : 0;
    const QString repeats = isMessage ? index.data(LogModel::RepeatsRole).toString() : QString();
    if (gapWidth > 0 || !repeats.isEmpty()) {
        paintEmpty(painter, cell);
        cell.rect.adjust(RepeatsWidth(repeats, cell.fontMetrics), 0, -gapWidth, 0);
        cell.state &= ~QStyle::State_HasFocus;
    }
    // The filter searches neither translated names nor what is not in the line.
    const bool isMarkable = index.column() != LogModel::SeverityColumn &&
                            index.column() != LogModel::SinceColumn &&
                            index.column() != LogModel::ProgramColumn;
    const QVector<QTextLayout::FormatRange> formats =
        isMarkable && (m_filter.hasText() || m_found.hasText())
            ? marks(cell.text, index.data(LogModel::LineRole).toString())
            : QVector<QTextLayout::FormatRange>();
    if (formats.isEmpty() && (m_mostLines == 1 || !isMessage))
        paintPlain(painter, cell);
    else
        paintMarked(painter, cell, formats, isMessage ? m_mostLines : 1);
}

// Looks as if the style had drawn it all. But the style shapes a text three times, which costs more
// than all else about a line that is appended. It still draws what it colors or elides itself. For
// the goal for following in docs/performance.md; tst_PlainCells compares.
void LogDelegate::paintPlain(QPainter* painter, QStyleOptionViewItem const& option)
{
    QStyle const* style = StyleOf(option);
    QStyleOptionViewItem empty = option; // but with its icon
    empty.text.clear();
    const QRect cell = style->subElementRect(QStyle::SE_ItemViewItemText, &empty, option.widget);
    const int margin = TextMargin(style, option.widget);
    const QRect area = cell.adjusted(margin, 0, -margin, 0);
    QTextLayout layout(option.text, option.font);
    const bool isColored = option.state & (QStyle::State_Selected | QStyle::State_HasFocus);
    // Or a long text would be shaped here in vain.
    const bool isLong =
        option.text.size() * option.fontMetrics.averageCharWidth() > 2 * area.width();
    if (isColored || isLong || !LayOutFitting(layout, option, area.width())) {
        style->drawControl(QStyle::CE_ItemViewItem, &option, painter, option.widget);
        return;
    }

    style->drawControl(QStyle::CE_ItemViewItem, &empty, painter, option.widget);
    const QRect text = QStyle::alignedRect(Qt::LayoutDirectionAuto, option.displayAlignment,
                                           layout.boundingRect().size().toSize(), area);
    painter->save();
    painter->setClipRect(option.rect);
    painter->setPen(option.palette.color(ColorGroupOf(option.state), QPalette::Text));
    layout.draw(painter, QPointF(area.x(), text.top()));
    painter->restore();
}

// A bar at the edge of the row, and a folded corner if there is a note.
void LogDelegate::paintUserMark(QPainter* painter, QStyleOptionViewItem const& option, bool hasNote)
{
    const QRect cell = option.rect;
    const QColor color = TickColors::Marked(option.palette);
    painter->save();
    painter->fillRect(cell.left(), cell.top(), MarkWidth, cell.height(), color);
    if (hasNote) {
        const int size = std::min(cell.height(), RowHeight(option.fontMetrics)) / 2;
        const QPoint corner(cell.right() + 1, cell.top());
        painter->setPen(Qt::NoPen);
        painter->setBrush(color);
        painter->drawPolygon(QPolygon(
            QVector<QPoint>({corner, corner - QPoint(size, 0), corner + QPoint(0, size)})));
    }
    painter->restore();
}

// A line above the row, and the gap in words at the end of it.
void LogDelegate::paintGap(QPainter* painter, QStyleOptionViewItem const& option,
                           QModelIndex const& index, QString const& gap)
{
    const bool isSelected = option.state & QStyle::State_Selected;
    // Not the cell's own, in which a severity has its color.
    const QPalette palette = option.widget ? option.widget->palette() : option.palette;
    QColor const& text = palette.color(isSelected ? QPalette::HighlightedText : QPalette::Text);
    const QColor ground = isSelected ? palette.color(QPalette::Highlight) : GroundOf(option);
    painter->save();
    painter->setClipRect(option.rect);
    painter->fillRect(option.rect.left(), option.rect.top(), option.rect.width(), 1,
                      WithContrast(Blended(ground, text, GapStrength), ground, PartContrast));
    const int width = index.column() == LogModel::MessageColumn
                          ? GapWidth(gap, option.fontMetrics, option.rect.width())
                          : 0;
    if (width > 0) {
        const QRect area(option.rect.right() + 1 - width, option.rect.top(), width,
                         std::min(option.rect.height(), RowHeight(option.fontMetrics)));
        painter->setPen(Faded(text, ground));
        painter->setFont(option.font);
        painter->setLayoutDirection(option.direction);
        painter->drawText(area, Qt::AlignCenter, gap);
    }
    painter->restore();
}

QRect LogDelegate::RepeatsArea(QString const& repeats, QFont const& font, QRect const& cell)
{
    const QFontMetrics metrics(font);
    return QRect(cell.left(), cell.top(), RepeatsWidth(repeats, metrics),
                 std::min(cell.height(), RowHeight(metrics)));
}

void LogDelegate::paintRepeats(QPainter* painter, QStyleOptionViewItem const& option,
                               QString const& repeats)
{
    if (repeats.isEmpty())
        return;
    const bool isSelected = option.state & QStyle::State_Selected;
    QColor const& text =
        option.palette.color(isSelected ? QPalette::HighlightedText : QPalette::Text);
    const QColor ground = isSelected ? option.palette.color(QPalette::Highlight) : GroundOf(option);
    const QRect area = RepeatsArea(repeats, option.font, option.rect)
                           .adjusted(RepeatsMargin, 2, -RepeatsMargin, -2);
    painter->save();
    painter->setClipRect(option.rect);
    painter->setRenderHint(QPainter::Antialiasing);
    painter->setPen(Qt::NoPen);
    painter->setBrush(Blended(ground, text, RepeatsStrength));
    painter->drawRoundedRect(area, RepeatsMargin, RepeatsMargin);
    painter->setPen(text);
    painter->setFont(option.font);
    painter->setLayoutDirection(option.direction);
    painter->drawText(area, Qt::AlignCenter, repeats);
    painter->restore();
}

// Later formats are drawn over earlier ones.
QVector<QTextLayout::FormatRange> LogDelegate::marks(QString const& text, QString const& line) const
{
    QVector<QTextLayout::FormatRange> formats;
    AddFormats(formats, RangesIn(text, line, m_filter), MarkFormat());
    AddFormats(formats, RangesIn(text, line, m_found), FoundFormat());
    return formats;
}

void LogDelegate::paintHeading(QPainter* painter, QStyleOptionViewItem const& option)
{
    const QColor text = option.palette.color(QPalette::Text);
    const QColor background = Blended(option.palette.color(QPalette::Base), text, 0.14);
    painter->save();
    painter->setLayoutDirection(option.direction);
    painter->fillRect(option.rect, background);
    painter->setFont(option.font);
    painter->setPen(text);
    painter->drawText(option.rect.adjusted(6, 0, -6, 0), Qt::AlignLeft | Qt::AlignVCenter,
                      option.text);
    if (option.state & QStyle::State_HasFocus) {
        QStyleOptionFocusRect focus;
        focus.QStyleOption::operator=(option);
        focus.backgroundColor = background;
        // It is not selected, so without the frame nobody could tell that it is the current row;
        // many styles draw one only after Tab.
        focus.state |= QStyle::State_KeyboardFocusChange;
        StyleOf(option)->drawPrimitive(QStyle::PE_FrameFocusRect, &focus, painter, option.widget);
    }
    painter->restore();
}

int LogDelegate::HeightOf(QString const& message, QString const& gap, QString const& repeats,
                          QFont const& font, int width) const
{
    QStyle const* style = QApplication::style();
    const QFontMetrics metrics(font);
    QTextLayout layout(message, font);
    LayOut(layout,
           width - GapWidth(gap, metrics, width) - RepeatsWidth(repeats, metrics) -
               2 * TextMargin(style, nullptr),
           m_mostLines);
    return qCeil(HeightOfLines(layout)) + RowHeight(metrics) - metrics.height();
}

void LogDelegate::paintMarked(QPainter* painter, QStyleOptionViewItem const& option,
                              QVector<QTextLayout::FormatRange> const& formats, int mostLines)
{
    paintEmpty(painter, option);
    QStyle const* style = StyleOf(option);
    const QRect cell = style->subElementRect(QStyle::SE_ItemViewItemText, &option, option.widget);
    const int margin = TextMargin(style, option.widget);
    const QRect area = cell.adjusted(margin, 0, -margin, 0);

    QTextLayout layout(option.text, option.font);
    layout.setFormats(formats);
    LayOut(layout, area.width(), mostLines);
    const qreal width = layout.lineCount() > 0 ? layout.lineAt(0).naturalTextWidth() : 0;
    const qreal height = HeightOfLines(layout);
    const bool selected = option.state & QStyle::State_Selected;
    const bool right = option.displayAlignment & Qt::AlignRight;
    const qreal x = right ? area.right() + 1 - width : area.left();
    painter->save();
    painter->setClipRect(area);
    painter->setPen(option.palette.color(selected ? QPalette::HighlightedText : QPalette::Text));
    layout.draw(painter, QPointF(x, area.top() + std::max(0.0, (area.height() - height) / 2)));
    painter->restore();
}

// Background and focus.
void LogDelegate::paintEmpty(QPainter* painter, QStyleOptionViewItem const& option)
{
    QStyleOptionViewItem background = option;
    background.text.clear();
    background.icon = QIcon();
    background.features &= ~QStyleOptionViewItem::HasDecoration;
    StyleOf(option)->drawControl(QStyle::CE_ItemViewItem, &background, painter, option.widget);
}

} // namespace Velocor
