// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/settingsfile/SettingsEdit.h"
#include "app/window/settings/SettingsModel.h"

#include <QObject>
#include <QUndoStack>

namespace Velocor {

/// What the user can do with the settings in a SettingsModel. Every change can be undone, without
/// limit. GUI thread only.
///
///     const QString problem = commands.SetText(cell, "Sans");
///     if (problem.isEmpty())
///         commands.undoStack()->undo(); // "Change Value"
class SettingsCommands : public QObject
{
    Q_OBJECT

public:
    /// Why a name cannot be used.
    struct NameProblem
    {
        QString reason; ///< without a full stop; empty if the name can be used
        QString hint;   ///< a sentence on what to type instead; may be empty
    };

    /// @param model  not owned; outlives this object
    explicit SettingsCommands(SettingsModel* model) : m_model(model) {}

    QUndoStack* undoStack() { return &m_undo; }
    QUndoStack const* undoStack() const { return &m_undo; }

    /// Adds an empty section at the end, with a name that is not in use.
    ///
    /// @return its name cell
    QModelIndex AddSection();

    /// Adds a key at the end of the section of an index.
    ///
    /// @return its name cell; invalid if the index is
    QModelIndex AddKey(QModelIndex const& near);

    /// Adds a copy of a section or item after it, with another name.
    ///
    /// @return its name cell; invalid if the index is
    QModelIndex Duplicate(QModelIndex const& index);

    /// Removes sections and items; in one step, however many. Of a section with hidden items, only
    /// those that are shown are removed. Emits `removed` for more than one key.
    ///
    /// @param indexes  in any order; of each row, only the first column counts
    void Remove(QModelIndexList const& indexes);

    /// Replaces everything by the sections of another document. Nothing changes if they are the
    /// same.
    ///
    /// @param text  what the step is called in "Undo ..."
    void Replace(SettingsDocument const& document, QString const& text);

    /// Gives items their default values, in one step. Those without a default, and those that have
    /// it already, stay as they are.
    ///
    /// @param indexes  in any order; a section stands for its items that are shown
    void BackToDefault(QModelIndexList const& indexes);

    /// The same for all items, shown or not.
    void AllBackToDefault();

    /// Moves a section among the sections that are shown, or an item within its section.
    ///
    /// @param step  1 moves down, -1 up
    void Move(QModelIndex const& index, int step);

    /// Gives a cell another text. From names, spaces are removed, as the store does. Nothing
    /// changes if the text is the same.
    ///
    /// @return why the old name is kept, for the user; empty if the text was accepted
    QString SetText(QModelIndex const& index, QString const& text);

    /// Changes a value of yes or no to the other one. Nothing changes for any other kind.
    void Toggle(QModelIndex const& index);

    /// Whether a text could be the name of an existing section or item.
    NameProblem CheckName(QModelIndex const& index, QString const& name) const;

Q_SIGNALS:
    /// More than one key was removed.
    ///
    /// @param text  says which; for the user
    void removed(QString const& text);

private:
    using Edits = QVector<SettingsEdit>;

    QVector<SettingsModel::Place> placesToRemove(QModelIndexList const& indexes) const;
    void backToDefault(QVector<SettingsModel::Place> const& items);
    Edits editsTo(SettingsDocument const& document) const;
    void push(Edits const& edits, QString const& text);
    QStringList namesBeside(SettingsModel::Place place) const;
    QString freeName(SettingsModel::Place place, QString const& base) const;
    QString removalText(Edits const& removals) const;

    SettingsModel* m_model;
    QUndoStack m_undo;
};

} // namespace Velocor
