// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QList>
#include <QString>

#include <memory>

class QLockFile;

namespace Velocor {

/// The running programs that share one log, if they use this list too.
///
/// Each holds its own lock file, named after its process ID, in a folder for that log; locks of
/// programs that ended without releasing them are removed. If the folder cannot be created, no
/// other programs are found.
///
///     InstanceList instances(dataPath + "running-program.log");
///     if (!instances.Others().isEmpty())
///         report(...);
class InstanceList
{
public:
    /// Joins the list.
    ///
    /// @param folder  created if necessary; for lock files only
    explicit InstanceList(QString const& folder);

    /// Leaves the list. The last program removes the folder.
    ~InstanceList();

    InstanceList(InstanceList const&) = delete;
    InstanceList& operator=(InstanceList const&) = delete;

    /// The process IDs of the others.
    QList<qint64> Others() const;

private:
    QString m_folder;
    QString m_ownName;
    std::unique_ptr<QLockFile> m_lock;
};

} // namespace Velocor
