// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/TickScrollBar.h"

#include "app/window/widgets/SeverityIcons.h"

#include <QPainter>
#include <QScopedValueRollback>
#include <QStyle>
#include <QStyleOptionSlider>

#include <algorithm>
#include <iterator>

namespace Velocor {

namespace {

constexpr int TickHeight = 2; // pixels

} // namespace

TickScrollBar::TickScrollBar(QWidget* parent) : QScrollBar(Qt::Vertical, parent) {}

void TickScrollBar::SetTicks(Kind kind, std::shared_ptr<std::vector<int> const> const& rows)
{
    m_ticks[kind] = rows;
    update();
}

void TickScrollBar::SetRowCount(int count)
{
    const bool hasTicks = std::any_of(std::begin(m_ticks), std::end(m_ticks),
                                      [](auto const& rows) { return rows && !rows->empty(); });
    if (hasTicks && count != m_rowCount)
        update();
    m_rowCount = count;
}

// In a large log that is followed, most new lines move the slider by less than a pixel.
void TickScrollBar::sliderChange(SliderChange change)
{
    if (m_isUpdatingLater && change != SliderOrientationChange)
        return;
    const Look look = currentLook();
    if (change == SliderOrientationChange || !(look == m_look))
        update();
    m_look = look;
}

// In between, the slider is not at the end of a range that has grown.
void TickScrollBar::UpdateOnceAfter(std::function<void()> const& change)
{
    {
        const QScopedValueRollback<bool> guard(m_isUpdatingLater, true);
        change();
    }
    sliderChange(SliderValueChange);
}

TickScrollBar::Look TickScrollBar::currentLook() const
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

QColor TickScrollBar::Color(Kind kind, QPalette const& palette)
{
    const bool isDark = SeverityIcons::IsDark(palette);
    if (kind == Found)
        return QColor(isDark ? 0xff5fd9e8 : 0xff007a8c);
    return QColor(isDark ? 0xffd6a2ff : 0xff8a2be2);
}

// A search for each pixel instead of a step for each row, of which there may be millions.
void TickScrollBar::paintEvent(QPaintEvent* event)
{
    QScrollBar::paintEvent(event);
    if (m_rowCount == 0)
        return;
    QStyleOptionSlider option;
    initStyleOption(&option);
    const QRect groove =
        style()->subControlRect(QStyle::CC_ScrollBar, &option, QStyle::SC_ScrollBarGroove, this);
    const qint64 height = std::max(1, groove.height() - TickHeight + 1);
    QPainter painter(this);
    for (int kind = 0; kind < KindCount; ++kind) {
        if (!m_ticks[kind])
            continue;
        const QColor tick = Color(static_cast<Kind>(kind), palette());
        std::vector<int> const& rows = *m_ticks[kind];
        auto row = rows.begin();
        while (row != rows.end() && *row < m_rowCount) {
            const qint64 y = *row * height / m_rowCount;
            painter.fillRect(groove.left() + 2, groove.top() + static_cast<int>(y),
                             groove.width() - 4, TickHeight, tick);
            const qint64 next = ((y + 1) * m_rowCount + height - 1) / height; // first row below
            row = std::lower_bound(row, rows.end(), next);
        }
    }
}

} // namespace Velocor
