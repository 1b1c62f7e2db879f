// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QFontMetrics>

namespace Velocor {

/// The height of a row in tables and trees of a font, in pixels.
inline int RowHeight(QFontMetrics const& metrics)
{
    return metrics.height() + 6;
}

} // namespace Velocor
