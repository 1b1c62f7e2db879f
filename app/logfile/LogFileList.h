// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>
#include <QStringList>

namespace Velocor {

/// Finds the numbered, rotated files of a log file.
class LogFileList
{
public:
    /// A log file and its older files, newest first: "app.log", "app.log.1", and so on.
    ///
    /// @param path  the log file or one of its older files; included even if it does not exist
    static QStringList FilesOf(QString const& path);

    /// The path without the number of an older file.
    static QString CurrentOf(QString const& path);
};

} // namespace Velocor
