// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

namespace Velocor {

/// What reports and the About box say about the program, one fact per line.
class SystemReport
{
public:
    /// Versions, system and screens.
    static QString Versions();

    /// Identity, folders, files and their sizes, and the state of the log.
    ///
    /// @param settingsFile  the window's settings file
    static QString Places(QString const& settingsFile);

    /// Both.
    static QString Facts(QString const& settingsFile);

    /// The licenses of the program and of what it uses.
    static QString Licenses();
};

} // namespace Velocor
