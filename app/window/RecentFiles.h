// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QObject>
#include <QString>

class QMenu;

namespace Velocor {

/// The list of recently opened files and the menu that offers them, newest first.
///
///     RecentFiles recent(menu);
///     recent.SetList(settings.Text("recentFiles"));
///     connect(&recent, &RecentFiles::fileChosen, this, &MainWindow::OpenFile);
class RecentFiles : public QObject
{
    Q_OBJECT

public:
    /// @param menu  refilled whenever the list changes; not owned
    explicit RecentFiles(QMenu* menu, QObject* parent = nullptr);

    /// Sets a list that list() returned; see AppUtils for the format. Keeps the first
    /// `MaximumFiles` entries that are neither empty nor longer than `MaximumPathLength`.
    void SetList(QString const& list);
    QString const& list() const { return m_list; }

    /// Adds a file at the front. A path that contains "|" or is longer than `MaximumPathLength` is
    /// ignored.
    void Add(QString const& path);

    /// Whether the path is one of the files.
    bool Contains(QString const& path) const;
    void Remove(QString const& path);
    void Clear();

    /// The maximum number of files in the list.
    static constexpr int MaximumFiles = 10;

    /// The maximum length of a path, in characters.
    static constexpr int MaximumPathLength = 4096;

Q_SIGNALS:
    /// A file was chosen in the menu.
    void fileChosen(QString const& path);

private:
    void fillMenu();

    QMenu* m_menu;
    QString m_list;
};

} // namespace Velocor
