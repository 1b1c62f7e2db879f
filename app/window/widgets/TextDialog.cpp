// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/widgets/TextDialog.h"

#include "app/window/widgets/PlainText.h"

#include <QAbstractButton>
#include <QDialog>
#include <QDialogButtonBox>
#include <QFontDatabase>
#include <QIcon>
#include <QPlainTextEdit>
#include <QVBoxLayout>

namespace Velocor {

void RemoveButtonIcons(QDialogButtonBox* buttons)
{
    const QList<QAbstractButton*> all = buttons->buttons();
    for (QAbstractButton* button : all)
        button->setIcon(QIcon());
}

void ShowUnwrapped(QPlainTextEdit* text)
{
    KeepLeftToRight(text);
    text->setLineWrapMode(QPlainTextEdit::NoWrap);
    text->setFont(QFontDatabase::systemFont(QFontDatabase::FixedFont));
    text->setTabChangesFocus(true);
}

void LayOutTextDialog(QDialog* dialog, QLayout* heading, QPlainTextEdit* text,
                      QDialogButtonBox* buttons)
{
    QObject::connect(buttons, &QDialogButtonBox::rejected, dialog, &QDialog::reject);
    RemoveButtonIcons(buttons);
    auto* layout = new QVBoxLayout(dialog);
    layout->setSpacing(10);
    layout->addLayout(heading);
    layout->addWidget(text, 1);
    layout->addWidget(buttons);
    dialog->resize(680, 480);
}

} // namespace Velocor
