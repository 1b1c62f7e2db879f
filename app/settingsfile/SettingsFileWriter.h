// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/settingsfile/SettingsDocument.h"

namespace Velocor {

/// Saves a settings document through the configuration store, and reports what that would lose.
///
///     const auto losses = SettingsFileWriter::Losses(document);
///     if (losses.isEmpty() && SettingsFileWriter::Save(path, document, &error))
///         ...;
class SettingsFileWriter
{
public:
    /// What would not read back unchanged: one per value or name. Found in memory; no file
    /// is written.
    static QVector<SettingsDocument::Loss> Losses(SettingsDocument const& document);

    /// What is wrong with a text as a value: why it would not read back unchanged. Empty if it
    /// would.
    static QString ValueProblem(QString const& value);

    /// The bytes that Save() writes.
    static QByteArray ToBytes(SettingsDocument const& document);

    /// Replaces the file with the document, and reads it back to verify that it is complete.
    ///
    /// @param error  receives the reason for a failure
    /// @return false if the file could not be opened, or does not contain the document afterwards
    static bool Save(QString const& path, SettingsDocument const& document, QString* error);

    /// Replaces the content of a file, or creates it. Its owner and permissions stay; a file of
    /// another owner or group is therefore written in place.
    ///
    /// @param error  receives the reason for a failure
    static bool SaveBytes(QString const& path, QByteArray const& bytes, QString* error);

    /// As SaveBytes(), with the content of another file, however large.
    static bool SaveCopy(QString const& path, QString const& original, QString* error);

    /// Copies a file to the same name with ".bak" appended, replacing an earlier copy.
    static bool KeepBackup(QString const& path, QString* error);
};

} // namespace Velocor
