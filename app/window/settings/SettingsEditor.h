// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/settingsfile/SettingsDocument.h"
#include "app/window/settings/SettingsSaver.h"

#include <QWidget>

class QPushButton;
class QStackedWidget;
class QTreeWidget;
class QTreeWidgetItem;

namespace Velocor {

class MalformedFileView;
class NoticeBar;

/// Edits a configuration file as a tree of sections, keys and values.
///
/// Before the first save, the file is copied to ".bak". The user is asked before anything is lost
/// by saving. A malformed file is shown as text, with the position of the error, and cannot be
/// saved.
///
/// A cell shows only the start of a long text, with its size. A long value is edited in a separate
/// dialog, and a long name cannot be edited; both are saved in full.
class SettingsEditor : public QWidget
{
    Q_OBJECT

public:
    explicit SettingsEditor(QWidget* parent = nullptr);
    ~SettingsEditor() override;

    /// Shows a file. Unsaved changes are discarded.
    void Open(QString const& path);

    /// Ends the editing of a cell and saves through the configuration store, after asking if
    /// anything would be lost. Does nothing if there are no changes.
    ///
    /// @return whether the file has all changes now
    bool Save();

    /// Asks what to do with unsaved changes, if any.
    ///
    /// @return false if the user cancels or saving fails
    bool MayClose();

    /// Whether there is something to save: changes, or a cell that is being edited.
    bool CanSave() const;

    bool isModified() const { return m_modified; }
    QString const& path() const { return m_path; }

    /// The current content of the tree.
    SettingsDocument document() const;

Q_SIGNALS:
    void modifiedChanged(bool modified);
    void canSaveChanged(bool canSave);
    void messageReported(QString const& text);

private:
    QWidget* makeTreePage();
    QPushButton* makeButton(QString const& text, QString const& toolTip);
    void showTree(SettingsDocument const& document);
    void showBroken(SettingsDocument const& document);
    void addSection();
    void addValue();
    void remove();
    void setModified(bool modified);
    void updateCanSave();
    void checkNames(QTreeWidgetItem* item);
    void editLongValueSoon();
    void editLongValue();
    QTreeWidgetItem* addItem(QTreeWidgetItem* section, QString const& key, QString const& value);
    void addNamed(QTreeWidgetItem* section, QString const& base, QString const& value);
    QStringList namesBeside(QTreeWidgetItem* item) const;
    QString nameProblem(QTreeWidgetItem* item, QString const& name) const;

    QString m_path;
    QString m_rootName;
    bool m_modified = false;
    bool m_isEditing = false;
    bool m_filling = false;
    bool m_editingLongValue = false;

    SettingsSaver m_saver;
    NoticeBar* m_notice;
    QStackedWidget* m_pages;
    MalformedFileView* m_text;
    QTreeWidget* m_tree = nullptr;
    QPushButton* m_addValue = nullptr;
    QPushButton* m_remove = nullptr;
    QPushButton* m_save = nullptr;
};

} // namespace Velocor
