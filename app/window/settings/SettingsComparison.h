// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

class QWidget;

namespace Velocor {

class SettingsCommands;
class SettingsModel;
struct SettingsDocument;

/// Compares the settings in an editor with files, in dialogs. GUI thread only.
class SettingsComparison
{
public:
    /// @param model, commands, parent  not owned; outlive this object
    SettingsComparison(SettingsModel* model, SettingsCommands* commands, QWidget* parent)
        : m_model(model), m_commands(commands), m_parent(parent)
    {}

    /// Shows a file as it is and as saving the editor's settings to it would make it, with what
    /// would be lost.
    void ShowSaving(QString const& path);

    /// Shows the editor's settings beside a file, and lets the user take over values from it, which
    /// can be undone. Tells the user if the file cannot be read.
    ///
    /// @param title  of the file's side
    void CompareWith(QString const& path, QString const& title);

private:
    void tellNotCompared(QString const& path, SettingsDocument const& document);

    SettingsModel* m_model;
    SettingsCommands* m_commands;
    QWidget* m_parent;
};

} // namespace Velocor
