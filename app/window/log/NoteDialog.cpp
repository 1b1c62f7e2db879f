// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/NoteDialog.h"

#include "app/logfile/LogMark.h"
#include "app/window/widgets/PlainText.h"

#include <QDialogButtonBox>
#include <QLabel>
#include <QLineEdit>
#include <QVBoxLayout>

namespace Velocor {

NoteDialog::NoteDialog(QString const& note, QWidget* parent)
    : FittingDialog(parent), m_text(new QLineEdit(note))
{
    setWindowTitle(tr("Note"));
    setWindowFlags(windowFlags() & ~Qt::WindowContextHelpButtonHint);
    QLabel* label = NewPlainLabel(tr("&Note on the current line:"));
    label->setBuddy(m_text);
    m_text->setAccessibleName(tr("Note"));
    m_text->setMaxLength(LogMark::MaximumNote);
    m_text->selectAll();
    auto* buttons = new QDialogButtonBox(QDialogButtonBox::Ok | QDialogButtonBox::Cancel);
    connect(buttons, &QDialogButtonBox::accepted, this, &QDialog::accept);
    connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);

    auto* layout = new QVBoxLayout(this);
    layout->addWidget(label);
    layout->addWidget(m_text);
    layout->addWidget(buttons);
    resize(420, sizeHint().height());
}

QString NoteDialog::note() const
{
    return m_text->text();
}

} // namespace Velocor
