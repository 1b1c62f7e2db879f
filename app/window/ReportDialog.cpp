// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/ReportDialog.h"

#include "app/window/widgets/PlainText.h"
#include "app/window/widgets/TextDialog.h"

#include <QClipboard>
#include <QDialogButtonBox>
#include <QGuiApplication>
#include <QHBoxLayout>
#include <QIcon>
#include <QLabel>
#include <QPlainTextEdit>
#include <QPushButton>

namespace Velocor {

ReportDialog::ReportDialog(QString const& title, QString const& heading, QString const& text,
                           QWidget* parent)
    : FittingDialog(parent), m_text(new QPlainTextEdit(text))
{
    setWindowTitle(title);
    m_text->setReadOnly(true);
    ShowUnwrapped(m_text);
    m_text->setAccessibleName(title);
    m_text->setTextInteractionFlags(Qt::TextSelectableByMouse | Qt::TextSelectableByKeyboard);

    QLabel* icon = NewPlainLabel();
    icon->setPixmap(QGuiApplication::windowIcon().pixmap(48));
    icon->setAccessibleName(tr("Program icon"));
    QLabel* label = NewPlainLabel(heading);
    label->setWordWrap(true);
    label->setTextInteractionFlags(Qt::TextSelectableByMouse | Qt::TextSelectableByKeyboard);
    auto* top = new QHBoxLayout;
    top->setSpacing(12);
    top->addWidget(icon);
    top->addWidget(label, 1);

    auto* buttons = new QDialogButtonBox(QDialogButtonBox::Close);
    QPushButton* copyButton = buttons->addButton(tr("&Copy"), QDialogButtonBox::ActionRole);
    connect(copyButton, &QPushButton::clicked, this, &ReportDialog::Copy);
    LayOutTextDialog(this, top, m_text, buttons);
}

void ReportDialog::Copy()
{
    QGuiApplication::clipboard()->setText(m_text->toPlainText());
}

} // namespace Velocor
