// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogFileList.h"
#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QtTest>

using namespace Velocor;

class tst_LogFileList : public QObject
{
    Q_OBJECT

private slots:
    void logFileList();
};

void tst_LogFileList::logFileList()
{
    const QTemporaryDir folder;
    const QString log = folder.filePath("a[1] b.log");
    for (char const* end : {"", ".1", ".2", ".10", ".x", ".01", ".bak.3"})
        QVERIFY(TestFiles::write(log + end, "x"));
    const QStringList all{log, log + ".1", log + ".2", log + ".10"};
    QCOMPARE(LogFileList::FilesOf(log), all);
    QCOMPARE(LogFileList::FilesOf(log + ".2"), all);
    QCOMPARE(LogFileList::FilesOf(folder.filePath("none.log")),
             QStringList(folder.filePath("none.log")));
    QCOMPARE(LogFileList::CurrentOf(log + ".10"), log);
    QCOMPARE(LogFileList::CurrentOf(log), log);
}

QTEST_GUILESS_MAIN(tst_LogFileList)
#include "tst_LogFileList.moc"
