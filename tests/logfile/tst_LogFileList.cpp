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
    for (char const* end : {"", ".0", ".1", ".2", ".10", ".x", ".01", ".-1", ".bak.3"})
        QVERIFY(TestFiles::write(log + end, "x"));
    const QStringList all{log, log + ".0", log + ".1", log + ".2", log + ".10"};
    QCOMPARE(LogFileList::FilesOf(log), all);
    QCOMPARE(LogFileList::FilesOf(log + ".2"), all);
    QCOMPARE(LogFileList::FilesOf(folder.filePath("none.log")),
             QStringList(folder.filePath("none.log")));
    QVERIFY(QDir().mkpath(log + ".3"));
    QVERIFY(TestFiles::write(folder.filePath("b.log.4"), "x"));
    QCOMPARE(LogFileList::FilesOf(log), all); // neither a folder nor files of another log

    // The current file is listed only if it exists or was asked for.
    const QString other = folder.filePath("b.log");
    QCOMPARE(LogFileList::FilesOf(other + ".4"), QStringList(other + ".4"));
    QCOMPARE(LogFileList::FilesOf(other), QStringList({other, other + ".4"}));
    QCOMPARE(LogFileList::FilesOf(other + ".5"), QStringList({other + ".5", other + ".4"}));
    const QString hidden = folder.filePath(".c.log");
    QVERIFY(TestFiles::write(hidden + ".1", "x"));
    QCOMPARE(LogFileList::FilesOf(hidden), QStringList({hidden, hidden + ".1"}));

    QCOMPARE(LogFileList::CurrentOf(log + ".0"), log);
    QCOMPARE(LogFileList::CurrentOf(folder.filePath("7")), folder.filePath("7"));
    QCOMPARE(LogFileList::CurrentOf(log + ".10"), log);
    QCOMPARE(LogFileList::CurrentOf(log), log);
}

QTEST_GUILESS_MAIN(tst_LogFileList)
#include "tst_LogFileList.moc"
