// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/MarkControl.h"

#include "app/window/log/LogMarks.h"
#include "app/window/log/LogModel.h"
#include "app/window/log/LogView.h"
#include "app/window/log/MarkListDialog.h"
#include "app/window/log/NoteDialog.h"

#include <algorithm>

namespace Velocor {

MarkControl::MarkControl(LogModel* model, LogView* view, QWidget* parent)
    : QObject(parent), m_model(model), m_view(view), m_marks(new LogMarks(model, this)),
      m_window(parent)
{
    connect(m_marks, &LogMarks::changed, this, &MarkControl::show);
}

void MarkControl::SetStore(LogMarkStore* store)
{
    m_marks->SetStore(store);
}

void MarkControl::Load()
{
    m_marks->Load();
}

void MarkControl::report(QString const& message)
{
    if (!message.isEmpty())
        Q_EMIT messageReported(message);
}

void MarkControl::Toggle()
{
    report(m_marks->Toggle(m_view->CurrentRow()));
}

void MarkControl::AskNote()
{
    const QPersistentModelIndex current = m_view->currentIndex();
    if (!current.isValid()) {
        report(tr("Select a line first"));
        return;
    }
    NoteDialog dialog(m_marks->NoteOf(m_model->RowAt(current.row())), m_window);
    if (dialog.exec() == QDialog::Accepted)
        report(m_marks->SetNote(m_model->RowAt(current.row()), dialog.note()));
}

void MarkControl::GoTo(int step)
{
    std::vector<int> const& rows = *m_marks->rows();
    if (rows.empty()) {
        report(tr("No marks in the lines shown"));
        return;
    }
    const int from = m_view->StartRow(step);
    const auto after = std::upper_bound(rows.begin(), rows.end(), from);
    const auto before = std::lower_bound(rows.begin(), rows.end(), from);
    const bool isAhead = step > 0 ? after != rows.end() : before != rows.begin();
    if (step > 0)
        m_view->GoToRow(isAhead ? *after : rows.front());
    else
        m_view->GoToRow(isAhead ? *(before - 1) : rows.back());
    m_view->setFocus();
    const QString wrapped =
        step > 0 ? tr("Continued from the top") : tr("Continued from the bottom");
    Q_EMIT messageReported(isAhead ? QString() : wrapped);
}

void MarkControl::ShowList()
{
    if (m_marks->rows()->empty()) {
        report(tr("No marks in the lines shown"));
        return;
    }
    MarkListDialog dialog(*m_marks, *m_view, m_window);
    if (dialog.exec() != QDialog::Accepted || dialog.start() < 0)
        return;
    const int row = m_model->RowNear(dialog.start());
    if (row >= 0)
        m_view->GoToRow(row);
    m_view->setFocus();
}

bool MarkControl::isMarked() const
{
    return m_marks->isMarked(m_view->CurrentRow());
}

std::shared_ptr<std::vector<int> const> const& MarkControl::rows() const
{
    return m_marks->rows();
}

QString MarkControl::note() const
{
    return m_marks->NoteOf(m_view->CurrentRow());
}

void MarkControl::show()
{
    m_view->viewport()->update();
    Q_EMIT changed();
}

} // namespace Velocor
