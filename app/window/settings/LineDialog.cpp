// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/LineDialog.h"

#include "app/window/widgets/PlainText.h"
#include "app/window/widgets/TextDialog.h"

#include <QDialogButtonBox>
#include <QLabel>
#include <QSpinBox>
#include <QVBoxLayout>

namespace Velocor {

LineDialog::LineDialog(int line, int count, QWidget* parent)
    : FittingDialog(parent), m_line(new QSpinBox)
{
    setWindowTitle(tr("Go to Line"));
    m_line->setRange(1, count);
    m_line->setValue(line);
    m_line->setAccessibleName(tr("Line"));
    QLabel* label = NewPlainLabel(tr("&Line, 1 to %L1").arg(count));
    label->setBuddy(m_line);
    auto* buttons = new QDialogButtonBox(QDialogButtonBox::Ok | QDialogButtonBox::Cancel);
    RemoveButtonIcons(buttons);
    connect(buttons, &QDialogButtonBox::accepted, this, &QDialog::accept);
    connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);
    auto* layout = new QVBoxLayout(this);
    layout->addWidget(label);
    layout->addWidget(m_line);
    layout->addWidget(buttons);
    m_line->setFocus();
    m_line->selectAll();
}

int LineDialog::line() const
{
    return m_line->value();
}

} // namespace Velocor
