// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/WheelZoom.h"

#include <QWheelEvent>
#include <QWidget>

namespace Velocor {

WheelZoom::WheelZoom(QObject* parent) : QObject(parent) {}

void WheelZoom::Watch(QWidget* widget)
{
    widget->installEventFilter(this);
}

bool WheelZoom::eventFilter(QObject* object, QEvent* event)
{
    if (event->type() != QEvent::Wheel)
        return QObject::eventFilter(object, event);
    auto const* wheel = static_cast<QWheelEvent const*>(event);
    if (!(wheel->modifiers() & Qt::ControlModifier))
        return false;
    m_wheel += wheel->angleDelta().y();
    const int steps = m_wheel / QWheelEvent::DefaultDeltasPerStep;
    m_wheel -= steps * QWheelEvent::DefaultDeltasPerStep;
    if (steps != 0)
        Q_EMIT zoomRequested(steps);
    return true;
}

} // namespace Velocor
