// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/SteadyScrollBar.h"

#include <QScopedValueRollback>
#include <QStyle>
#include <QStyleOptionSlider>

namespace Velocor {

SteadyScrollBar::SteadyScrollBar(QWidget* parent) : QScrollBar(Qt::Vertical, parent) {}

void SteadyScrollBar::sliderChange(SliderChange change)
{
    if (m_isUpdatingLater && change != SliderOrientationChange)
        return;
    const Look look = currentLook();
    if (change == SliderOrientationChange || !(look == m_look))
        update();
    m_look = look;
}

// In between, the slider is not at the end of a range that has grown.
void SteadyScrollBar::UpdateOnceAfter(std::function<void()> const& change)
{
    {
        const QScopedValueRollback<bool> guard(m_isUpdatingLater, true);
        change();
    }
    sliderChange(SliderValueChange);
}

SteadyScrollBar::Look SteadyScrollBar::currentLook() const
{
    QStyleOptionSlider option;
    initStyleOption(&option);
    Look look;
    look.slider =
        style()->subControlRect(QStyle::CC_ScrollBar, &option, QStyle::SC_ScrollBarSlider, this);
    look.isAtStart = value() == minimum();
    look.isAtEnd = value() == maximum();
    return look;
}

} // namespace Velocor
