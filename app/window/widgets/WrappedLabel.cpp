// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/widgets/WrappedLabel.h"

#include <QResizeEvent>

#include <algorithm>

namespace Velocor {

WrappedLabel::WrappedLabel(QWidget* parent) : QLabel(parent)
{
    setTextFormat(Qt::PlainText);
    setWordWrap(true);
}

QSize WrappedLabel::minimumSizeHint() const
{
    const QSize least = QLabel::minimumSizeHint();
    if (!isVisible())
        return least; // and not yet as wide as it will be
    return QSize(least.width(), std::max(least.height(), heightForWidth(width())));
}

void WrappedLabel::resizeEvent(QResizeEvent* event)
{
    QLabel::resizeEvent(event);
    if (event->size().width() != event->oldSize().width())
        updateGeometry();
}

} // namespace Velocor
