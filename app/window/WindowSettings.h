// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/settingsfile/SettingsDocument.h"
#include "common/config/TorkConfigFile.h"

#include <QList>
#include <QString>

class QWidget;

namespace Velocor {

/// The saved state of the window, in the settings file "velocor.cfg" in the data directory.
///
/// The file is read by SettingsFileReader instead of TorkConfigFile::Load(), which would log traces
/// before the first entry of the log. A malformed file is renamed and never overwritten. Keys and
/// values: docs/window.md.
///
///     WindowSettings settings(dataPath);
///     settings.Load();
///     settings.RestoreGeometry(window);
class WindowSettings
{
public:
    /// @param dataPath  directory of the file, ending in "/"
    explicit WindowSettings(QString const& dataPath);

    /// Reads the file, if there is one.
    ///
    /// @return a message for the user about a damaged file; empty on success
    QString Load();

    /// Writes the file, creating its directory if necessary.
    ///
    /// @return the reason for a failure; empty on success
    QString Save();

    /// Renames the file, so that the next start uses defaults, and saves nothing any more.
    ///
    /// @param name  set to the new name of the file
    /// @return the reason for a failure, which leaves the file as it is; empty on success
    QString SetAside(QString& name);

    /// Keeps what somebody has changed in the file since Load() or the last call: Save() writes
    /// those values instead of the window's own, and none where a key was removed. To be called
    /// after the user has saved the file in an editor; it takes effect at the next start. Does
    /// nothing if the file is malformed.
    void TakeOverEdits();

    /// Restores the saved position and size of a window. Centers it on the primary screen if its
    /// position is no longer on any screen; leaves it unchanged if nothing was saved.
    void RestoreGeometry(QWidget* window);

    /// Stores the geometry of a window; for a maximized window, its normal geometry as well.
    void NoteGeometry(QWidget* window);

    /// Comma-separated numbers: column widths, pane sizes. Empty if missing or invalid.
    QList<int> Numbers(QString const& key);
    void SetNumbers(QString const& key, QList<int> const& numbers);

    bool Flag(QString const& key, bool byDefault);
    void SetFlag(QString const& key, bool value);

    QString Text(QString const& key);
    void SetText(QString const& key, QString const& value);

    QString const& fileName() const { return m_fileName; }

private:
    QString renameDamagedFile();
    bool rename(QString const& ending, QString& name);
    void applyEdits();
    void take(QString const& section, QString const& key, QString const& value);

    QString m_fileName;
    TorkConfigFile m_file;
    bool m_mayWrite = true;
    SettingsValues m_known;  ///< what the file held when it was last read
    SettingsValues m_edited; ///< what others have changed since then; a null text: removed
};

} // namespace Velocor
