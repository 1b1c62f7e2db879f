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
///     connect(&recent, &RecentFiles::fileChosen, this, &MainWindow::openFile);
class RecentFiles : public QObject
{
    Q_OBJECT

public:
    /// @param menu  filled anew whenever the list changes; not owned
    explicit RecentFiles(QMenu* menu, QObject* parent = nullptr);

    /// Takes over a list as list() gave it. See AppUtils for its form. Of a list from elsewhere,
    /// the first `MostFiles` entries are kept that are neither empty nor longer than `LongestPath`.
    void SetList(QString const& list);
    QString const& list() const { return m_list; }

    /// Puts a file at the front. A path with "|" in it, or one longer than
    /// `LongestPath`, cannot be kept and is passed over.
    void Add(QString const& path);

    /// Whether the path is one of the files.
    bool Contains(QString const& path) const;
    void Remove(QString const& path);
    void Clear();

    /// The most files that are remembered.
    static constexpr int MostFiles = 10;

    /// The longest path that is remembered, in characters.
    static constexpr int LongestPath = 4096;

Q_SIGNALS:
    /// A file was chosen in the menu.
    void fileChosen(QString const& path);

private:
    void fillMenu();

    QMenu* m_menu;
    QString m_list;
};

} // namespace Velocor
