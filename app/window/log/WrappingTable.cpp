// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/WrappingTable.h"

#include "app/window/log/LogDelegate.h"

#include <QHeaderView>
#include <QScopedValueRollback>
#include <QScrollBar>

namespace Velocor {

WrappingTable::WrappingTable(LogDelegate* delegate, QWidget* parent)
    : QTableView(parent), m_wrapped(this, delegate)
{
    delegate->setParent(this);
    setItemDelegate(delegate);
    connect(horizontalHeader(), &QHeaderView::sectionResized, this, &WrappingTable::measureRows);
}

void WrappingTable::resizeEvent(QResizeEvent* event)
{
    QTableView::resizeEvent(event);
    measureRows();
}

void WrappingTable::setWrapped(bool isWrapped)
{
    m_wrapped.SetOn(isWrapped);
    measureRows();
    updateScrollBars();
}

void WrappingTable::restartWrapping()
{
    if (!m_wrapped.isOn())
        return;
    m_wrapped.Restart();
    measureRows();
}

void WrappingTable::measureChangedRows()
{
    m_wrapped.Forget();
    measureRows();
}

void WrappingTable::measureRows()
{
    if (m_wrapped.Measure(verticalScrollBar()->value()))
        updateScrollBars();
}

// Rows above the first one in view may have become higher. Newer versions of Qt move the header
// along in updateGeometries().
void WrappingTable::updateScrollBars()
{
    const QScopedValueRollback<bool> guard(m_scrollingItself, true);
    updateGeometries();
    if (!m_wrapped.isOn())
        return;
    QScrollBar const* bar = verticalScrollBar();
    if (bar->maximum() > 0 && bar->value() == bar->maximum())
        verticalHeader()->setOffsetToLastSection();
    else
        verticalHeader()->setOffsetToSectionPosition(bar->value());
    viewport()->update();
}

// Qt needs the heights of the rows on the way from the edge of the view.
void WrappingTable::scrollTo(QModelIndex const& index, ScrollHint hint)
{
    if (index.isValid() && m_wrapped.Measure(index.row()))
        updateScrollBars();
    QTableView::scrollTo(index, hint);
}

// Qt would skip a row that is only partly in view, which may have many lines.
QModelIndex WrappingTable::moveCursor(CursorAction action, Qt::KeyboardModifiers modifiers)
{
    const QModelIndex current = currentIndex();
    const int height = viewport()->height();
    const bool isLast = current.row() + 1 == model()->rowCount();
    if (m_wrapped.isOn() && action == MovePageDown && current.isValid() && !isLast)
        return current.sibling(m_wrapped.LastBelow(current.row() + 1, height), current.column());
    if (m_wrapped.isOn() && action == MovePageUp && current.row() > 0)
        return current.sibling(m_wrapped.FirstAbove(current.row() - 1, height), current.column());
    return QTableView::moveCursor(action, modifiers);
}

} // namespace Velocor
