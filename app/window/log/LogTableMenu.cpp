// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/LogTableMenu.h"

#include "app/window/log/LineCopier.h"
#include "app/window/log/LogFilterBar.h"
#include "app/window/log/LogModel.h"
#include "app/window/log/MarkControl.h"

namespace Velocor {

LogTableMenu::LogTableMenu(QModelIndex const& cell, LineCopier* copier, LogFilterBar* filter,
                           MarkControl* marks, QWidget* parent)
    : QMenu(parent), m_cell(cell), m_filter(filter)
{
    setAttribute(Qt::WA_DeleteOnClose);
    addAction(tr("&Copy"), copier, &LineCopier::Copy);
    addAction(tr("Copy as Mar&kdown"), copier, &LineCopier::CopyAsMarkdown);
    addAction(tr("Copy as CS&V"), copier, &LineCopier::CopyAsCsv);
    addSeparator();
    const bool isInLine = cell.column() != LogModel::SinceColumn;
    addAction(tr("&Filter by This"), this, [this] { filterBy(false); })->setEnabled(isInLine);
    addAction(tr("&Hide This"), this, [this] { filterBy(true); })->setEnabled(isInLine);
    QAction* highlight =
        addAction(tr("Hi&ghlight This"), this, [this] { Q_EMIT highlightRequested(text()); });
    highlight->setEnabled(cell.isValid() && isInLine && cell.column() != LogModel::SeverityColumn);
    addSeparator();
    addAction(marks->isMarked() ? tr("Remove &Mark") : tr("&Mark"), marks, &MarkControl::Toggle);
    addAction(tr("&Note..."), marks, &MarkControl::AskNote);
    addSeparator();
    addAction(tr("Measure From He&re"), this, [this] { Q_EMIT measureRequested(true); });
    addAction(tr("Measure From &Above"), this, [this] { Q_EMIT measureRequested(false); });
}

// As it is in the file, where tabs and color sequences are searched, too.
QString LogTableMenu::text() const
{
    auto const* model = qobject_cast<LogModel const*>(m_cell.model());
    return model && m_cell.column() == LogModel::MessageColumn
               ? model->MessageText(model->RowAt(m_cell.row())).left(LogModel::ShownLimit)
               : m_cell.data().toString();
}

// The names of severities are translated, so their cells stand for the severity itself.
void LogTableMenu::filterBy(bool isHiding)
{
    if (!m_cell.isValid())
        return;
    if (m_cell.column() == LogModel::SeverityColumn) {
        const auto severity =
            static_cast<LogEntry::Severity>(m_cell.data(LogModel::SeverityRole).toInt());
        if (isHiding)
            m_filter->Hide(severity);
        else
            m_filter->FilterBy(severity);
        return;
    }
    const QString wanted = text();
    if (wanted.isEmpty())
        return;
    if (isHiding)
        m_filter->Hide(wanted);
    else
        m_filter->FilterBy(wanted);
}

} // namespace Velocor
