// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "support/TestFiles.h"

#include <QtTest>

#include <sys/stat.h>
#include <unistd.h>

/// What several tests of log files have in common.
namespace LogFileTest {

/// Builds what TestFiles::listing() would return.
inline void populate(QString const& folder, QStringList const& entries)
{
    for (QString const& entry : entries) {
        const int colon = entry.indexOf(": ");
        if (colon == -1)
            QVERIFY2(QDir().mkpath(folder + entry), qPrintable(entry));
        else
            QVERIFY2(TestFiles::write(folder + entry.left(colon), entry.mid(colon + 2).toLatin1()),
                     qPrintable(entry));
    }
}

/// The reason as Qt itself reports it.
inline QString reasonNotToOpen(QString const& path)
{
    QFile file(path);
    const bool opened = file.open(QIODevice::ReadWrite | QIODevice::Text);
    return opened ? QString() : file.errorString();
}

/// Creates the entry "name |" (a pipe), "name -> target", or whatever populate() accepts.
inline void make(QString const& folder, QString const& entry)
{
    const QString path = folder + entry.section(' ', 0, 0);
    if (entry.endsWith(" |"))
        QVERIFY2(mkfifo(QFile::encodeName(path).constData(), 0600) == 0, qPrintable(entry));
    else if (entry.contains(" -> "))
        QVERIFY2(QFile::link(entry.section(" -> ", 1), path), qPrintable(entry));
    else
        populate(folder, {entry});
}

inline QStringList namesIn(QString const& folder)
{
    return QDir(folder).entryList(
        QDir::AllEntries | QDir::Hidden | QDir::System | QDir::NoDotAndDotDot, QDir::Name);
}

const int linesEach = 1000;

inline QString lineOf(char writer, int number)
{
    return QString("%1 %2 %3\n").arg(QChar(writer)).arg(number).arg(QString(number % 90, writer));
}

} // namespace LogFileTest
