// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/config/TorkConfigFile.h"

#include <QList>
#include <QString>

class QWidget;

namespace Velocor {

/// The state of the window between two runs, in the settings file "velocor.cfg" of the data
/// directory.
///
/// The file is read by SettingsFileReader rather than by TorkConfigFile::Load(), whose traces would
/// come before the first entry of the log. A file that does not parse is put aside under another
/// name, and is never written over. Keys and values: docs/window.md.
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
    /// @return what is to be told about a damaged file, for people; empty if all is well
    QString Load();

    /// Writes the file and makes its directory.
    ///
    /// @return the reason of a failure; empty if all is well
    QString Save();

    /// Moves and sizes a window as it was saved; in the middle of the primary screen if no screen
    /// shows that place any more, or with its own size if none was saved.
    void RestoreGeometry(QWidget* window);

    /// Notes a window's geometry. A maximised window keeps its normal one too.
    void NoteGeometry(QWidget* window);

    /// Numbers separated by commas: widths of columns, sizes of panes. Empty if there are none.
    QList<int> Numbers(QString const& key);
    void SetNumbers(QString const& key, QList<int> const& numbers);

    bool Flag(QString const& key, bool byDefault);
    void SetFlag(QString const& key, bool value);

    QString Text(QString const& key);
    void SetText(QString const& key, QString const& value);

    QString const& fileName() const { return m_fileName; }

private:
    QString putAside();

    QString m_fileName;
    TorkConfigFile m_file;
    bool m_mayWrite = true;
};

} // namespace Velocor
