// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/WrappingTable.h"

#include "app/window/log/LogDelegate.h"
#include "app/window/log/LogModel.h"
#include "app/window/widgets/RowHeight.h"

#include <QHeaderView>
#include <QScrollBar>

#include <algorithm>

namespace Velocor {

WrappingTable::WrappingTable(LogDelegate* delegate, QWidget* parent)
    : UniformTable(parent), m_delegate(delegate)
{
    delegate->setParent(this);
    setItemDelegate(delegate);
    connect(horizontalHeader(), &QHeaderView::sectionResized, this, [this] {
        if (m_isWrapped)
            scheduleDelayedItemsLayout();
    });
}

void WrappingTable::setWrapped(bool isWrapped)
{
    m_isWrapped = isWrapped;
    forgetHeights();
    adapt();
    updateGeometries();
    viewport()->update();
}

// A row that is higher than the table could not be scrolled.
int WrappingTable::mostLines() const
{
    const int line = fontMetrics().height();
    const int padding = RowHeight(fontMetrics()) - line;
    return m_isWrapped ? qBound(1, (viewport()->height() - padding) / line, MaximumLines) : 1;
}

void WrappingTable::adapt() const
{
    const int width = columnWidth(LogModel::MessageColumn);
    if (m_width == width && m_mostLines == mostLines())
        return;
    m_width = width;
    m_mostLines = mostLines();
    m_delegate->SetMostLines(m_mostLines);
    m_heights.clear();
}

int WrappingTable::heightOf(int row) const
{
    if (!m_isWrapped || isSpanning(row))
        return usualHeight();
    adapt();
    const auto known = m_heights.find(row);
    if (known != m_heights.end())
        return known->second;
    const QModelIndex cell = model()->index(row, LogModel::MessageColumn);
    const int height = std::max(
        usualHeight(),
        m_delegate->HeightOf(cell.data().toString(), cell.data(LogModel::GapRole).toString(),
                             cell.data(LogModel::RepeatsRole).toString(), font(), m_width));
    m_heights.emplace(row, height);
    return height;
}

int WrappingTable::firstAbove(int row, int height) const
{
    height -= heightOf(row);
    while (row > 0 && height >= heightOf(row - 1))
        height -= heightOf(--row);
    return row;
}

int WrappingTable::lastBelow(int row, int height) const
{
    height -= heightOf(row);
    while (row + 1 < rowCount() && height >= heightOf(row + 1))
        height -= heightOf(++row);
    return row;
}

int WrappingTable::rowsThatFit(int height) const
{
    if (!m_isWrapped || rowCount() == 0)
        return UniformTable::rowsThatFit(height);
    return rowCount() - firstAbove(rowCount() - 1, height);
}

// Rows far from those in view, which need not be exact, count as if they had the usual height.
int WrappingTable::topOf(int row) const
{
    if (!m_isWrapped || rowCount() == 0)
        return UniformTable::topOf(row);
    QScrollBar const* const bar = verticalScrollBar();
    const int page = viewport()->height();
    int y = 0;
    int next = bar->value();
    if (bar->maximum() > 0 && next == bar->maximum()) { // the last row ends with the viewport
        for (int last = next; last < rowCount() && y <= page; ++last)
            y += heightOf(last);
        y = std::max(0, page - y);
    }
    while (next < row && next < rowCount() && y <= 2 * page)
        y += heightOf(next++);
    while (next > row && next > 0 && y >= -page)
        y -= heightOf(--next);
    return withinInt(y + heightOfRows(row - next));
}

int WrappingTable::rowPast(int y) const
{
    if (!m_isWrapped || rowCount() == 0)
        return UniformTable::rowPast(y);
    int row = verticalScrollBar()->value();
    int top = topOf(row);
    while (y < top && row > 0)
        top -= heightOf(--row);
    while (row < rowCount() && y >= top + heightOf(row))
        top += heightOf(row++);
    if (y < top)
        return row - 1;
    return row < rowCount() ? row : row + (y - top) / usualHeight();
}

int WrappingTable::topFor(int row, ScrollHint hint) const
{
    if (!m_isWrapped)
        return UniformTable::topFor(row, hint);
    const int page = viewport()->height();
    const int lowest = firstAbove(row, page);
    switch (hint) {
    case PositionAtTop:
        return row;
    case PositionAtBottom:
        return lowest;
    case PositionAtCenter:
        return firstAbove(row, (page + heightOf(row)) / 2);
    default:
        return qBound(lowest, verticalScrollBar()->value(), row);
    }
}

int WrappingTable::pageFrom(int row, int step) const
{
    if (!m_isWrapped)
        return UniformTable::pageFrom(row, step);
    if (step > 0)
        return row + 1 < rowCount() ? lastBelow(row + 1, viewport()->height()) : row;
    return row > 0 ? firstAbove(row - 1, viewport()->height()) : row;
}

} // namespace Velocor
