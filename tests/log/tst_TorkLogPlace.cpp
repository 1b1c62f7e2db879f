// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/log/TorkLogPlace_p.h"
#include "log/LockHolder.h"
#include "support/ForkedChild.h"
#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QtTest>

#include <fcntl.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

// The system calls of the log, one by one; a file that is not open stands for a call that fails.
class tst_TorkLogPlace : public QObject
{
    Q_OBJECT

private slots:
    void mayBeLog_data();
    void mayBeLog();
    void regular_data();
    void regular();
    void appending();
    void appendingWithoutOtherFlags();
    void appendingOfAClosedFile();
    void sizePositionAndEnd();
    void writesTheBytes();
    void closedFileHasNoSizeAndTakesNothing();
    void othersSeeTheLockOnTheWholeFile();
    void othersKeepUsOut();
    void withoutLocksNobodyIsKeptOut();
};

namespace {

// What another process finds when it asks for a lock on the first byte.
short lockSeenByOther(QString const& name)
{
    const pid_t child = fork();
    if (child == 0) {
        const int file = ::open(QFile::encodeName(name).constData(), O_RDWR);
        struct flock wanted = {};
        wanted.l_type = F_RDLCK;
        wanted.l_len = 1;
        const bool asked = ::fcntl(file, F_GETLK, &wanted) == 0;
        endForkedChild(asked ? wanted.l_type : 99);
    }
    int status = 0;
    waitpid(child, &status, 0);
    return static_cast<short>(WEXITSTATUS(status));
}

} // namespace

void tst_TorkLogPlace::mayBeLog_data()
{
    QTest::addColumn<QString>("kind");
    QTest::addColumn<bool>("byName");
    QTest::addColumn<bool>("byFile");

    QTest::newRow("file") << "file" << true << true;
    QTest::newRow("missing") << "missing" << true << true;
    QTest::newRow("directory") << "directory" << true << true;
    QTest::newRow("pipe") << "pipe" << false << false;
}

void tst_TorkLogPlace::mayBeLog()
{
    QFETCH(QString, kind);
    QTemporaryDir folder;
    const QString name = folder.filePath(kind);
    if (kind == "file")
        QVERIFY(TestFiles::write(name, "x"));
    if (kind == "directory")
        QVERIFY(QDir().mkdir(name));
    if (kind == "pipe")
        QCOMPARE(mkfifo(QFile::encodeName(name).constData(), 0600), 0);

    QTEST(TorkLogPlace::MayBeLog(name), "byName");
    const int descriptor =
        ::open(QFile::encodeName(name).constData(), O_RDONLY | O_NONBLOCK | O_CLOEXEC);
    QFile file;
    if (descriptor >= 0)
        QVERIFY(file.open(descriptor, QIODevice::ReadOnly, QFileDevice::AutoCloseHandle));
    QTEST(TorkLogPlace::MayBeLog(file), "byFile");
}

void tst_TorkLogPlace::regular_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<bool>("isRegular");

    QTest::newRow("file") << QCoreApplication::applicationFilePath() << true;
    QTest::newRow("device") << "/dev/null" << false;
    QTest::newRow("not open") << QString() << false;
}

void tst_TorkLogPlace::regular()
{
    QFETCH(QString, name);
    QFile file(name);
    if (!name.isEmpty())
        QVERIFY(file.open(QIODevice::ReadOnly));
    QTEST(TorkLogPlace::IsRegular(file), "isRegular");
}

void tst_TorkLogPlace::appending()
{
    QTemporaryDir folder;
    QFile file(folder.filePath("file"));
    QVERIFY(file.open(QIODevice::ReadWrite));
    const int before = ::fcntl(file.handle(), F_GETFL);
    QVERIFY(!(before & O_APPEND));

    TorkLogPlace::SetAppending(file, true);
    QCOMPARE(::fcntl(file.handle(), F_GETFL), before | O_APPEND);
    TorkLogPlace::SetAppending(file, true);
    QCOMPARE(::fcntl(file.handle(), F_GETFL), before | O_APPEND);
    TorkLogPlace::SetAppending(file, false);
    QCOMPARE(::fcntl(file.handle(), F_GETFL), before);
}

void tst_TorkLogPlace::appendingWithoutOtherFlags()
{
    int ends[2];
    QCOMPARE(pipe(ends), 0);
    QFile file;
    QVERIFY(file.open(ends[0], QIODevice::ReadOnly, QFileDevice::AutoCloseHandle));
    QCOMPARE(::fcntl(ends[0], F_GETFL), 0);
    TorkLogPlace::SetAppending(file, true);
    QCOMPARE(::fcntl(ends[0], F_GETFL), O_APPEND);
    ::close(ends[1]);
}

void tst_TorkLogPlace::appendingOfAClosedFile()
{
    QFile closed("nowhere");
    TorkLogPlace::SetAppending(closed, true);
    QVERIFY(!closed.isOpen());
}

void tst_TorkLogPlace::sizePositionAndEnd()
{
    QTemporaryDir folder;
    const QString name = folder.filePath("file");
    QVERIFY(TestFiles::write(name, "12345"));
    QFile file(name);
    QVERIFY(file.open(QIODevice::ReadWrite | QIODevice::Unbuffered));
    QCOMPARE(TorkLogPlace::Size(file), qint64(5));
    QCOMPARE(TorkLogPlace::Position(file), qint64(0));
    QVERIFY(!TorkLogPlace::IsAtEnd(file));

    QCOMPARE(::lseek(file.handle(), 4, SEEK_SET), off_t(4));
    QCOMPARE(TorkLogPlace::Position(file), qint64(4));
    QVERIFY(!TorkLogPlace::IsAtEnd(file));

    QCOMPARE(::lseek(file.handle(), 5, SEEK_SET), off_t(5));
    QCOMPARE(TorkLogPlace::Position(file), qint64(5));
    QVERIFY(TorkLogPlace::IsAtEnd(file));
}

void tst_TorkLogPlace::writesTheBytes()
{
    QTemporaryDir folder;
    const QString name = folder.filePath("file");
    QFile file(name);
    QVERIFY(file.open(QIODevice::ReadWrite));
    QCOMPARE(TorkLogPlace::Write(file, "12345", 3), 3);
    QCOMPARE(TorkLogPlace::Write(file, "", 0), 0);
    QCOMPARE(TorkLogPlace::Size(file), qint64(3));
    QFile written(name);
    QVERIFY(written.open(QIODevice::ReadOnly));
    QCOMPARE(written.readAll(), QByteArray("123"));
}

void tst_TorkLogPlace::closedFileHasNoSizeAndTakesNothing()
{
    QFile closed("nowhere");
    QCOMPARE(TorkLogPlace::Size(closed), qint64(0));
    QCOMPARE(TorkLogPlace::Position(closed), qint64(-1));
    QVERIFY(!TorkLogPlace::IsAtEnd(closed));
    QCOMPARE(TorkLogPlace::Write(closed, "12345", 3), 0);
}

// From the first byte on, wherever the next one is written.
void tst_TorkLogPlace::othersSeeTheLockOnTheWholeFile()
{
    QTemporaryDir folder;
    const QString name = folder.filePath("file");
    QVERIFY(TestFiles::write(name, "12345"));
    QFile file(name);
    QVERIFY(file.open(QIODevice::ReadWrite));
    QCOMPARE(::lseek(file.handle(), 3, SEEK_SET), off_t(3));

    QCOMPARE(lockSeenByOther(name), short(F_UNLCK));
    QVERIFY(TorkLogPlace::KeepOthersOut(file));
    QCOMPARE(lockSeenByOther(name), short(F_WRLCK));
    TorkLogPlace::LetOthersIn(file);
    QCOMPARE(lockSeenByOther(name), short(F_UNLCK));
}

void tst_TorkLogPlace::othersKeepUsOut()
{
    QTemporaryDir folder;
    const QString name = folder.filePath("file");
    QVERIFY(TestFiles::write(name, "12345"));
    QFile file(name);
    QVERIFY(file.open(QIODevice::ReadWrite));
    {
        const LockHolder other(name);
        QVERIFY(other.holds());
        QVERIFY(!TorkLogPlace::KeepOthersOut(file));
    }
    QVERIFY(TorkLogPlace::KeepOthersOut(file));
}

// Not every file system has locks; there, each program writes as if it were alone.
void tst_TorkLogPlace::withoutLocksNobodyIsKeptOut()
{
    QFile closed("nowhere");
    QVERIFY(TorkLogPlace::KeepOthersOut(closed));
}

QTEST_GUILESS_MAIN(tst_TorkLogPlace)

#include "tst_TorkLogPlace.moc"
