// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/LogHistory.h"

#include <QList>
#include <QString>
#include <QStringList>
#include <QTemporaryFile>

#include <memory>

namespace Velocor {

/// A log that the command line names.
struct PrintedLog
{
    QString name;         ///< of the program or file, for users
    QString log;          ///< the current file, if all files of the log are meant
    QStringList files;    ///< otherwise exactly these, the oldest first
    bool isInput = false; ///< standard input

    /// Reads its files.
    ///
    /// @return false if one cannot be read; see LogHistory::errors()
    bool Read(LogHistory& history) const
    {
        return log.isEmpty() ? history.ReadFiles(files) : history.ReadLog(log);
    }

    /// A path in the folder of the log.
    QString const& path() const { return log.isEmpty() ? files.first() : log; }

    /// The current file of the log, even if only others are meant.
    QString CurrentPath() const;
};

/// Finds the logs that a command line names. A name that is also that of a file is the file.
class LogSources
{
public:
    /// @param names  of files and programs; "-" is standard input; none: all programs
    /// @param joinsFiles  whether several files of one log are one source
    LogSources(QStringList const& names, bool joinsFiles);

    /// Where the data folders of this user's programs are.
    static QString FamilyFolder();

    QList<PrintedLog> const& sources() const { return m_sources; }

    /// Of the names that are neither a file nor a program, for users.
    QStringList const& errors() const { return m_errors; }

private:
    void add(QString const& name);
    void addFile(QString const& path);
    void addInput();

    bool m_joinsFiles;
    QList<PrintedLog> m_sources;
    QStringList m_errors;
    std::unique_ptr<QTemporaryFile> m_input;
};

} // namespace Velocor
