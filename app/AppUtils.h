// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

class QListWidget;
class QMenu;

/// Directory strings, and lists of recently used files.
///
/// The directory operations compute the same directories as AppPaths without publishing them.
///
/// A most-recently-used list is one string that the caller keeps in its settings: the entries,
/// newest first, joined by "|". Nothing is escaped, entries are compared exactly, and an empty
/// string reads as one empty entry. See docs/recent-files.md. GUI thread for the widgets.
///
///     AppUtils::AddToMRUList(fileName, recent, 10);
///     AppUtils::SetupMRUMenu(recentMenu, recent);
class AppUtils
{
public:
    /// The operation for UpdateMRUList(). Any other value changes nothing.
    enum MRUOpCode : int { MRUAdd = 0, MRURemove = 1 };

    /// The installation root, ending in "/".
    ///
    /// @param path  receives the directory; unchanged if it is not empty
    static void SetupRootPath(QString& path);

    /// The same operation as SetupRootPath().
    static void SetupProgramPath(QString& path);

    /// The user's data directory for this program, ending in "/".
    static void SetupDataRootPath(QString& path);

    /// The user's documents directory, ending in "/".
    static void SetupDocumentPath(QString& path);

    /// Sets the organization name and then the application name on the application object.
    static void SetOrganizationAndProduct(QString const& organization, QString const& product);

    /// Sets both names, then computes the root (unless `root` is not empty) and the data directory.
    static void SetupPaths(QString const& organization, QString const& product, QString& root,
                           QString& data);

    /// Fills a menu with one action per entry, newest first; the action's text is the entry.
    ///
    /// @return whether there were any entries; the menu is enabled or disabled accordingly
    static bool SetupMRUMenu(QMenu* menu, QString const& list);

    /// Fills a list widget with one item per entry, in the same way.
    static bool SetupMRUListWidget(QListWidget* widget, QString const& list);

    /// Moves a file to the front of a list or removes it; only its first occurrence is affected.
    ///
    /// @param file  the entry; must not be empty; may be the same object as `list`
    /// @param list  changed on success only, then truncated to the first `maxCount` entries
    /// @return false if `file` is empty, if the entry to remove is not in the list, or for any
    /// other `op`
    static bool UpdateMRUList(QString const& file, QString& list, int maxCount, MRUOpCode op);

    /// Adds a file at the front of a list. See UpdateMRUList().
    static bool AddToMRUList(QString const& file, QString& list, int maxCount);

    /// Removes a file from a list and truncates the list to 10 entries. See UpdateMRUList().
    static bool RemoveFromMRUList(QString const& file, QString& list);
};
