// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/settingsfile/SettingsDocument.h"

#include <QDateTime>
#include <QWidget>

class QPlainTextEdit;
class QPushButton;
class QStackedWidget;
class QTreeWidget;
class QTreeWidgetItem;

namespace Velocor {

class NoticeBar;

/// A configuration-store file as a tree of sections, keys and values that can be edited and saved.
///
/// Before the first save a copy of the file is kept as ".bak". What the store would lose is told
/// before saving. A file that does not parse is shown as text, with the place of the error, and
/// cannot be saved.
///
/// A cell shows only the start of a long text, with its size. A long value is edited in a dialog of
/// its own, and a long name not at all; both are saved in full.
class SettingsEditor : public QWidget
{
    Q_OBJECT

public:
    explicit SettingsEditor(QWidget* parent = nullptr);
    ~SettingsEditor() override;

    /// Shows a file. What has been edited so far is dropped.
    void Open(QString const& path);

    /// Saves through the configuration store, after asking where something would be lost.
    ///
    /// @return whether the file was saved
    bool Save();

    /// Asks what to do with changes, if there are any.
    ///
    /// @return false if the file is to stay open
    bool MayClose();

    bool isModified() const { return m_modified; }
    QString const& path() const { return m_path; }

    /// What the tree holds at the moment.
    SettingsDocument document() const;

Q_SIGNALS:
    void modifiedChanged(bool modified);
    void messageReported(QString const& text);

private:
    QWidget* makeTreePage();
    QWidget* makeTextPage();
    QPushButton* makeButton(QString const& text, QString const& toolTip);
    void showTree(SettingsDocument const& document);
    void showBroken(SettingsDocument const& document);
    void addSection();
    void addValue();
    void remove();
    void setModified(bool modified);
    void checkNames(QTreeWidgetItem* item);
    void editLongValueSoon();
    void editLongValue();
    QTreeWidgetItem* addItem(QTreeWidgetItem* section, QString const& key, QString const& value);
    QString freeName(QTreeWidgetItem* section, QString const& base) const;
    bool mayLose();
    bool mayReplaceChanged();
    bool ask(QString const& text, QString const& details, QString const& goOn);
    bool keepBackup();

    QString m_path;
    QString m_rootName;
    QStringList m_fileLosses;
    int m_fileLossCount = 0;
    QDateTime m_read; ///< time of the file's last change when it was read
    bool m_modified = false;
    bool m_filling = false;
    bool m_hasBackup = false;
    bool m_editingLongValue = false;

    NoticeBar* m_notice;
    QStackedWidget* m_pages;
    QTreeWidget* m_tree = nullptr;
    QPlainTextEdit* m_text = nullptr;
    QPushButton* m_addValue = nullptr;
    QPushButton* m_remove = nullptr;
    QPushButton* m_save = nullptr;
};

} // namespace Velocor
