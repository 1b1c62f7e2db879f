// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/UserMessages.h"

#include <QTextDocument>
#include <QWidget>

void TellOfDamage(QWidget* window)
{
    CriticalMessage(window, "The index is damaged.\nIt will be rebuilt.", true);
}

void TellOfFailure(QWidget* window, QString const& path)
{
    QString text = "Cannot open " + path;
    if (Qt::mightBeRichText(text))
        text = "<p style='white-space:pre-wrap'>" + text.toHtmlEscaped() + "</p>";
    CriticalMessage(window, text, true);
}
