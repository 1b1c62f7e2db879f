// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/RunEnds.h"
#include "app/history/RunMarkFile.h"
#include "support/TestFiles.h"

#include <QCoreApplication>

/// Makes the mark that a program leaves behind that was killed, as if that had been another
/// process, and changes such marks.
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

/// As if the mark came from a backup: the file is the same, and older than its last change.
///
/// @return false if it cannot be changed; so it is with the others
inline bool restore(QString const& mark)
{
    QByteArrayList parts = TestFiles::read(mark).split(' ');
    if (parts.size() != 4)
        return false;
    parts[1] = QByteArray::number(parts[1].toLongLong() - 60000);
    return TestFiles::writeOver(mark, parts.join(' '));
}

inline bool moveToAnotherComputer(QString const& mark)
{
    return TestFiles::writeOver(mark, TestFiles::read(mark).trimmed() + "x\n");
}

/// As if this process had got the process ID of the one that made the mark.
inline bool useProcessIdAgain(QString const& mark)
{
    const QString living =
        mark.section('-', 0, -2) + QString("-%1.run").arg(QCoreApplication::applicationPid());
    return living != mark && QFile::rename(mark, living);
}

} // namespace LeftMark
