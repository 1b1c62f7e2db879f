// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QString>
#include <QStringList>

namespace Velocor {

/// The mark of a program that runs, or did not get to remove it.
///
/// The program holds a lock on the file, which the system releases however the program ends. So it
/// does not matter which process has its process ID meanwhile. A mark that was copied or came back
/// with a backup tells nothing: it names another file, or the file has changed later than it says.
/// Any thread.
class RunMarkFile
{
public:
    enum State {
        Held,       ///< the program is running
        LeftBehind, ///< it ended without a goodbye
        Doubtful,   ///< a copy, or of another computer, whose locks may not be seen here
        Damaged     ///< incomplete; for a moment, each mark is
    };

    /// Reads a mark. Another process may change it at any time.
    explicit RunMarkFile(QString const& path);

    State state() const { return m_state; }

    /// The time before the first entry of the run, see HistoryCursor::time(); -1 if damaged.
    qint64 start() const { return m_start; }

    /// Whether the file was changed within a minute.
    bool isNew() const { return m_isNew; }

    /// The marks in a folder.
    static QStringList NamesIn(QString const& folder);

    /// The name for the mark of this process, which no other process has, not even one with the
    /// same process ID.
    static QString NameFor(qint64 start);

    /// What the mark of this process says. It has to be written at once.
    ///
    /// @param file  the descriptor of the mark
    static QByteArray TextFor(qint64 start, int file);

private:
    void read(int file);

    State m_state = Damaged;
    qint64 m_start = -1;
    bool m_isNew = false;
};

} // namespace Velocor
