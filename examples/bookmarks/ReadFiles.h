// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/config/TorkConfigFile.h"

class QTextStream;

/// The bookmark files read so far and their titles, kept in a settings file.
///
/// Paths are keys and titles are values, and users can put anything in both, so they are stored
/// encoded.
class ReadFiles
{
public:
    /// Loads the settings file. One that cannot be loaded is left unchanged.
    ///
    /// @param settingsFile  need not exist yet
    explicit ReadFiles(QString const& settingsFile);

    /// Adds a file and its title.
    ///
    /// @return the reason of a failure; empty on success
    QString Note(QString const& path, QString const& title);

    /// Prints "path: title" for each, sorted by path.
    void Print(QTextStream& out);

private:
    QString m_settingsFile;
    TorkConfigFile m_settings;
    QString m_broken; // why the settings file may not be overwritten
};
