// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QColor>
#include <QIcon>

class QPalette;

namespace Velocor {

/// The colors that tell the logs of several programs apart, beside their names. GUI thread.
class ProgramColors
{
public:
    /// After these, the first one is used again.
    static constexpr int Count = 8;

    /// Has a contrast of at least 3:1 with the base color of the palette.
    ///
    /// @param log  the number of the log, from 0 on
    static QColor Color(int log, QPalette const& palette);

    /// A square of that color; in a selected row, of that of the selected text.
    static QIcon Icon(int log, QPalette const& palette);
};

} // namespace Velocor
