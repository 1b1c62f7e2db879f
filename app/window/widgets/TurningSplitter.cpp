// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/widgets/TurningSplitter.h"

#include <QEvent>

#include <algorithm>

namespace Velocor {

QSize TurningSplitter::minimumSizeHint() const
{
    QSize least = QSplitter::minimumSizeHint();
    int widest = 0;
    for (int i = 0; i < count(); ++i) {
        if (!widget(i)->isHidden())
            widest = std::max(widest, widget(i)->minimumSizeHint().width());
    }
    least.setWidth(widest);
    return least;
}

bool TurningSplitter::event(QEvent* event)
{
    const bool isDone = QSplitter::event(event);
    if (event->type() == QEvent::Resize || event->type() == QEvent::LayoutRequest)
        turn();
    return isDone;
}

void TurningSplitter::turn()
{
    int needed = 0;
    for (int i = 0; i < count(); ++i) {
        if (!widget(i)->isHidden())
            needed += widget(i)->minimumSizeHint().width() + (needed > 0 ? handleWidth() : 0);
    }
    const Qt::Orientation wanted = needed > width() ? Qt::Vertical : Qt::Horizontal;
    if (orientation() != wanted)
        setOrientation(wanted);
}

} // namespace Velocor
