// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogMark.h"

#include <QString>
#include <QVector>

namespace Velocor {

/// Keeps the marks of log files between sessions.
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
};

} // namespace Velocor
