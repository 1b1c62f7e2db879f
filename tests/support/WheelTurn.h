// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QCoreApplication>
#include <QWheelEvent>
#include <QWidget>

/// Turns the mouse wheel over the center of a widget by so many eighths of a degree; below 0
/// scrolls down.
inline void TurnWheel(QWidget* widget, int angle, Qt::KeyboardModifiers keys = Qt::NoModifier)
{
    const QPoint center = widget->rect().center();
    const QPoint onScreen = widget->mapToGlobal(center);
#if QT_VERSION < QT_VERSION_CHECK(6, 0, 0)
    QWheelEvent event(center, onScreen, QPoint(), QPoint(0, angle), angle, Qt::Vertical,
                      Qt::NoButton, keys);
#else
    QWheelEvent event(center, onScreen, QPoint(), QPoint(0, angle), Qt::NoButton, keys,
                      Qt::NoScrollPhase, false);
#endif
    QCoreApplication::sendEvent(widget, &event);
}
