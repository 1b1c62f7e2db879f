// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogEntry.h"

#include <QColor>
#include <QIcon>

class QPalette;

namespace Velocor {

/// Colors and icons of the severities. Each icon has its own shape, so that they differ without
/// color as well; colors match the light or dark background of the palette.
class SeverityIcons
{
public:
    /// The icon; null for None. Drawn once and cached. GUI thread.
    static QIcon Icon(LogEntry::Severity severity, QPalette const& palette);

    /// The icon of a toggle button for the severity: normal when on, faded and struck through when
    /// off.
    static QIcon SwitchIcon(LogEntry::Severity severity, QPalette const& palette);

    /// The color of text and icon; the palette's own text color for Trace and None.
    static QColor Color(LogEntry::Severity severity, QPalette const& palette);

    /// Whether a palette's background is dark.
    static bool IsDark(QPalette const& palette);
};

} // namespace Velocor
