// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/config/TorkConfigFile.h"

#include <QMainWindow>

class QMenu;
class QPlainTextEdit;

/// Shows a text file. Remembers its own place and the recent files.
class MainWindow : public QMainWindow
{
    Q_OBJECT

public:
    /// Loads the settings. Damaged ones are reported, and replaced when the window is closed.
    ///
    /// @param settingsFile  need not exist yet
    explicit MainWindow(QString const& settingsFile);
    ~MainWindow() override;

    /// Shows a file. One that cannot be read is reported, removed from the recent files, and
    /// changes nothing else.
    ///
    /// @return whether the file is shown
    bool Open(QString const& name);

protected:
    /// Saves the settings.
    void closeEvent(QCloseEvent* event) override;

private:
    void makeMenus();
    void loadSettings(bool firstStart);
    void saveSettings();
    void showRecent();

    TorkConfigFile m_settings;
    QPlainTextEdit* m_text = nullptr;
    QMenu* m_recentMenu = nullptr;
    QString m_recent; // newest first, as AppUtils keeps such lists
};
