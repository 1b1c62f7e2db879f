// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/ReportDialog.h"

#include "app/window/widgets/PlainText.h"
#include "app/window/widgets/TextDialog.h"

#include <QClipboard>
#include <QCoreApplication>
#include <QDialogButtonBox>
#include <QFileDialog>
#include <QFileInfo>
#include <QGuiApplication>
#include <QHBoxLayout>
#include <QIcon>
#include <QLabel>
#include <QPlainTextEdit>
#include <QPushButton>
#include <QSaveFile>
#include <QVariant>

namespace Velocor {

ReportDialog::ReportDialog(QString const& title, QString const& heading, QString const& text,
                           bool saves, QWidget* parent)
    : QDialog(parent), m_text(new QPlainTextEdit(text))
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
    if (saves) {
        QPushButton* save = buttons->addButton(tr("&Save..."), QDialogButtonBox::ActionRole);
        connect(save, &QPushButton::clicked, this, &ReportDialog::chooseFile);
    }
    LayOutTextDialog(this, top, m_text, buttons);
}

void ReportDialog::Copy()
{
    QGuiApplication::clipboard()->setText(m_text->toPlainText());
}

QString ReportDialog::SaveTo(QString const& path) const
{
    if (QFileInfo::exists(path) && !QFileInfo(path).isFile())
        return tr("Not a regular file");
    QSaveFile file(path);
    if (!file.open(QIODevice::WriteOnly))
        return file.errorString();
    const QByteArray bytes = m_text->toPlainText().toUtf8();
    if (file.write(bytes) != bytes.size()) // of which commit() does not know
        return tr("Only a part could be written");
    return file.commit() ? QString() : file.errorString();
}

void ReportDialog::chooseFile()
{
    const QString folder = QCoreApplication::instance()->property("DocPath").toString();
    const QString path =
        QFileDialog::getSaveFileName(this, windowTitle(), folder + tr("velocor-report.txt"),
                                     tr("Text files (*.txt);;All files (*)"));
    if (path.isEmpty())
        return;
    const QString error = SaveTo(path);
    if (error.isEmpty())
        accept();
    else
        PlainMessageBox(QMessageBox::Critical, this, tr("Could not save %1.\n%2").arg(path, error))
            .exec();
}

} // namespace Velocor
