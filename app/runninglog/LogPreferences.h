// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

namespace Velocor {

/// The log's settings, those in force and those that its settings file keeps for the next start.
///
/// The log has setters for some of its settings only; the others are changed in its settings file.
/// Nothing here is logged. GUI thread. Settings: docs/log-settings.md.
///
///     LogPreferences preferences = LogPreferences::Read();
///     preferences.elapsedTime = true;
///     const QString error = preferences.Apply();
struct LogPreferences
{
    // Set at once.
    bool enabled = true;
    bool elapsedTime = false;
    bool echo = false;
    int maxFiles = 10;

    // From the next start on.
    QString elapsedPrefix;
    QString dateFormat;
    QString filePrefix;

    /// What the log has in force, and for the rest what its settings file says.
    static LogPreferences Read();

    /// Puts them in force as far as that is possible, and saves all of them.
    ///
    /// @return the reason of a failure; empty if all is well
    QString Apply() const;

    /// The log's settings file.
    static QString FileName();

    /// Whether the log's settings file keeps this text as a value, and it fits in a line of the
    /// log: a plain value (see TorkConfigText::IsPlainValue()) without control characters.
    static bool IsKept(QString const& text);

    /// Whether log files can be called so: kept, no "/", and not "." or "..".
    static bool IsFilePrefix(QString const& text);
};

} // namespace Velocor
