// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/widgets/TallArea.h"

#include <QApplication>
#include <QScrollBar>

#include <algorithm>

namespace Velocor {

namespace {

constexpr int LeastLines = 4; // in view

} // namespace

TallArea::TallArea(QWidget* content, QWidget* parent) : QScrollArea(parent)
{
    setFrameShape(QFrame::NoFrame);
    setWidgetResizable(true);
    setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
    setFocusPolicy(Qt::NoFocus);
    setWidget(content);
    connect(qApp, &QApplication::focusChanged, this,
            [this](QWidget*, QWidget* focused) { showFocused(focused); });
}

QSize TallArea::sizeHint() const
{
    return widget()->sizeHint();
}

QSize TallArea::minimumSizeHint() const
{
    const QSize content = widget()->minimumSizeHint();
    return QSize(content.width() + verticalScrollBar()->sizeHint().width(),
                 std::min(content.height(), LeastLines * fontMetrics().lineSpacing()));
}

// Qt does it for the Tab key only.
void TallArea::showFocused(QWidget const* focused)
{
    if (!focused || !widget()->isAncestorOf(focused) || !verticalScrollBar()->isVisible())
        return;
    const int top = focused->mapTo(widget(), QPoint()).y();
    const int bottom = top + std::min(focused->height(), viewport()->height());
    QScrollBar* bar = verticalScrollBar();
    bar->setValue(std::max(std::min(bar->value(), top), bottom - viewport()->height()));
}

} // namespace Velocor
