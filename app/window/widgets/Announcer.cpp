// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/widgets/Announcer.h"

#include <QAccessible>

namespace Velocor {

Announcer::Announcer(QWidget* window) : QWidget(window)
{
    hide();
}

void Announcer::Say(QWidget const* widget, QString const& text)
{
    if (!QAccessible::isActive() || text.isEmpty())
        return;
    QWidget* window = widget->window();
    auto* announcer = window->findChild<Announcer*>(QString(), Qt::FindDirectChildrenOnly);
    if (!announcer)
        announcer = new Announcer(window);
    announcer->setAccessibleName(text);
    QAccessibleEvent shown(announcer, QAccessible::ObjectShow);
    QAccessible::updateAccessibility(&shown);
}

} // namespace Velocor
