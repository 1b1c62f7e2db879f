// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/settingsfile/SettingsDocument.h"
#include "app/settingsfile/SettingsText.h"

#include <QKeySequence>
#include <QTimer>
#include <QWidget>

class QAction;
class QLabel;
class QPushButton;

namespace Velocor {

class NumberedText;
class SettingsTextPage;
class TextFindBar;

/// A command of the page, as menus and the list of keyboard shortcuts show it.
struct SettingsTextCommand
{
    QString text; ///< with a mnemonic
    QKeySequence key;
    QString statusTip;
    void (SettingsTextPage::*work)();
};

/// Edits a settings file as text, which may be malformed. Soon after each change the text is read
/// as the store would read it, and the first error is marked. GUI thread only.
///
/// Its commands are its actions; their keys work while the focus is in the page.
class SettingsTextPage : public QWidget
{
    Q_OBJECT

public:
    /// The maximum size of a file that is shown in full, and can be edited, in bytes.
    static constexpr int EditLimit = 1 << 20;

    explicit SettingsTextPage(QWidget* parent = nullptr);

    /// All commands, in the order of the menus.
    static QVector<SettingsTextCommand> AllCommands();

    /// Their actions, owned by the page, in the same order.
    QList<QAction*> const& commands() const { return m_actions; }

    /// What Show() needs of a file: all of it, or a little more than is shown. Empty if it cannot
    /// be read.
    static QByteArray BytesOf(QString const& path);

    /// Shows the content of a file. It is read-only if it is too large, could not be read, or
    /// contains characters that a text field changes.
    ///
    /// @param bytes  of BytesOf()
    /// @param parsed  what reading the file resulted in
    void Show(QByteArray const& bytes, SettingsDocument const& parsed);

    /// Replaces the text in one step, which can be undone. The encoding stays that of the file.
    void Replace(QByteArray const& bytes);

    /// The text as the file would contain it; of a read-only one, exactly what Show() was given.
    QByteArray bytes() const;

    /// What reading bytes() results in. A character that the file's encoding lacks is an error.
    SettingsDocument const& parsed();

    bool isReadOnly() const;

    /// Whether bytes() are only the start of the file.
    bool isOnlyStart() const { return m_original.size() > EditLimit; }

    /// Whether bytes() differ from what is in the file.
    bool isModified() const;

    /// Tells whether the file contains bytes() now.
    void SetModified(bool isModified);

    bool canUndo() const;
    bool canRedo() const;
    void Undo();
    void Redo();

    void GoToError();
    void ShowSettings();
    void OpenStates();
    void OpenFind();
    void FindNext();
    void FindPrevious();

    /// Asks for the number of a line, and goes there.
    void GoToLine();

Q_SIGNALS:
    /// Something else can be saved, undone or redone.
    void stateChanged();
    void settingsRequested();
    void statesRequested();
    void saveRequested();

protected:
    void keyPressEvent(QKeyEvent* event) override;

private:
    void makeActions();
    QPushButton* makeCommandButton(int command);
    QString text() const;
    void parse();
    void showState();

    QByteArray m_original;
    SettingsText m_file;
    SettingsDocument m_parsed;
    QTimer m_pause; ///< runs from a change until the text is read
    QList<QAction*> m_actions;
    NumberedText* m_text;
    TextFindBar* m_find;
    QLabel* m_state;
    QPushButton* m_save;
};

} // namespace Velocor
