// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/widgets/FlowLayout.h"

#include <QStyle>
#include <QWidget>

#include <algorithm>

namespace Velocor {

namespace {

bool Expands(QLayoutItem const* item)
{
    return item->expandingDirections() & Qt::Horizontal;
}

int LeastWidth(QLayoutItem const* item)
{
    const int usual = item->sizeHint().width();
    return Expands(item) ? std::max(item->minimumSize().width(), usual * 3 / 5) : usual;
}

} // namespace

FlowLayout::FlowLayout(int spacing, QWidget* parent) : QLayout(parent)
{
    setContentsMargins(0, 0, 0, 0);
    setSpacing(spacing);
}

FlowLayout::~FlowLayout()
{
    qDeleteAll(m_items);
}

// Qt calls spacers empty, as hidden widgets are.
void FlowLayout::AddStretch()
{
    auto* space = new QWidget;
    space->setSizePolicy(QSizePolicy::Expanding, QSizePolicy::Ignored);
    addWidget(space);
}

void FlowLayout::addItem(QLayoutItem* item)
{
    m_items.append(item);
}

QLayoutItem* FlowLayout::takeAt(int index)
{
    return index >= 0 && index < m_items.size() ? m_items.takeAt(index) : nullptr;
}

int FlowLayout::leastWidth(Row const& row) const
{
    int width = (static_cast<int>(row.size()) - 1) * spacing();
    for (QLayoutItem const* item : row)
        width += LeastWidth(item);
    return width;
}

int FlowLayout::heightOf(Row const& row)
{
    int height = 0;
    for (QLayoutItem const* item : row)
        height = std::max(height, item->sizeHint().height());
    return height;
}

// Hidden widgets take no room.
QList<FlowLayout::Row> FlowLayout::rowsFor(int width) const
{
    QList<Row> rows;
    Row row;
    for (QLayoutItem* item : m_items) {
        if (item->isEmpty())
            continue;
        if (!row.isEmpty() && leastWidth(row + Row{item}) > width) {
            rows.append(row);
            row.clear();
        }
        row.append(item);
    }
    if (!row.isEmpty())
        rows.append(row);
    return rows;
}

int FlowLayout::heightForWidth(int width) const
{
    const QList<Row> rows = rowsFor(width);
    int height = std::max(0, static_cast<int>(rows.size()) - 1) * spacing();
    for (Row const& row : rows)
        height += heightOf(row);
    return height;
}

QSize FlowLayout::sizeHint() const
{
    Row all;
    for (QLayoutItem* item : m_items) {
        if (!item->isEmpty())
            all.append(item);
    }
    return QSize(std::max(0, leastWidth(all)), heightOf(all));
}

QSize FlowLayout::minimumSize() const
{
    QSize size;
    for (QLayoutItem const* item : m_items) {
        if (!item->isEmpty())
            size = size.expandedTo(item->minimumSize());
    }
    return size.expandedTo(QSize(0, m_height));
}

void FlowLayout::setGeometry(QRect const& rect)
{
    QLayout::setGeometry(rect);
    const QList<Row> rows = rowsFor(rect.width());
    const int needed = heightForWidth(rect.width());
    if (needed != m_height) {
        m_height = needed;
        update();
    }
    int top = rect.top();
    for (Row const& row : rows) {
        const int height = heightOf(row);
        layOutRow(row, QRect(rect.left(), top, rect.width(), height));
        top += height + spacing();
    }
}

void FlowLayout::layOutRow(Row const& row, QRect const& place) const
{
    const auto expanding = static_cast<int>(std::count_if(row.begin(), row.end(), Expands));
    const int rest = place.width() - leastWidth(row);
    QWidget const* widget = parentWidget();
    int left = place.left();
    for (QLayoutItem* item : row) {
        const QSize size = item->sizeHint();
        int width = LeastWidth(item);
        if (rest < 0)
            width = place.width(); // alone in its row, and still too wide
        else if (Expands(item))
            width += rest / expanding;
        const QRect cell(left, place.top(), width, place.height());
        item->setGeometry(
            QStyle::visualRect(widget ? widget->layoutDirection() : Qt::LeftToRight, place,
                               QRect(cell.left(), cell.top() + (cell.height() - size.height()) / 2,
                                     cell.width(), size.height())));
        left += width + spacing();
    }
}

} // namespace Velocor
