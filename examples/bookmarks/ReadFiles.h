// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/config/TorkConfigFile.h"

class QTextStream;

/// The bookmark files that were read so far and their titles, kept in a settings file.
///
/// Paths are keys and titles are values, and both hold whatever users write: they are stored
/// encoded.
class ReadFiles
{
public:
    /// Loads what is kept. One that cannot be loaded is left as it is.
    ///
    /// @param settingsFile  need not exist yet
    explicit ReadFiles(QString const& settingsFile);

    /// Keeps a file and its title.
    ///
    /// @return the reason of a failure; empty if all is well
    QString Note(QString const& path, QString const& title);

    /// Prints "path: title" for each, in the order of the paths.
    void Print(QTextStream& out);

private:
    QString m_settingsFile;
    TorkConfigFile m_settings;
    QString m_broken; // why the settings file may not be written over
};
