// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/config/TorkConfigFile.h"

#include <QMainWindow>

class QMenu;
class QPlainTextEdit;

/// A window to write notes in: plain text files, in UTF-8.
///
/// It remembers its place on the desktop, font, colour and recent files in a settings file, which
/// it reads when it is made and writes when it is closed.
class NotesWindow : public QMainWindow
{
    Q_OBJECT

public:
    explicit NotesWindow(QString const& settingsFile);
    ~NotesWindow() override;

    /// Shows a note, unless the one at hand has changes that the user wants to keep. A file that
    /// cannot be read is reported and no longer offered.
    bool OpenNote(QString const& path);

    /// Writes the note at hand. A failure is reported and leaves the old file as it was.
    bool SaveNote(QString const& path);

protected:
    void closeEvent(QCloseEvent* event) override;

private:
    void MakeMenus();
    void LoadSettings(bool firstStart);
    void SaveSettings();
    void SetColour(QColor const& colour);
    void ShowRecent();
    void TakeNote(QString const& path);
    bool MayLeaveNote();
    bool Save();
    bool SaveAs();

    TorkConfigFile m_settings;
    QPlainTextEdit* m_text = nullptr;
    QMenu* m_recentMenu = nullptr;
    QString m_recent; // newest first, as AppUtils keeps such lists
    QString m_path;   // of the note at hand; empty until it has a file
};
