// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/SizeDialog.h"

#include "app/window/widgets/PlainText.h"
#include "app/window/widgets/TextDialog.h"

#include <QDialogButtonBox>
#include <QFormLayout>
#include <QLabel>
#include <QSpinBox>

#include <limits>

namespace Velocor {

QSpinBox* NewPixelField(QString const& accessibleName, int minimum, int value)
{
    auto* field = new QSpinBox;
    field->setRange(minimum, std::numeric_limits<int>::max());
    field->setValue(value);
    field->setAccelerated(true);
    field->setAccessibleName(accessibleName);
    return field;
}

void AddPixelField(QFormLayout* form, QString const& text, QSpinBox* field)
{
    QLabel* label = NewPlainLabel(text);
    label->setBuddy(field);
    form->addRow(label, field);
}

SizeDialog::SizeDialog(QString const& name, QSize size, QWidget* parent)
    : FittingDialog(parent), m_width(NewPixelField(tr("Width"), 0, size.width())),
      m_height(NewPixelField(tr("Height"), 0, size.height()))
{
    setWindowTitle(tr("Edit Size"));
    QLabel* heading = NewPlainLabel(name);
    heading->setWordWrap(true);
    auto* buttons = new QDialogButtonBox(QDialogButtonBox::Ok | QDialogButtonBox::Cancel);
    RemoveButtonIcons(buttons);
    connect(buttons, &QDialogButtonBox::accepted, this, &QDialog::accept);
    connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);
    auto* layout = new QFormLayout(this);
    layout->addRow(heading);
    AddPixelField(layout, tr("&Width"), m_width);
    AddPixelField(layout, tr("&Height"), m_height);
    layout->addRow(buttons);
    m_width->setFocus();
    m_width->selectAll();
}

QSize SizeDialog::size() const
{
    return QSize(m_width->value(), m_height->value());
}

} // namespace Velocor
