// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/window/log/LogMarkStore.h"

#include <QHash>

namespace Velocor {

/// The marks and encodings of log files, in the settings file "marks.cfg" in the data directory.
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
    LogEncoding Encoding(QString const& path) override;
    QString SetEncoding(QString const& path, LogEncoding encoding) override;

    /// How many log files are kept: those whose marks or encodings were changed last.
    static constexpr int MaximumFiles = 50;

private:
    struct Log
    {
        QString path;
        QVector<LogMark> marks;
        LogEncoding encoding = LogEncoding::Automatic;
    };

    QVector<Log> read(QString& error) const;
    Log find(QString const& path) const;
    QString replace(Log const& log) const;
    QVector<LogMark> withOthers(QString const& path, QVector<LogMark> const& marks,
                                QVector<LogMark> const& inFile) const;

    QString m_fileName;
    QHash<QString, QVector<LogMark>> m_known; // of a log: what the caller has got or set last
};

} // namespace Velocor
