// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/settingsfile/SettingsDocument.h"

namespace Velocor {

/// Saves a settings document through the configuration store, and tells what that would lose.
///
///     const QStringList losses = SettingsFileWriter::Losses(document);
///     if (losses.isEmpty() && SettingsFileWriter::Save(path, document, &error))
///         ...;
class SettingsFileWriter
{
public:
    /// What the store cannot write so that it reads back the same: one text for each value or name.
    /// Tried in memory; no file is written.
    static QStringList Losses(SettingsDocument const& document);

    /// Replaces the file by the document, and reads it back to see whether all of it arrived.
    ///
    /// @param error  receives the reason of a failure
    /// @return false if the file could not be opened, or if it does not hold the document now
    static bool Save(QString const& path, SettingsDocument const& document, QString* error);

    /// Copies a file to the same name with ".bak" behind it, in the place of an earlier copy.
    static bool KeepBackup(QString const& path, QString* error);
};

} // namespace Velocor
