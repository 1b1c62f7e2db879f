// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogEncoding.h"
#include "app/logfile/LogMark.h"

#include <QString>
#include <QVector>

namespace Velocor {

/// Keeps the marks of log files, and the encodings chosen for them, between sessions.
class LogMarkStore
{
public:
    virtual ~LogMarkStore() = default;

    /// The marks of a log file, none of them found yet.
    virtual QVector<LogMark> Marks(QString const& path) = 0;

    /// Replaces the marks of a log file.
    ///
    /// @return the reason for a failure; empty on success
    virtual QString SetMarks(QString const& path, QVector<LogMark> const& marks) = 0;

    /// The encoding chosen for a log file; Automatic if none was.
    virtual LogEncoding Encoding(QString const& path) = 0;

    /// Replaces the encoding chosen for a log file.
    ///
    /// @return the reason for a failure; empty on success
    virtual QString SetEncoding(QString const& path, LogEncoding encoding) = 0;
};

} // namespace Velocor
