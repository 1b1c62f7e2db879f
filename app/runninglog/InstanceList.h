// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QList>
#include <QString>

#include <memory>

class QLockFile;

namespace Velocor {

/// The running programs that share one log, as far as they have a list like this.
///
/// Each holds a lock file of its own, called after its process number, in a folder that stands for
/// the log; the locks of programs that ended without letting go are removed. Where the folder
/// cannot be made, nobody else is found.
///
///     InstanceList instances(dataPath + "running-program.log");
///     if (!instances.Others().isEmpty())
///         tell(...);
class InstanceList
{
public:
    /// Joins the list.
    ///
    /// @param folder  made if need be; for lock files only
    explicit InstanceList(QString const& folder);

    /// Leaves it. The last one removes the folder.
    ~InstanceList();

    InstanceList(InstanceList const&) = delete;
    InstanceList& operator=(InstanceList const&) = delete;

    /// The process numbers of the others.
    QList<qint64> Others() const;

private:
    QString m_folder;
    QString m_ownName;
    std::unique_ptr<QLockFile> m_lock;
};

} // namespace Velocor
