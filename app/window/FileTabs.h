// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>
#include <QTabWidget>

namespace Velocor {

class LogPanel;
class SettingsEditor;

/// The centre of the window: the program's own log, and behind it the files that were opened.
class FileTabs : public QTabWidget
{
    Q_OBJECT

public:
    /// Makes the tab of the program's log, without reading it yet.
    explicit FileTabs(QWidget* parent = nullptr);

    /// Shows a file in a tab of its own, or the tab that it has already.
    ///
    /// A file that begins with "<" is taken for a settings file, any other for a log.
    void OpenFile(QString const& path);

    /// Closes the current tab unless it is the program's log or its file is to be kept open.
    void CloseCurrent();

    /// Asks about all changes that have not been saved.
    ///
    /// @return false if the window is to stay
    bool MayCloseAll();

    /// The panel of the program's own log.
    LogPanel* ownLog() const { return m_ownLog; }

    /// What the current tab shows; null if it is of the other kind.
    LogPanel* currentLog() const;
    SettingsEditor* currentEditor() const;

    /// Whether a file looks like a settings file.
    static bool IsSettingsFile(QString const& path);

Q_SIGNALS:
    /// Another tab is current, or what the current one shows has changed.
    void stateChanged();
    void messageReported(QString const& text);

private:
    LogPanel* addLog(QString const& title, QString const& path);
    SettingsEditor* addEditor(QString const& title, QString const& path);
    void closeTab(int position);
    int positionOf(QString const& path) const;
    void addCloseButton(QWidget* page, QString const& name);

    LogPanel* m_ownLog;
};

} // namespace Velocor
