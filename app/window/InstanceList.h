// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QList>
#include <QString>

#include <memory>

class QLockFile;

/// The running programs that share one log file, as far as they have a list like this.
///
/// Each holds a lock file of its own in a folder of the system's temporary directory; the locks of
/// programs that ended without letting go are removed. Nothing beside the log is touched.
///
///     InstanceList instances(logFile);
///     if (!instances.Others().isEmpty())
///         tell(...);
class InstanceList
{
public:
    /// Joins the list.
    explicit InstanceList(QString const& logFile);

    /// Leaves it.
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
