// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QColor>

namespace Velocor {

/// A color between two others.
///
/// @param share  of `b`, from 0 to 1
inline QColor Blended(QColor const& a, QColor const& b, qreal share)
{
    return QColor::fromRgbF(a.redF() * (1 - share) + b.redF() * share,
                            a.greenF() * (1 - share) + b.greenF() * share,
                            a.blueF() * (1 - share) + b.blueF() * share);
}

} // namespace Velocor
