// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/RunEnds.h"
#include "app/history/RunMarkFile.h"
#include "support/TestFiles.h"

/// Makes the mark that a program leaves behind that was killed, as if that had been another
/// process.
///
///     LeftMark::make(log, HistoryTime::Now() - 60000);
namespace LeftMark {

/// @param log  path of the current file
/// @param start  of that program, see HistoryCursor::time()
/// @return the path of the mark; empty if it cannot be written
inline QString make(QString const& log, qint64 start)
{
    const QString folder = Velocor::RunEnds::MarkFolderOf(log);
    QDir().mkpath(folder);
    QFile file(folder + '/' + QString::number(start) + "-1.run");
    if (!file.open(QIODevice::WriteOnly))
        return QString();
    file.write(Velocor::RunMarkFile::TextFor(start, file.handle()));
    return file.fileName();
}

} // namespace LeftMark
