// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>
#include <QStringList>
#include <QTabWidget>

#include <memory>

namespace Velocor {

class LogMarkStore;
class LogPanel;
class SettingsEditor;

/// The central widget: a tab for the program's own log, followed by tabs for opened files.
class FileTabs : public QTabWidget
{
    Q_OBJECT

public:
    /// Creates the tab for the program's log, without reading it yet.
    ///
    /// @param marks  where the marks of log files are kept; not owned; null: they are not
    explicit FileTabs(LogMarkStore* marks = nullptr, QWidget* parent = nullptr);

    /// Shows a file in a new tab, or in its existing tab.
    ///
    /// A file that begins with "<" is treated as a settings file, any other as a log.
    void OpenFile(QString const& path);

    /// Closes the current tab, unless it is the program's log or the user cancels.
    void CloseCurrent();

    /// Asks about all unsaved changes.
    ///
    /// @return false if the user cancels
    bool MayCloseAll();

    /// The last filter texts of all logs, newest first.
    QStringList filterHistory() const { return *m_filterHistory; }
    void SetFilterHistory(QStringList const& texts) { *m_filterHistory = texts; }

    /// The panel of the program's own log.
    LogPanel* ownLog() const { return m_ownLog; }

    /// The content of the current tab; null if it is of the other type.
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

    LogMarkStore* m_marks;
    std::shared_ptr<QStringList> m_filterHistory = std::make_shared<QStringList>();
    LogPanel* m_ownLog;
};

} // namespace Velocor
