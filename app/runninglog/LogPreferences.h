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

    /// What the log has in force; for the settings from the next start on what its settings file
    /// says, if it says anything.
    static LogPreferences Read();

    /// Saves all of them, then puts those that can be set at once in force.
    ///
    /// @return the reason of a failure, which leaves the running log as it was; empty if all is
    ///     well
    QString Apply() const;

    /// The log's settings file; empty if there is no log.
    static QString FileName();

    /// Whether the log's settings file keeps this text as a value, and it fits in a line of the
    /// log: a plain value (see TorkConfigText::IsPlainValue()) without control characters.
    static bool IsKept(QString const& text);

    /// Whether log files can be called so: kept, no "/", and not "." or "..".
    static bool IsFilePrefix(QString const& text);

private:
    QString save(unsigned maxFileSize, unsigned files) const;
};

} // namespace Velocor
