// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/config/TorkConfigFile.h"

#include <QMainWindow>

class QMenu;
class QPlainTextEdit;

/// A window for writing notes: plain text files, in UTF-8.
///
/// It saves its position on the desktop, font, color and recent files to a settings file, which it
/// reads when it is created and writes when it is closed.
class NotesWindow : public QMainWindow
{
    Q_OBJECT

public:
    explicit NotesWindow(QString const& settingsFile);
    ~NotesWindow() override;

    /// Opens a note, unless the user wants to keep the changes to the current one. A file that
    /// cannot be read is reported and removed from the recent files.
    bool OpenNote(QString const& path);

    /// Saves the current note. A failure is reported and leaves the old file unchanged.
    bool SaveNote(QString const& path);

protected:
    void closeEvent(QCloseEvent* event) override;

private:
    void MakeMenus();
    void LoadSettings(bool firstStart);
    void SaveSettings();
    void SetColor(QColor const& color);
    void ShowRecent();
    void TakeNote(QString const& path);
    bool MayLeaveNote();
    bool Save();
    bool SaveAs();

    TorkConfigFile m_settings;
    QPlainTextEdit* m_text = nullptr;
    QMenu* m_recentMenu = nullptr;
    QString m_recent; // newest first, as AppUtils keeps such lists
    QString m_path;   // of the current note; empty until it has a file
};
