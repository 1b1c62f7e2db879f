// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QColor>

namespace Velocor {

/// The least contrast of a text that people with low vision can still read, and of other parts that
/// they can still see, as WCAG 2 requires it (level AA).
constexpr qreal TextContrast = 4.5;
constexpr qreal PartContrast = 3;

/// The contrast of two opaque colors by the formula of WCAG 2, from 1 to 21.
qreal Contrast(QColor const& one, QColor const& other);

/// A color that differs enough from another one.
///
/// @param color  returned as it is if its contrast is enough
/// @param other  what it has to differ from
/// @return a color on the way from `color` to black or to white, whichever is farther from `other`
QColor WithContrast(QColor const& color, QColor const& other, qreal least);

} // namespace Velocor
