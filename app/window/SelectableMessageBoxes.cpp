// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/SelectableMessageBoxes.h"

#include <QCoreApplication>
#include <QEvent>
#include <QMessageBox>

namespace Velocor {

SelectableMessageBoxes::SelectableMessageBoxes(QObject* parent) : QObject(parent)
{
    QCoreApplication::instance()->installEventFilter(this);
}

bool SelectableMessageBoxes::eventFilter(QObject* object, QEvent* event)
{
    if (event->type() == QEvent::Polish) {
        if (auto* box = qobject_cast<QMessageBox*>(object))
            box->setTextInteractionFlags(Qt::TextSelectableByMouse | Qt::TextSelectableByKeyboard |
                                         Qt::LinksAccessibleByMouse);
    }
    return false;
}

} // namespace Velocor
