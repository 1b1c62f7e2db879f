// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QList>
#include <QString>

namespace Velocor {

/// One log of a program.
struct ProgramLog
{
    QString name; ///< of the program; with several logs, followed by "/" and the log's name
    QString path; ///< the current file, which need not exist if there are numbered ones
};

/// Finds the logs of a family of programs. Any thread.
class ProgramLogs
{
public:
    /// The logs of all programs, by name: files that end in ".log" in the folders "logs" of their
    /// data folders.
    ///
    /// @param folder  that of the organization, which has the data folders
    static QList<ProgramLog> In(QString const& folder);

    /// That folder, known by the data folder of the running program.
    static QString FamilyFolder();

    /// Those of one program, or one of them.
    ///
    /// @param name  as ProgramLog::name, or of a program with several logs; upper and lower case
    ///              are the same
    static QList<ProgramLog> Named(QString const& name, QList<ProgramLog> const& logs);

    /// The name for a log, which is that of its program if its folder tells, else of the file.
    static QString NameOf(QString const& path);
};

} // namespace Velocor
