// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/Panes.h"

#include <QWidget>

namespace Velocor {

namespace {

// The first widget of a pane that the Tab key goes to; null if there is none.
QWidget* FirstField(QWidget* pane)
{
    QWidget* field = pane;
    do {
        const bool isInPane = field == pane || pane->isAncestorOf(field);
        if (isInPane && (field->focusPolicy() & Qt::TabFocus) && field->isVisible() &&
            field->isEnabled())
            return field;
        field = field->nextInFocusChain();
    } while (field != pane);
    return nullptr;
}

} // namespace

void GoToPane(QList<QWidget*> const& panes, int step)
{
    QList<QWidget*> fields;
    int current = -1;
    for (QWidget* pane : panes) {
        QWidget* field = pane && pane->isVisible() ? FirstField(pane) : nullptr;
        if (!field)
            continue;
        QWidget const* focused = pane->window()->focusWidget();
        if (focused == pane || pane->isAncestorOf(focused))
            current = fields.size();
        fields.append(field);
    }
    if (fields.isEmpty())
        return;
    const int start = current < 0 && step < 0 ? 0 : current;
    const int count = fields.size();
    fields.at((start + step + count) % count)
        ->setFocus(step > 0 ? Qt::TabFocusReason : Qt::BacktabFocusReason);
}

} // namespace Velocor
