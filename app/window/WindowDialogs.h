// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QObject>
#include <QString>

class QMainWindow;

namespace Velocor {

/// What the menus show outside the tabs: dialogs about the program and its log, the manual, and the
/// folder of the log.
class WindowDialogs : public QObject
{
    Q_OBJECT

public:
    /// @param settingsFile  the window's settings file, which About and the report name
    /// @param window  the parent of the dialogs; its menus are the source of the list of shortcuts
    WindowDialogs(QString const& settingsFile, QMainWindow* window);

    void ShowAbout();
    void ShowShortcuts();
    void ShowManual();
    void SaveReport();

    /// Shows the last entries of the last run that did not end normally.
    void ShowEndOfRun();

    void ChangeLogSettings();

    /// Shows the folder of the program's log in the file manager.
    void OpenLogFolder();

Q_SIGNALS:
    /// For the status bar.
    void messageReported(QString const& text);
    void logSettingsChanged();

private:
    QString m_settingsFile;
    QMainWindow* m_window;
};

} // namespace Velocor
