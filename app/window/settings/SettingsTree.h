// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/window/settings/SettingsModel.h"

#include <QKeySequence>
#include <QSet>
#include <QTreeView>
#include <QVector>

namespace Velocor {

class SettingsCommands;
class SettingsDelegate;
class SettingsTree;

/// A command of the tree, as menus and the list of keyboard shortcuts show it.
struct SettingsCommand
{
    QString text;             ///< with a mnemonic
    QList<QKeySequence> keys; ///< not empty; menus show the first
    QString statusTip;
    void (SettingsTree::*work)();
};

/// Shows a SettingsModel, and lets the user change it with keys, mouse and a context menu. GUI
/// thread only.
///
/// Its commands are its actions. Their keys work only while the tree itself has the focus: in the
/// field of a cell, keys are for the text.
class SettingsTree : public QTreeView
{
    Q_OBJECT

public:
    /// @param model, commands  not owned; outlive the tree
    SettingsTree(SettingsModel* model, SettingsCommands* commands, QWidget* parent = nullptr);

    /// All commands, in the order of the menus.
    static QVector<SettingsCommand> AllCommands();

    /// Their actions, owned by the tree, in the same order.
    QList<QAction*> const& commands() const { return m_actions; }

    /// Puts actions of others before its own in the context menu. Only the first call counts.
    void AddOuterActions(QList<QAction*> const& actions);

    /// Shows all sections with their keys, with the first one current.
    void ShowAll();

    /// Enables the commands that can do something now.
    void updateActions();

    /// Shows only some of the keys, in expanded sections. The current row stays current if it is
    /// shown. Without a filter, sections are collapsed again that were so before.
    void SetFilter(SettingsFilter const& filter);

    /// Makes a row current and visible.
    void GoTo(QModelIndex const& index);

    /// Goes to what was changed last.
    void GoToChanged();

    bool isEditing() const;

    /// Ends the editing of a cell, and takes what was typed.
    ///
    /// @return false if it was rejected
    bool EndEditing();

    void AddSection();
    void AddKey();
    void EditValue();
    void EditName();
    void EditInLargeField();
    void Toggle();

    /// Shows a menu with the kinds that the current value can have.
    void ChooseKind();

    void Duplicate();
    void Remove();
    void MoveUp();
    void MoveDown();
    void OpenFind();
    void FindNext();
    void FindPrevious();
    void EditAsText();
    void OpenStates();
    void BackToDefault();
    void AllBackToDefault();

    void keyboardSearch(QString const& search) override;

public Q_SLOTS:
    /// Copies the current value or, of a section, its name.
    void copy();

Q_SIGNALS:
    /// Editing a cell has begun or ended.
    void editingChanged();

    /// What was typed is not used.
    ///
    /// @param reason  for the user
    void rejected(QString const& reason);

    /// The user wants to find a text, or the next match in a direction.
    void findRequested();
    void findNextRequested(int step);

    /// The user wants to edit the file as text.
    void textRequested();

    /// The user wants to see the saved states of the file.
    void statesRequested();

    /// The current value is to be edited in a dialog.
    ///
    /// @param asText  as a text, whatever its kind
    void dialogRequested(bool asText);

protected:
    void keyPressEvent(QKeyEvent* event) override;
    void currentChanged(QModelIndex const& current, QModelIndex const& previous) override;

protected Q_SLOTS:
    void closeEditor(QWidget* editor, QAbstractItemDelegate::EndEditHint hint) override;

private:
    void makeActions();
    void expandNew(QModelIndex const& parent, int first, int last);
    QModelIndexList chosenRows() const;
    void noteCollapsed();
    void editCell(QModelIndex const& row, SettingsModel::Column column);
    void editValueBeside(int step);

    SettingsModel* m_model;
    SettingsCommands* m_commands;
    SettingsDelegate* m_delegate;
    QList<QAction*> m_actions;
    QPersistentModelIndex m_changed;
    QSet<QString> m_collapsed; ///< the names of such sections before the filter
    bool m_hasOuterActions = false;
    bool m_isRejected = false;
};

} // namespace Velocor
