// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

namespace Velocor {

/// The log's settings: those in effect, and those in its settings file for the next start.
///
/// The log has setters for only some of its settings; the others are changed in its settings file.
/// Nothing here is logged. GUI thread. Settings: docs/log-settings.md.
///
///     LogPreferences preferences = LogPreferences::Read();
///     preferences.elapsedTime = true;
///     const QString error = preferences.Apply();
struct LogPreferences
{
    // Take effect immediately.
    bool enabled = true;
    bool elapsedTime = false;
    bool echo = false;
    int maxFiles = 10;

    // Take effect at the next start.
    QString elapsedPrefix;
    QString dateFormat;
    QString filePrefix;

    /// The settings in effect; for those that take effect at the next start, the values in the
    /// settings file, if any.
    static LogPreferences Read();

    /// Saves all settings, then applies those that can take effect immediately.
    ///
    /// @return the reason for a failure, which leaves the running log unchanged; empty on success
    QString Apply() const;

    /// The log's settings file; empty if there is no log.
    static QString FileName();

    /// Whether the settings file can store this text and it fits into a log line: a plain value
    /// (see TorkConfigText::IsPlainValue()) without control characters.
    static bool IsStorable(QString const& text);

    /// Whether this is a valid log file name: storable, without "/", and not "." or "..".
    static bool IsValidFilePrefix(QString const& text);

private:
    QString save(unsigned maxFileSize, unsigned files) const;
};

} // namespace Velocor
