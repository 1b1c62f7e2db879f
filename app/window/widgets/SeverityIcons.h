// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogEntry.h"

#include <QColor>
#include <QIcon>

class QPalette;

namespace Velocor {

/// Colours and icons of the severities. Each icon has a shape of its own, so that they are told
/// apart without their colours; colours suit the light or dark background of a palette.
class SeverityIcons
{
public:
    /// The icon; a null one for None. Drawn once and kept. GUI thread.
    static QIcon Icon(LogEntry::Severity severity, QPalette const& palette);

    /// The icon of a switch that shows or hides the severity: full while it is on, pale and struck
    /// through while it is off.
    static QIcon SwitchIcon(LogEntry::Severity severity, QPalette const& palette);

    /// The colour of text and icon; the palette's own text colour for Trace and None.
    static QColor Colour(LogEntry::Severity severity, QPalette const& palette);

    /// Whether a palette's background is dark.
    static bool IsDark(QPalette const& palette);
};

} // namespace Velocor
