// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/WrappedRows.h"

#include "app/window/log/LogDelegate.h"
#include "app/window/log/LogModel.h"
#include "app/window/widgets/RowHeight.h"

#include <QHeaderView>
#include <QSignalBlocker>
#include <QTableView>

#include <algorithm>
#include <utility>

namespace Velocor {

WrappedRows::WrappedRows(QTableView* table, LogDelegate* delegate)
    : m_table(table), m_delegate(delegate)
{}

void WrappedRows::SetOn(bool isOn)
{
    m_isOn = isOn;
    Restart();
}

// A row that is higher than the table could not be scrolled.
int WrappedRows::mostLines() const
{
    const int padding = RowHeight(m_table->fontMetrics()) - m_table->fontMetrics().height();
    const int fitting = (m_table->viewport()->height() - padding) / m_table->fontMetrics().height();
    return m_isOn ? qBound(1, fitting, MaximumLines) : 1;
}

int WrappedRows::width() const
{
    return m_table->columnWidth(LogModel::MessageColumn);
}

void WrappedRows::Restart()
{
    Forget();
    m_mostLines = mostLines();
    m_width = width();
    m_delegate->SetMostLines(m_mostLines);
    const QSignalBlocker blocker(m_table->verticalHeader());
    m_table->verticalHeader()->setDefaultSectionSize(RowHeight(m_table->fontMetrics()));
}

// With updates, the header would add up the heights of all rows for each one that changes. Its
// signals would make the table do it once more.
int WrappedRows::measuredHeight(int row)
{
    QHeaderView* header = m_table->verticalHeader();
    if (!m_measured.insert(row).second)
        return header->sectionSize(row);
    const QModelIndex message = m_table->model()->index(row, LogModel::MessageColumn);
    int height = RowHeight(m_table->fontMetrics());
    if (!message.data(LogModel::HeadingRole).toBool())
        height = std::max(
            height, m_delegate->HeightOf(message.data().toString(), m_table->font(), m_width));
    if (header->sectionSize(row) == height)
        return height;
    const QSignalBlocker blocker(header);
    header->setUpdatesEnabled(false);
    header->resizeSection(row, height);
    header->setUpdatesEnabled(true);
    m_hasChanged = true;
    return height;
}

int WrappedRows::FirstAbove(int row, int height)
{
    height -= measuredHeight(row);
    while (row > 0 && height >= measuredHeight(row - 1))
        height -= measuredHeight(--row);
    return row;
}

int WrappedRows::LastBelow(int row, int height)
{
    const int last = m_table->model()->rowCount() - 1;
    height -= measuredHeight(row);
    while (row < last && height >= measuredHeight(row + 1))
        height -= measuredHeight(++row);
    return row;
}

bool WrappedRows::Measure(int top)
{
    const int count = m_table->model()->rowCount();
    const int page = m_table->viewport()->height();
    if (!m_isOn || count == 0)
        return false;
    if (m_mostLines != mostLines() || m_width != width()) {
        Restart();
        m_hasChanged = true;
    }
    top = qBound(0, top, count - 1);
    LastBelow(top, 2 * page);
    FirstAbove(top, page);
    FirstAbove(count - 1, page);
    return std::exchange(m_hasChanged, false);
}

} // namespace Velocor
