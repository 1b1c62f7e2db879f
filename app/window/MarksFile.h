// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/window/log/LogMarkStore.h"

#include <QHash>

namespace Velocor {

/// The marks of log files, in the settings file "marks.cfg" in the data directory.
///
/// The file is read before it is written, so that several programs can share it, and marks that
/// another one has added to the same log meanwhile are kept. A malformed file is never overwritten.
/// Keys and values: docs/window.md. GUI thread.
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
    QVector<LogMark> withOthers(QString const& path, QVector<LogMark> const& marks,
                                QVector<Log> const& logs) const;

    QString m_fileName;
    QHash<QString, QVector<LogMark>> m_known; // of a log: what the caller has got or set last
};

} // namespace Velocor
