// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/window/log/LogMarkStore.h"

namespace Velocor {

/// The marks of log files, in the settings file "marks.cfg" in the data directory.
///
/// The file is read before it is written, so that several windows can share it. A malformed file is
/// never overwritten. Keys and values: docs/window.md. GUI thread.
class MarksFile : public LogMarkStore
{
public:
    /// @param dataPath  directory of the file, ending in "/"
    explicit MarksFile(QString const& dataPath);

    QVector<LogMark> Marks(QString const& path) override;
    QString SetMarks(QString const& path, QVector<LogMark> const& marks) override;

    /// For how many log files marks are kept: those whose marks were changed last.
    static constexpr int MaximumFiles = 50;

private:
    struct Log
    {
        QString path;
        QVector<LogMark> marks;
    };

    QVector<Log> read(QString& error) const;

    QString m_fileName;
};

} // namespace Velocor
