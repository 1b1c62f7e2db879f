// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/widgets/Contrast.h"

#include "app/window/widgets/BlendedColor.h"

#include <algorithm>
#include <cmath>

namespace Velocor {

namespace {

constexpr int Steps = 50; // to black or white; the eye sees no difference between two

qreal Linear(qreal part)
{
    return part <= 0.04045 ? part / 12.92 : std::pow((part + 0.055) / 1.055, 2.4);
}

qreal Luminance(QColor const& color)
{
    return 0.2126 * Linear(color.redF()) + 0.7152 * Linear(color.greenF()) +
           0.0722 * Linear(color.blueF());
}

} // namespace

qreal Contrast(QColor const& one, QColor const& other)
{
    const auto [darker, lighter] = std::minmax({Luminance(one), Luminance(other)});
    return (lighter + 0.05) / (darker + 0.05);
}

QColor WithContrast(QColor const& color, QColor const& other, qreal least)
{
    const bool isBlackFarther = Contrast(Qt::black, other) > Contrast(Qt::white, other);
    const QColor end = isBlackFarther ? Qt::black : Qt::white;
    for (int step = 0; step < Steps; ++step) {
        const QColor next = Blended(color, end, qreal(step) / Steps);
        if (Contrast(next, other) >= least)
            return step == 0 ? color : next;
    }
    return end;
}

} // namespace Velocor
