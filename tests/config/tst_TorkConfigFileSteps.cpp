// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// SaveAtomically(), call by call: what the failure of one means, and what another program may do
// between two of them.

#include "common/config/TorkConfigFile.h"
#include "reliability/FaultyFiles.h"
#include "support/OpenFiles.h"
#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QtTest>

#include <cerrno>
#include <fcntl.h>
#include <functional>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

class tst_TorkConfigFileSteps : public QObject
{
    Q_OBJECT

private slots:
    void init();

    void failingCall_data();
    void failingCall();
    void failingCallInPlace_data();
    void failingCallInPlace();
    void fullDiskInPlace();
    void otherProgram_data();
    void otherProgram();
    void privateUntilComplete_data();
    void privateUntilComplete();
    void isLockedWhileItIsWritten_data();
    void isLockedWhileItIsWritten();
    void currentFolderIsSynced();

private:
    QString path(QString const& name = "viewer.cfg") const { return m_folder->filePath(name); }

    QScopedPointer<QTemporaryDir> m_folder;
};

namespace {

const QByteArray oldBytes = "old, and longer than what is saved, so that some of it could remain\n";
const QByteArray newBytes = "<VelocorSettings>\n<a>\n<b>c</b>\n</a>\n</VelocorSettings>\n";

// Without the folder's name, which is another each time.
QString saved(QString const& path)
{
    TorkConfigFile settings(path);
    settings.WriteItem("a", "b", "c");
    const bool result = settings.SaveAtomically();
    return (result ? "true " : "false ") + settings.m_lastError.replace(path, "FILE");
}

QString inPlace(int error)
{
    return "true FILE was written in place, as it cannot be replaced: " + qt_error_string(error);
}

QString unable(int error)
{
    return "false Unable to save FILE: " + qt_error_string(error);
}

const QString replaced = "true ";

// Locks the file of a save that is in progress; returns its descriptor.
int beginOtherSave(QByteArray const& path)
{
    const int file = ::open(path, O_WRONLY | O_CREAT, 0600);
    const bool isBegun = ::flock(file, LOCK_EX | LOCK_NB) == 0 && ::write(file, "half", 4) == 4;
    if (!isBegun)
        qWarning("%s: %s", path.constData(), qPrintable(qt_error_string(errno)));
    return file;
}

} // namespace

void tst_TorkConfigFileSteps::init()
{
    m_folder.reset(new QTemporaryDir);
    QVERIFY2(m_folder->isValid(), qPrintable(m_folder->errorString()));
}

void tst_TorkConfigFileSteps::failingCall_data()
{
    QTest::addColumn<QByteArray>("call");
    QTest::addColumn<int>("step");
    QTest::addColumn<bool>("lasts");
    QTest::addColumn<int>("error");
    QTest::addColumn<bool>("leftover"); // of a save that was killed
    QTest::addColumn<QString>("outcome");

    const auto row = [](char const* name, QByteArray const& call, int step, int error,
                        QString const& outcome, bool leftover = false) {
        QTest::newRow(name) << call << step << false << error << leftover << outcome;
    };
    const auto lasting = [](char const* name, QByteArray const& call, int error,
                            QString const& outcome) {
        QTest::newRow(name) << call << 1 << true << error << false << outcome;
    };
    row("link cannot be read", "readlink", 1, EIO, unable(EIO));
    row("old file's status is unknown", "stat", 1, EIO, unable(EIO));
    row("old file does not open", "open", 1, EIO, unable(EIO));
    row("old file's opening is interrupted", "open", 1, EINTR, replaced);
    row("new file is not created", "open", 2, EIO, unable(EIO));
    row("folder is not writable", "open", 2, EACCES, inPlace(EACCES));
    row("file system is read-only", "open", 2, EROFS, inPlace(EROFS));
    row("folder has its name", "open", 2, EISDIR, inPlace(EISDIR));
    row("new file cannot be locked now", "flock", 1, EWOULDBLOCK, replaced);
    lasting("new file can never be locked", "flock", EWOULDBLOCK, unable(EAGAIN));
    lasting("file system without locks", "flock", ENOLCK, replaced);
    row("new file's status is unknown", "stat", 2, EIO, replaced);
    row("its name's status is unknown", "stat", 3, EIO, replaced);
    row("disk is full", "write", 1, ENOSPC, unable(ENOSPC));
    row("writing is interrupted", "write", 1, EINTR, replaced);
    row("disk fails", "fsync", 1, EIO, unable(EIO));
    row("syncing is interrupted", "fsync", 1, EINTR, replaced);
    row("file system does not sync", "fsync", 1, EINVAL, replaced);
    row("file system does not support syncing", "fsync", 1, ENOTSUP, replaced);
    row("new file's rights are unknown", "stat", 4, EIO, unable(EIO));
    row("rights cannot be given", "fchmod", 1, EIO, unable(EIO));
    row("name is not given", "rename", 1, EIO, unable(EIO));
    row("file is a mount point", "rename", 1, EBUSY, inPlace(EBUSY));
    row("file is on another file system", "rename", 1, EXDEV, inPlace(EXDEV));
    row("folder is sticky", "rename", 1, EPERM, inPlace(EPERM));
    row("folder does not open", "open", 3, EIO, replaced);
    row("folder is not synced", "fsync", 2, EIO, replaced);

    row("leftover's status is unknown", "stat", 2, EIO, unable(EIO), true);
    row("leftover does not open", "open", 3, EIO, unable(EIO), true);
    row("leftover cannot be locked now", "flock", 1, EWOULDBLOCK, replaced, true);
    row("leftover's locking is interrupted", "flock", 1, EINTR, replaced, true);
    row("leftover's name is unknown", "stat", 4, EIO, replaced, true);
    row("leftover stays", "unlink", 1, EIO, unable(EIO), true);
    row("leftover may not be removed", "unlink", 1, EPERM, inPlace(EPERM), true);
}

void tst_TorkConfigFileSteps::failingCall()
{
    QFETCH(QByteArray, call);
    QFETCH(int, step);
    QFETCH(bool, lasts);
    QFETCH(int, error);
    QFETCH(bool, leftover);
    QFETCH(QString, outcome);
    QVERIFY(TestFiles::write(path(), oldBytes));
    if (leftover)
        QVERIFY(TestFiles::write(path() + ".saving", "leftover"));
    const int before = openFileCount();

    FaultyFiles files(m_folder->path());
    files.failAt(step, lasts ? FaultyFiles::FromThereOn : FaultyFiles::Once, error, call);
    const QString result = saved(path());
    files.mend();

    QVERIFY(files.reached());
    QCOMPARE(result, outcome);
    QCOMPARE(TestFiles::read(path()), outcome.startsWith("true") ? newBytes : oldBytes);
    QCOMPARE(openFileCount(), before);
    QVERIFY(leftover || !QFile::exists(path() + ".saving") || call == "flock");
}

// In place because the name with ".saving" is too long.
void tst_TorkConfigFileSteps::failingCallInPlace_data()
{
    QTest::addColumn<QByteArray>("call");
    QTest::addColumn<int>("error");
    QTest::addColumn<QString>("outcome");

    const auto row = [](char const* name, QByteArray const& call, int error,
                        QString const& outcome) {
        QTest::newRow(name) << call << error << outcome;
    };
    row("old text stays", "ftruncate", EIO, unable(EIO));
    row("cutting is interrupted", "ftruncate", EINTR, inPlace(ENAMETOOLONG));
    row("cannot be cut, as a device", "ftruncate", EINVAL, inPlace(ENAMETOOLONG));
    row("writing is interrupted", "write", EINTR, inPlace(ENAMETOOLONG));
    row("disk fails", "fsync", EIO, unable(EIO));
}

void tst_TorkConfigFileSteps::failingCallInPlace()
{
    QFETCH(QByteArray, call);
    QFETCH(int, error);
    QFETCH(QString, outcome);
    const QString name = path(QString(250, 'x'));
    QVERIFY(TestFiles::write(name, oldBytes));

    FaultyFiles files(m_folder->path());
    files.failAt(1, FaultyFiles::Once, error, call);
    const QString result = saved(name);
    files.mend();

    QVERIFY(files.reached());
    QCOMPARE(result, outcome);
    const QByteArray left = TestFiles::read(name);
    if (call == "ftruncate" && error == EINVAL)
        QCOMPARE(left, newBytes + oldBytes.mid(newBytes.size()));
    else
        QCOMPARE(left, call == "ftruncate" && error == EIO ? oldBytes : newBytes);
}

void tst_TorkConfigFileSteps::fullDiskInPlace()
{
    const QString name = path(QString(250, 'x'));
    QVERIFY(TestFiles::write(name, oldBytes));

    FaultyFiles files(m_folder->path());
    files.limitBytes(0);
    const QString result = saved(name);
    files.mend();

    QCOMPARE(result, unable(ENOSPC));
    QCOMPARE(TestFiles::read(name), QByteArray());
}

void tst_TorkConfigFileSteps::otherProgram_data()
{
    QTest::addColumn<bool>("leftover"); // of a save that was killed
    QTest::addColumn<QByteArray>("call");
    QTest::addColumn<int>("step");
    QTest::addColumn<bool>("begins"); // a save of its own; otherwise it only removes the file
    QTest::addColumn<QString>("outcome");
    QTest::addColumn<int>("failing"); // the status that cannot be asked for; 0: none

    const auto row = [](char const* name, bool leftover, QByteArray const& call, int step,
                        bool begins, QString const& outcome, int failing = 0) {
        QTest::newRow(name) << leftover << call << step << begins << outcome << failing;
    };
    row("takes the new file for a leftover", false, "flock", 1, false, replaced);
    row("puts its own in the new file's place", false, "flock", 1, true, unable(EAGAIN));
    row("puts its own there, status unknown", false, "flock", 1, true, unable(EAGAIN), 2);
    row("removes the leftover before it is found", true, "stat", 2, false, replaced);
    row("removes the leftover before it is open", true, "open", 3, false, replaced);
    row("removes the leftover before it is locked", true, "flock", 1, false, replaced);
    row("removes the leftover first", true, "unlink", 1, false, replaced);
    row("puts its own in the leftover's place", true, "flock", 1, true, unable(EAGAIN));
}

void tst_TorkConfigFileSteps::otherProgram()
{
    QFETCH(bool, leftover);
    QFETCH(QByteArray, call);
    QFETCH(int, step);
    QFETCH(bool, begins);
    QFETCH(QString, outcome);
    QFETCH(int, failing);
    const QByteArray saving = QFile::encodeName(path() + ".saving");
    QVERIFY(TestFiles::write(path(), oldBytes));
    if (leftover)
        QVERIFY(TestFiles::write(path() + ".saving", "leftover"));
    const int before = openFileCount();

    bool hasActed = false;
    int other = -1;
    FaultyFiles files(m_folder->path());
    files.before(call, step, [&] {
        hasActed = true;
        ::unlink(saving);
        if (begins)
            other = beginOtherSave(saving);
    });
    if (failing)
        files.failAt(failing, FaultyFiles::Once, EIO, "stat");
    const QString result = saved(path());
    files.mend();

    QVERIFY(hasActed);
    QVERIFY(!begins || other != -1);
    QVERIFY(failing == 0 || files.reached());
    QCOMPARE(result, outcome);
    QCOMPARE(TestFiles::read(path()), begins ? oldBytes : newBytes);
    QCOMPARE(TestFiles::listing(m_folder->path()).filter(".saving"),
             begins ? QStringList("viewer.cfg.saving: half") : QStringList());
    ::close(other);
    QCOMPARE(openFileCount(), before);
}

// Until it has the old file's rights; there may be passwords in it.
void tst_TorkConfigFileSteps::privateUntilComplete_data()
{
    QTest::addColumn<bool>("isThere");
    QTest::addColumn<unsigned>("mode");
    QTest::newRow("replaced") << true << 0600U;
    QTest::newRow("new") << false << 0644U;
}

void tst_TorkConfigFileSteps::privateUntilComplete()
{
    QFETCH(bool, isThere);
    QFETCH(unsigned, mode);
    if (isThere)
        QVERIFY(TestFiles::write(path(), oldBytes));

    const mode_t before = ::umask(0022);
    struct stat status = {};
    FaultyFiles files(m_folder->path());
    files.before("write", 1, [&] { ::stat(QFile::encodeName(path() + ".saving"), &status); });
    const QString result = saved(path());
    ::umask(before);

    QCOMPARE(result, replaced);
    QCOMPARE(status.st_mode & 07777U, mode);
}

void tst_TorkConfigFileSteps::isLockedWhileItIsWritten_data()
{
    QTest::addColumn<int>("error");
    QTest::newRow("at once") << 0;
    QTest::newRow("after an interruption") << EINTR;
}

void tst_TorkConfigFileSteps::isLockedWhileItIsWritten()
{
    QFETCH(int, error);
    int lockError = 0;
    FaultyFiles files(m_folder->path());
    files.before("write", 1, [&] {
        const int other = ::open(QFile::encodeName(path() + ".saving"), O_RDONLY);
        lockError = ::flock(other, LOCK_EX | LOCK_NB) == 0 ? 0 : errno;
        ::close(other);
    });
    if (error)
        files.failAt(1, FaultyFiles::Once, error, "flock");
    const QString result = saved(path());

    QCOMPARE(files.reached(), error != 0);
    QCOMPARE(result, replaced);
    QCOMPARE(lockError, EWOULDBLOCK);
}

// The file's name is relative, so the folder has none.
void tst_TorkConfigFileSteps::currentFolderIsSynced()
{
    const QString before = QDir::currentPath();
    QVERIFY(QDir::setCurrent(m_folder->path()));
    FaultyFiles files(".");
    files.failAt(1, FaultyFiles::Once, EIO, "fsync");
    const QString result = saved("viewer.cfg");
    files.mend();
    QVERIFY(QDir::setCurrent(before));

    QCOMPARE(result, replaced);
    QVERIFY(files.reached());
    QCOMPARE(files.path(), QString("."));
}

QTEST_GUILESS_MAIN(tst_TorkConfigFileSteps)

#include "tst_TorkConfigFileSteps.moc"
