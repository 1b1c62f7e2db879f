// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/MarkListDialog.h"

#include "app/window/log/LogMarks.h"
#include "app/window/log/LogModel.h"
#include "app/window/log/LogView.h"
#include "app/window/widgets/PlainText.h"
#include "app/window/widgets/TextDialog.h"

#include <QDialogButtonBox>
#include <QHeaderView>
#include <QLocale>
#include <QPushButton>
#include <QTreeWidget>
#include <QVBoxLayout>

#include <algorithm>

namespace Velocor {

namespace {

enum MarkColumn { NumberColumn, StampColumn, NoteColumn, TextColumn };

constexpr int LongestMarkText = 200; // characters

} // namespace

MarkListDialog::MarkListDialog(LogMarks const& marks, LogView const& view, QWidget* parent)
    : FittingDialog(parent), m_list(new QTreeWidget)
{
    setWindowTitle(tr("Marks"));
    setWindowFlags(windowFlags() & ~Qt::WindowContextHelpButtonHint);
    m_list->setAccessibleName(tr("Marked lines"));
    m_list->setLayoutDirection(Qt::LeftToRight);
    KeepLeftToRight(m_list->header());
    m_list->setHeaderLabels({tr("Line"), tr("Time"), tr("Note"), tr("Text")});
    m_list->setRootIsDecorated(false);
    m_list->setUniformRowHeights(true);
    m_list->setAlternatingRowColors(true);
    fill(marks, view);

    auto* buttons = new QDialogButtonBox(QDialogButtonBox::Ok | QDialogButtonBox::Cancel);
    buttons->button(QDialogButtonBox::Ok)->setText(tr("&Go There"));
    RemoveButtonIcons(buttons);
    connect(buttons, &QDialogButtonBox::accepted, this, &QDialog::accept);
    connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);
    connect(m_list, &QTreeWidget::itemDoubleClicked, this, &QDialog::accept);

    auto* layout = new QVBoxLayout(this);
    layout->addWidget(m_list);
    layout->addWidget(buttons);
    buttons->button(QDialogButtonBox::Ok)->setDefault(true);
    resize(680, 360);
}

// The list starts at the mark of the current line, or at the last one above it.
void MarkListDialog::fill(LogMarks const& marks, LogView const& view)
{
    auto const* model = static_cast<LogModel const*>(view.model());
    int current = 0;
    for (int row : *marks.rows()) {
        auto* item = new QTreeWidgetItem(m_list);
        item->setText(NumberColumn, QLocale().toString(view.LineNumber(row)));
        item->setTextAlignment(NumberColumn, Qt::AlignRight | Qt::AlignVCenter);
        item->setText(StampColumn, model->CellText(row, LogModel::TimeColumn));
        item->setText(NoteColumn, marks.NoteOf(row));
        const QString message = model->CellText(row, LogModel::MessageColumn);
        item->setText(TextColumn, Shortened(message, LongestMarkText));
        if (row <= view.CurrentRow())
            current = m_starts.size();
        m_starts.append(model->LineStart(row));
    }
    for (int column = NumberColumn; column < TextColumn; ++column) {
        m_list->resizeColumnToContents(column);
        m_list->setColumnWidth(column, std::min(m_list->columnWidth(column), 220));
    }
    m_list->setCurrentItem(m_list->topLevelItem(current));
}

qint64 MarkListDialog::start() const
{
    return m_starts.value(m_list->indexOfTopLevelItem(m_list->currentItem()), -1);
}

} // namespace Velocor
