// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/SelectableMessageBoxes.h"

#include "app/window/widgets/PlainText.h"

#include <QCoreApplication>
#include <QEvent>
#include <QFileDialog>
#include <QMessageBox>

namespace Velocor {

SelectableMessageBoxes::SelectableMessageBoxes(QObject* parent) : QObject(parent)
{
    QCoreApplication::instance()->installEventFilter(this);
}

bool SelectableMessageBoxes::eventFilter(QObject* object, QEvent* event)
{
    if (event->type() == QEvent::Polish) {
        if (auto* box = qobject_cast<QMessageBox*>(object)) {
            if (qobject_cast<QFileDialog*>(box->parentWidget()))
                PlainMessageBox::MakePlain(box);
            box->setTextInteractionFlags(Qt::TextSelectableByMouse | Qt::TextSelectableByKeyboard |
                                         Qt::LinksAccessibleByMouse);
        }
    }
    return false;
}

} // namespace Velocor
