// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QColor>

class QPalette;

namespace Velocor {

/// The colors of what the user looks for: lines found and marks, in the table and beside it. They
/// are readable on the palette's background. Pure, any thread.
class TickColors
{
public:
    static QColor Found(QPalette const& palette);
    static QColor Marked(QPalette const& palette);
};

} // namespace Velocor
