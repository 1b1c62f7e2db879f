// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QObject>
#include <QString>
#include <QStringList>

class QMenu;
class QMimeData;
class QWidget;

namespace Velocor {

class FileTabs;
class RecentFiles;
class WindowSettings;

/// Opens files in tabs: those that the user chooses or drops, those of the command line, and those
/// of the previous session. Remembers them among the recent ones.
class FileOpener : public QObject
{
    Q_OBJECT

public:
    /// @param tabs  show the files; not owned
    /// @param window  the parent of dialogs
    FileOpener(FileTabs* tabs, QWidget* window);

    /// Offers the recent files in a menu. To be called once, before anything else.
    void FillRecentMenu(QMenu* menu);

    /// Restores the list of recent files.
    void RestoreRecent(WindowSettings& settings);

    /// Opens the files that were open when Save() was called and still exist.
    void Reopen(WindowSettings& settings);

    /// Stores the recent files, the open files and which of them is current.
    void Save(WindowSettings& settings) const;

    /// Asks for a file, and opens it.
    void Choose();

    /// Opens a file. If it does not exist, offers to remove it from the recent files.
    void Open(QString const& path);

    /// Opens files; a notice names those that cannot be opened.
    ///
    /// @param files  absolute paths, of which the first `MaximumFiles` are opened; "-" is standard
    ///               input
    void OpenAll(QStringList const& files);

    /// Whether Drop() would open anything.
    static bool CanDrop(QMimeData const* data);

    /// Opens the first local files that were dropped.
    void Drop(QMimeData const* data);

    /// The maximum number of files that OpenAll() and Reopen() open.
    static constexpr int MaximumFiles = 50;

Q_SIGNALS:
    /// For the status bar.
    void messageReported(QString const& text);

    /// For a notice that stays until it is dismissed.
    void problemReported(QString const& text);

private:
    QStringList openFiles() const;
    QString open(QString const& path);
    QString openInput(int descriptor);
    void offerToForget(QString const& path);

    FileTabs* m_tabs;
    QWidget* m_window;
    RecentFiles* m_recent = nullptr;
};

} // namespace Velocor
