// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/UserMessages.h"

#include <QCoreApplication>
#include <QDebug>
#include <QMessageBox>
#include <QVariant>

namespace {

QString Caption()
{
    QCoreApplication* application = QCoreApplication::instance();
    return application ? application->property("caption").toString() : QString();
}

QString OnOneLine(QString text)
{
    return StripFormatting(text);
}

} // namespace

void CriticalMessage(QWidget* parent, QString const& text, bool show)
{
    const QString shown = text; // the original may change or be deleted while the box is open
    if (show)
        QMessageBox::critical(parent, Caption(), shown, QMessageBox::Ok, QMessageBox::NoButton);
    qCritical() << OnOneLine(shown);
}

void WarningMessage(QWidget* parent, QString const& text, bool show)
{
    const QString shown = text;
    if (show)
        QMessageBox::warning(parent, Caption(), shown, QMessageBox::Ok, QMessageBox::NoButton);
    qWarning() << OnOneLine(shown);
}

void DebugMessage(QWidget* parent, QString const& text, bool show)
{
    const QString shown = text;
    if (show)
        QMessageBox::information(parent, Caption(), shown, QMessageBox::Ok, QMessageBox::NoButton);
    qDebug() << OnOneLine(shown);
}

QString& StripFormatting(QString& text)
{
    text.replace(QLatin1Char('\n'), QLatin1Char(' '));
    text.replace(QLatin1Char('\t'), QLatin1Char(' '));
    return text;
}

QString& FormatError(QString const& error, QString& out)
{
    out = error;
    return out;
}
