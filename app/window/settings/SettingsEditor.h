// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/window/settings/SettingsCommands.h"
#include "app/window/settings/SettingsComparison.h"
#include "app/window/settings/SettingsModel.h"
#include "app/window/settings/SettingsSaver.h"

#include <QWidget>

class QAction;
class QPushButton;
class QStackedWidget;

namespace Velocor {

class FileNotice;
class NoticeBar;
class SettingsFindBar;
class SettingsTextPage;
class SettingsTree;

/// Edits a configuration file as a tree of sections, keys and values. Every change can be undone.
///
/// Before the first save, the file is copied to ".bak". The user is asked before anything is lost
/// by saving. A malformed file is shown as text, with the position of the error, to be mended; what
/// can be read of it can be shown as a tree, and every file as text.
///
/// A cell shows only the start of a long text, with its size. A long value, and one whose kind has
/// a dialog, is edited there; a long name cannot be edited. Both are saved in full.
class SettingsEditor : public QWidget
{
    Q_OBJECT

public:
    explicit SettingsEditor(QWidget* parent = nullptr);
    ~SettingsEditor() override;

    /// Whose file it is, and what that program will do to it; shown by Open().
    void SetOwnerNote(QString const& note) { m_ownerNote = note; }

    /// Where saved states are kept; nowhere without this.
    void SetStates(SavedStates const& states) { m_saver.SetStates(states); }

    /// Lists the saved states of the file. One that is brought back can be undone.
    void ShowStates();

    /// Shows a file. Unsaved changes are discarded.
    void Open(QString const& path);

    /// Ends the editing of a cell and saves through the configuration store, after asking if
    /// anything would be lost. Does nothing if there are no changes, or if what was typed is
    /// rejected.
    ///
    /// @return whether the file has all changes now
    bool Save();

    /// Asks what to do with unsaved changes, if any.
    ///
    /// @return false if the user cancels or saving fails
    bool MayClose();

    /// Shows what is in the file now. Asks before changes are lost that cannot be brought back by
    /// Undo, in the tree or in the text, and keeps what is shown if the file cannot be read.
    void Reload();

    /// Shows the file as it is and as saving would make it.
    void ShowWhatWillBeWritten();

    /// Asks for another file, and shows it beside the settings here. Its values can be taken over.
    void CompareWithOther();

    /// Shows the file as text, with the changes made here; in the text, what can be read of it as a
    /// tree. Both can be undone.
    void ShowAsText();
    void ShowAsTree();

    /// Whether there is a change to take back, or to make again, and what to call it after "Undo".
    bool CanUndo() const;
    bool CanRedo() const;
    QString UndoText() const;
    QString RedoText() const;

    /// Whether the settings are shown as a tree, so that they can be compared.
    bool ShowsTree() const;

    /// Takes back the last change, or makes it again, and goes there. Does nothing if there is
    /// none.
    void Undo();
    void Redo();

    /// Whether there is something to save: changes, or a cell that is being edited.
    bool CanSave() const;

    bool isModified() const;
    QString const& path() const { return m_path; }

    /// The changes; not for changing.
    QUndoStack const* undoStack() const { return m_commands.undoStack(); }

    /// The commands for the tree or the text, for a menu. Owned by the editor.
    QList<QAction*> commands() const;

    /// Puts actions of the window first in the context menu. Only the first call counts.
    void AddOuterActions(QList<QAction*> const& actions);

    /// The current content of the tree.
    SettingsDocument const& document() const { return m_model.document(); }

Q_SIGNALS:
    /// Something else can be saved, undone or redone.
    void stateChanged();
    void messageReported(QString const& text);

    /// The file at path() was written.
    void saved();

private:
    enum Page { TreePage, TextPage };

    void connectParts();
    QWidget* makeTreePage();
    QPushButton* makeButton(QString const& text, QString const& toolTip);
    void showTree(SettingsDocument const& document);
    void showMalformed(SettingsDocument const& document);
    void tellLosses(SettingsDocument const& document);
    void tellMalformed(SettingsDocument const& document);
    bool reloadTree(SettingsDocument const& document);
    bool reloadTreeAsText(SettingsDocument const& document);
    bool reloadText(SettingsDocument const& document);
    bool confirmDiscard();
    void showPage(Page page);
    void noteTreeChange();
    bool saveText();
    void bringBack(QString const& statePath, QString const& title);
    void bringBackText(QByteArray const& bytes, SettingsDocument const& state);
    void compareWithFile();
    void keepMine();
    void saveAs();
    void noteSaved();
    void updateState();
    void updateButtons();
    void editInDialogSoon(bool asText);
    void editInDialog(bool asText);

    QString m_path;
    bool m_isInDialog = false;

    SettingsSaver m_saver;
    SettingsModel m_model;
    SettingsCommands m_commands;
    SettingsComparison m_comparison;
    QString m_ownerNote;
    NoticeBar* m_notice;
    FileNotice* m_fileNotice;
    NoticeBar* m_removal; ///< tells what was just removed
    QStackedWidget* m_pages;
    SettingsTree* m_tree;
    SettingsFindBar* m_find;
    SettingsTextPage* m_text;
    bool m_hasText = false;     ///< whether the text page has this file
    bool m_hasTree = false;     ///< whether the tree has this file
    bool m_treeChanged = false; ///< since the text was last shown
    QByteArray m_shownText;     ///< when the text was last shown
    QPushButton* m_addSection = nullptr;
    QPushButton* m_addKey = nullptr;
    QPushButton* m_remove = nullptr;
    QPushButton* m_save = nullptr;
};

} // namespace Velocor
