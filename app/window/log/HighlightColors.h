// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QColor>
#include <QString>

class QPalette;

namespace Velocor {

/// The colors that highlight rules give to lines, numbered from 0. Each has a background and a text
/// color with a contrast of more than 7:1, for light and for dark palettes. None of them is that of
/// a severity, a mark, or a hit of filter or find.
class HighlightColors
{
public:
    static constexpr int Count = 7;

    /// The name of a color, for users.
    static QString Name(int color);

    /// The number of a color that is saved as `key`; -1 if there is none.
    static int FromKey(QString const& key);

    /// The name of a color in the settings.
    static QString Key(int color);

    static QColor Background(int color, QPalette const& palette);
    static QColor Text(QPalette const& palette);
};

} // namespace Velocor
