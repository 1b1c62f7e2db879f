// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QDateTime>
#include <QString>
#include <QVector>

namespace Velocor {

/// The last contents of settings files, in a folder of their own that only this user can read.
///
/// Of each file there are at most `MaximumOfFile` states, of all files `MaximumOfAll` with
/// `MaximumSize` in all; the oldest are removed. The names of the states do not tell whose they
/// are. Not for several threads at a time; several programs may use the same folder.
///
///     SavedStates states(dataPath + "settings-states/");
///     error = states.Keep(path);
class SavedStates
{
public:
    static constexpr int MaximumOfFile = 10;
    static constexpr int MaximumOfAll = 500;
    static constexpr qint64 MaximumSize = 32 << 20;    ///< of all, in bytes
    static constexpr qint64 MaximumFileSize = 1 << 20; ///< larger ones are not kept, in bytes

    struct State
    {
        QString path;
        QDateTime time; ///< when it was kept, in local time
        qint64 size = 0;
    };

    /// @param folder  ends in "/"; created when needed. Empty: nothing is kept.
    explicit SavedStates(QString const& folder = QString()) : m_folder(folder) {}

    /// Keeps what is in a file now, unless that is the newest state already, or there is no such
    /// file.
    ///
    /// @return why it could not be kept, for the user; empty on success
    QString Keep(QString const& path) const;

    /// The states of a file, newest first.
    QVector<State> Of(QString const& path) const;

    /// Removes all states of a file.
    ///
    /// @return whether none is left
    bool RemoveAll(QString const& path) const;

private:
    QVector<State> named(QString const& pattern) const;
    QString makeFolder() const;
    void removeOldest(QString const& path) const;

    QString m_folder;
};

} // namespace Velocor
