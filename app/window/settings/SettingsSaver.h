// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/settingsfile/SavedStates.h"
#include "app/settingsfile/SettingsDocument.h"

#include <QDateTime>

class QWidget;

namespace Velocor {

/// Saves one settings file, and asks the user before anything is lost by that. GUI thread only.
class SettingsSaver
{
public:
    /// @param parent  of its message boxes; not owned
    explicit SettingsSaver(QWidget* parent) : m_parent(parent) {}

    /// Where the states before and after each save are kept.
    void SetStates(SavedStates const& states) { m_states = states; }
    SavedStates const& states() const { return m_states; }

    /// Why the states of the last save were not kept; empty if they were.
    QString const& statesProblem() const { return m_statesProblem; }

    /// To be called whenever the file was read.
    ///
    /// @param document  what reading it resulted in
    void NoteRead(QString const& path, SettingsDocument const& document);

    /// Overwrites what is in the file by now without asking.
    void AcceptFile();

    /// Saves a document to another file, which is the file from then on.
    ///
    /// @return as Save(), and false leaves the former file as it is
    bool SaveAs(QString const& path, SettingsDocument const& document);

    /// Saves a document to the file. Copies the file to ".bak" before the first save.
    ///
    /// @return false if the user cancels, or saving failed, which the user was told
    bool Save(SettingsDocument const& document);

    /// Saves a text to the file, as it is. Asks first if it cannot be parsed.
    ///
    /// @param parsed  what reading the text results in
    /// @return as Save()
    bool SaveText(QByteArray const& text, SettingsDocument const& parsed);

    /// As SaveAs(), with a text.
    bool SaveTextAs(QString const& path, QByteArray const& text, SettingsDocument const& parsed);

    /// As SaveAs(), with a copy of the file, however large.
    bool SaveCopyAs(QString const& path);

    /// What saving a document of this file would lose, as for NoteRead().
    void NoteLosses(SettingsDocument const& document);

    /// How much of the file, as it was last read, saving would lose.
    int lossCount() const { return m_fileLossCount; }

private:
    bool confirmLosses(SettingsDocument const& document);
    bool confirmOverwrite();
    bool ask(QString const& text, QString const& details, QString const& acceptText);
    bool confirmMalformed(SettingsDocument const& parsed);
    bool makeBackup();
    bool noteOutcome(bool isSaved, QString const& error);
    SettingsSaver saverOf(QString const& path) const;
    QString name() const;

    QWidget* m_parent;
    SavedStates m_states;
    QString m_statesProblem;
    QString m_path;
    QStringList m_fileLosses;
    int m_fileLossCount = 0;
    QDateTime m_read; ///< modification time of the file when it was read
    bool m_hasBackup = false;
};

} // namespace Velocor
