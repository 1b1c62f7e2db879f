// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/widgets/PlainText.h"

#include "app/window/widgets/FileSizeText.h"

#include <QCoreApplication>
#include <QGuiApplication>
#include <QHeaderView>
#include <QLabel>
#include <QPlainTextEdit>
#include <QTextDocument>
#include <QTextOption>
#include <QToolTip>
#include <QVariant>

namespace Velocor {

namespace {

// Longer text is wrapped: Qt shows a plain tool tip on one line, however long it is.
constexpr int MaximumLineLength = 120;

} // namespace

QString PlainToolTip(QString const& text)
{
    const QString shown = Shortened(text, MaximumToolTipLength);
    if (shown.size() <= MaximumLineLength && !Qt::mightBeRichText(shown))
        return shown;
    // Without a tag, Qt does not always detect escaped text as rich text: "&amp;lt;" is plain.
    return QLatin1String("<p style=\"white-space:pre-wrap\">") + shown.toHtmlEscaped() +
           QLatin1String("</p>");
}

void ShowPlainToolTip(QPoint const& position, QString const& text, QWidget* widget)
{
    QToolTip::showText(position, PlainToolTip(text), widget);
}

QString Shortened(QString const& text, int limit)
{
    if (text.size() <= limit)
        return text;
    const int end = text.at(limit - 1).isHighSurrogate() ? limit - 1 : limit;
    return text.left(end) + QChar(0x2026) +
           QStringLiteral(" (%1)").arg(FileSizeText(text.toUtf8().size()));
}

QLabel* NewPlainLabel(QString const& text)
{
    auto* label = new QLabel;
    label->setTextFormat(Qt::PlainText);
    label->setText(text);
    return label;
}

// Qt aligns titles as the language of the window does.
void KeepLeftToRight(QHeaderView* header)
{
    header->setDefaultAlignment(Qt::AlignLeft | Qt::AlignVCenter | Qt::AlignAbsolute);
}

// Without the option, a line would have the direction of its first word.
void KeepLeftToRight(QPlainTextEdit* text)
{
    text->setLayoutDirection(Qt::LeftToRight);
    QTextOption option = text->document()->defaultTextOption();
    option.setTextDirection(Qt::LeftToRight);
    text->document()->setDefaultTextOption(option);
}

// The labels are set to plain text before they get their text: the box creates the label for the
// informative text when that is first set, and that label opens links itself.
PlainMessageBox::PlainMessageBox(Icon icon, QWidget* parent, QString const& text,
                                 StandardButtons buttons, QString const& details)
    : QMessageBox(icon, QCoreApplication::instance()->property("caption").toString(), QString(),
                  buttons, parent)
{
    if (!details.isEmpty())
        setInformativeText(QStringLiteral(" "));
    MakePlain(this);
    setText(text);
    if (!details.isEmpty())
        setInformativeText(details);
}

void PlainMessageBox::MakePlain(QMessageBox* box)
{
    box->setTextFormat(Qt::PlainText);
    const QList<QLabel*> labels = box->findChildren<QLabel*>();
    for (QLabel* label : labels)
        label->setTextFormat(Qt::PlainText);
}

} // namespace Velocor
