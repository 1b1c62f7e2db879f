// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QObject>
#include <QString>

class QWidget;

namespace Velocor {

class FileTabs;

/// Selects and copies lines of the log in the current tab, and saves those that its filter shows.
class LineCommands : public QObject
{
    Q_OBJECT

public:
    /// @param tabs  not owned
    /// @param window  the parent of dialogs
    LineCommands(FileTabs* tabs, QWidget* window);

    /// Copies the selected lines, or if a text field has the focus, its selected text.
    void Copy();

    /// Selects all lines, or if a text field has the focus, its whole text.
    void SelectAll();

    /// Undoes the last change of the settings file, or if a text field has the focus, of its text;
    /// makes it again.
    void Undo();
    void Redo();

    /// Asks for a file, and saves the lines in it without blocking the window.
    void Save();

Q_SIGNALS:
    /// For the status bar.
    void messageReported(QString const& text);

    /// For a notice that stays until it is dismissed.
    void problemReported(QString const& text);

private:
    bool askFocused(char const* slot);
    void saveTo(QString const& path);

    FileTabs* m_tabs;
    QWidget* m_window;
};

} // namespace Velocor
