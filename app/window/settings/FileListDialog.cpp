// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/FileListDialog.h"

#include "app/settingsfile/TypedText.h"
#include "app/window/widgets/PlainText.h"
#include "app/window/widgets/TextDialog.h"

#include <QDialogButtonBox>
#include <QHBoxLayout>
#include <QLabel>
#include <QListWidget>
#include <QPushButton>
#include <QVBoxLayout>

namespace Velocor {

FileListDialog::FileListDialog(QString const& name, QStringList const& entries, QWidget* parent)
    : FittingDialog(parent), m_list(new QListWidget), m_problem(NewPlainLabel()),
      m_buttons(new QDialogButtonBox(QDialogButtonBox::Ok | QDialogButtonBox::Cancel))
{
    setWindowTitle(tr("Edit File List"));
    QLabel* heading = NewPlainLabel(name);
    heading->setWordWrap(true);
    m_list->setAccessibleName(tr("Files"));
    m_list->setLayoutDirection(Qt::LeftToRight);
    m_list->setTextElideMode(Qt::ElideLeft); // names end in what differs
    m_problem->setAccessibleName(tr("Problem with the files"));
    m_problem->setWordWrap(true);
    RemoveButtonIcons(m_buttons);

    auto* changes = new QDialogButtonBox(Qt::Vertical);
    QPushButton const* add = addButton(changes, tr("&Add"));
    m_remove = addButton(changes, tr("&Remove"));
    m_up = addButton(changes, tr("Move &Up"));
    m_down = addButton(changes, tr("Move &Down"));
    connect(add, &QPushButton::clicked, this, &FileListDialog::addEntry);
    connect(m_remove, &QPushButton::clicked, this, &FileListDialog::removeEntry);
    connect(m_up, &QPushButton::clicked, this, [this] { moveEntry(-1); });
    connect(m_down, &QPushButton::clicked, this, [this] { moveEntry(1); });
    connect(m_list, &QListWidget::currentRowChanged, this, &FileListDialog::updateState);
    connect(m_list, &QListWidget::itemChanged, this, &FileListDialog::updateState);
    connect(m_buttons, &QDialogButtonBox::accepted, this, &QDialog::accept);
    connect(m_buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);

    auto* middle = new QHBoxLayout;
    middle->addWidget(m_list, 1);
    middle->addWidget(changes);
    auto* layout = new QVBoxLayout(this);
    layout->addWidget(heading);
    layout->addLayout(middle, 1);
    layout->addWidget(m_problem);
    layout->addWidget(m_buttons);
    resize(560, 320);

    for (QString const& entry : entries)
        insert(m_list->count(), entry);
    m_list->setCurrentRow(0);
    m_list->setFocus();
    updateState();
}

QPushButton* FileListDialog::addButton(QDialogButtonBox* buttons, QString const& text)
{
    QPushButton* button = buttons->addButton(text, QDialogButtonBox::ActionRole);
    button->setAutoDefault(false);
    return button;
}

void FileListDialog::insert(int row, QString const& text)
{
    auto* item = new QListWidgetItem(text);
    item->setFlags(item->flags() | Qt::ItemIsEditable);
    m_list->insertItem(row, item);
}

// The newest file is the first one.
void FileListDialog::addEntry()
{
    insert(0, QString());
    m_list->setCurrentRow(0);
    m_list->setFocus();
    m_list->editItem(m_list->item(0));
    updateState();
}

void FileListDialog::removeEntry()
{
    delete m_list->currentItem();
    updateState();
}

void FileListDialog::moveEntry(int step)
{
    const int row = m_list->currentRow();
    QListWidgetItem* item = m_list->takeItem(row);
    m_list->insertItem(row + step, item);
    m_list->setCurrentItem(item);
}

// An entry with a separator would be two when the list is read.
void FileListDialog::updateState()
{
    const int row = m_list->currentRow();
    m_remove->setEnabled(row >= 0);
    m_up->setEnabled(row > 0);
    m_down->setEnabled(row >= 0 && row + 1 < m_list->count());
    const QStringList all = entries();
    const bool isKept = all.isEmpty() || TypedText::ToFileList(TypedText::FromFileList(all)) == all;
    m_problem->setText(isKept ? QString()
                              : tr("\"|\" separates the files, so no name can have it"));
    m_buttons->button(QDialogButtonBox::Ok)->setEnabled(isKept);
}

QStringList FileListDialog::entries() const
{
    QStringList entries;
    for (int row = 0; row < m_list->count(); ++row)
        entries.append(m_list->item(row)->text());
    return entries;
}

} // namespace Velocor
