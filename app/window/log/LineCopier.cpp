// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/LineCopier.h"

#include "app/window/log/LinesAsText.h"
#include "app/window/log/LogModel.h"
#include "app/window/log/LogView.h"

#include <QClipboard>
#include <QGuiApplication>

#include <algorithm>

namespace Velocor {

LineCopier::LineCopier(LogModel* model, LogView* view, QObject* parent)
    : QObject(parent), m_model(model), m_view(view)
{}

void LineCopier::Copy()
{
    int count = 0;
    const QString text =
        LinesAsText::Entries(*m_model, m_view->SelectedRows(), LogView::MaximumCopiedLines, count);
    take(count, text);
}

void LineCopier::CopyAsMarkdown()
{
    const QList<int> rows = m_view->SelectedRows();
    take(linesIn(rows), LinesAsText::Markdown(*m_model, rows));
}

void LineCopier::CopyAsCsv()
{
    const QList<int> rows = m_view->SelectedRows();
    take(linesIn(rows), LinesAsText::Csv(*m_model, rows));
}

int LineCopier::linesIn(QList<int> const& rows) const
{
    return static_cast<int>(std::count_if(
        rows.begin(), rows.end(), [this](int row) { return m_model->LineStart(row) >= 0; }));
}

void LineCopier::take(int count, QString const& text)
{
    if (count > 0)
        QGuiApplication::clipboard()->setText(text);
    if (count == 0)
        Q_EMIT messageReported(tr("No lines selected"));
    else if (count >= LogView::MaximumCopiedLines)
        Q_EMIT messageReported(tr("Copied only the first %L1 selected lines").arg(count));
    else
        Q_EMIT messageReported(tr("%Ln line(s) copied", nullptr, count));
}

} // namespace Velocor
