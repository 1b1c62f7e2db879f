// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QFont>
#include <QHash>
#include <QKeySequence>
#include <QString>
#include <QStringList>
#include <QTabWidget>

#include <memory>

namespace Velocor {

class HighlightRules;
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
    /// A file that begins with "<" is treated as a settings file, unless that is the priority of a
    /// line from syslog, such as "<34>"; any other as a log.
    void OpenFile(QString const& path);

    /// Opens a file like OpenFile(), without going to its tab.
    void OpenInBackground(QString const& path);

    /// Goes to the tab of a file, or else to that of the program's log.
    void GoTo(QString const& path);

    /// Shows a file as a log in a new tab.
    ///
    /// @return its panel, owned by the tabs
    LogPanel* OpenLog(QString const& path);

    /// Closes the current tab, unless it is the program's log or the user cancels.
    void CloseCurrent();

    /// Asks about all unsaved changes.
    ///
    /// @return false if the user cancels
    bool MayCloseAll();

    /// Names settings files of running programs, for those who edit them.
    ///
    /// @param notes  what the program will do to the file, by absolute path
    void SetOwnerNotes(QHash<QString, QString> const& notes) { m_ownerNotes = notes; }

    /// The last filter texts of all logs, newest first.
    QStringList filterHistory() const { return *m_filterHistory; }
    void SetFilterHistory(QStringList const& texts) { *m_filterHistory = texts; }

    /// The rules that highlight lines, in all logs.
    HighlightRules* highlightRules() const { return m_highlightRules.get(); }

    /// Lets the user change them.
    void EditHighlightRules();

    /// The panel of the program's own log.
    LogPanel* ownLog() const { return m_ownLog; }

    /// Sets the font of all logs.
    void SetTextFont(QFont const& font);

    /// Wraps the lines of all logs or not.
    void SetLineWrap(bool wrapped);

    /// Shows the numbers of the lines in all logs or not.
    void SetLineNumbers(bool shown);

    /// Shows the bars of entries by time in all logs or not.
    void SetActivity(bool shown);

    /// Shows the time since another entry in all logs or not.
    void SetSince(bool shown);

    /// Shows gaps of at least so many milliseconds in all logs; 0: none.
    void SetLeastGap(qint64 span);

    /// Folds entries that repeat the one above in all logs or not.
    void SetFoldsRepeats(bool folds);

    /// Marks the tab of the program's log: there is a problem with it.
    void MarkOwnLog(bool marked);

    /// The content of the current tab; null if it is of the other type.
    LogPanel* currentLog() const;
    SettingsEditor* currentEditor() const;

    /// The file that a tab shows.
    static QString PathOf(QWidget const* page);

    /// Whether a file looks like a settings file.
    static bool IsSettingsFile(QString const& path);

Q_SIGNALS:
    /// Another tab is current, or what the current one shows has changed.
    void stateChanged();
    void messageReported(QString const& text);

    /// A settings file was saved in an editor.
    void saved(QString const& path);
    void zoomRequested(int steps);

    /// The user wants to see the time since another entry.
    void sinceRequested();

private:
    LogPanel* addLog(QString const& path);
    SettingsEditor* addEditor(QString const& path);
    QWidget* pageOf(QString const& path);
    void closeTab(int position);
    void goTo(QWidget* page);
    void updateTitles();
    void addStepAction(QString const& text, QKeySequence::StandardKey keys,
                       QKeySequence const& other, int step);
    int positionOf(QString const& path) const;
    QString ownerNoteOf(QString const& path) const;
    void addCloseButton(QWidget* page, QString const& name);

    LogMarkStore* m_marks;
    QHash<QString, QString> m_ownerNotes;
    std::shared_ptr<QStringList> m_filterHistory = std::make_shared<QStringList>();
    std::shared_ptr<HighlightRules> m_highlightRules;
    LogPanel* m_ownLog;
    QFont m_textFont;
    bool m_isWrapped = false;
    bool m_hasNumbers = false;
    bool m_showsActivity = false;
    bool m_showsSince = false;
    bool m_foldsRepeats = false;
    qint64 m_leastGap = 0; // milliseconds
};

} // namespace Velocor
