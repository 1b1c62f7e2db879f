// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// SaveAtomically(): its effect in every kind of place.

#include "common/config/TorkConfigFile.h"
#include "support/ChildProcess.h"
#include "support/OpenFiles.h"
#include "support/ProcessLimits.h"
#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QtTest>

#include <atomic>
#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <thread>
#include <unistd.h>
#include <vector>

class tst_TorkConfigFileReplace : public QObject
{
    Q_OBJECT

private slots:
    void init();

    void sameBytesAsSave_data();
    void sameBytesAsSave();
    void longerFileIsReplaced();
    void lastErrorIsEmptied();
    void shortFileName();
    void nulInFileName();
    void noDescriptorIsLeft();
    void noDescriptorIsLeftWithoutInput();

    void newFileFollowsTheMask_data();
    void newFileFollowsTheMask();
    void permissionsAreKept_data();
    void permissionsAreKept();
    void ownerAndGroupAreKept();
    void lostGroupGetsNoRights();
    void ownGroupIsKept();

    void linkStays_data();
    void linkStays();
    void manyLinks_data();
    void manyLinks();
    void longLink();
    void linkToItself();
    void hardLinkKeepsTheOldFile();

    void untouched_data();
    void untouched();
    void fifoDoesNotBlock();
    void device_data();
    void device();
    void readOnlyFile();
    void readOnlyFolder();
    void newFileInReadOnlyFolder();
    void foldersWithStickyBit();
    void noRoomForTheLongerName();
    void fileSizeLimit();

    void leftoverIsRemoved_data();
    void leftoverIsRemoved();
    void folderInTheNewFilesPlace();
    void waitsForAnotherSave();
    void givesUpOnAnotherSave();
    void manySavesAtOnce();

private:
    QString path(QString const& name = "viewer.cfg") const { return m_folder->filePath(name); }

    QScopedPointer<QTemporaryDir> m_folder;
};

namespace {

const QByteArray oldBytes = "old\n";
const QByteArray newBytes = "<VelocorSettings>\n<a>\n<b>c</b>\n</a>\n</VelocorSettings>\n";

struct Saved
{
    bool result;
    QString error;
};

Saved SaveNew(QString const& path)
{
    TorkConfigFile settings(path);
    settings.WriteItem("a", "b", "c");
    settings.m_lastError = "from before";
    const bool result = settings.SaveAtomically();
    return {result, settings.m_lastError};
}

struct stat StatusOf(QString const& path)
{
    struct stat status = {};
    if (::lstat(QFile::encodeName(path), &status) != 0)
        qWarning("%s: stat failed", qPrintable(path));
    return status;
}

unsigned ModeOf(QString const& path)
{
    return StatusOf(path).st_mode & 07777U;
}

bool SetMode(QString const& path, unsigned mode)
{
    return ::chmod(QFile::encodeName(path), static_cast<mode_t>(mode)) == 0;
}

QString InPlace(QString const& path, int error)
{
    return path + " was written in place, as it cannot be replaced: " + qt_error_string(error);
}

QString Unable(QString const& path, int error)
{
    return "Unable to save " + path + ": " + qt_error_string(error);
}

} // namespace

// Other users can enter too.
void tst_TorkConfigFileReplace::init()
{
    m_folder.reset(new QTemporaryDir);
    QVERIFY2(m_folder->isValid(), qPrintable(m_folder->errorString()));
    QVERIFY(SetMode(m_folder->path(), 0755));
}

void tst_TorkConfigFileReplace::sameBytesAsSave_data()
{
    QTest::addColumn<QString>("root");
    QTest::addColumn<QString>("key");
    QTest::addColumn<QString>("value");

    QTest::newRow("plain") << "VelocorSettings"
                           << "key"
                           << "value";
    QTest::newRow("markup") << "Other"
                            << "key"
                            << "<a & b>";
    QTest::newRow("placeholders") << "Other"
                                  << "%1"
                                  << "%2 %L3";
    QTest::newRow("Latin-1 and beyond")
        << "Other" << QString::fromUtf8("ï") << QString::fromUtf8("ï €");
    QTest::newRow("long") << "Other"
                          << "key" << QString(200000, 'x');
}

void tst_TorkConfigFileReplace::sameBytesAsSave()
{
    QFETCH(QString, root);
    QFETCH(QString, key);
    QFETCH(QString, value);
    TorkConfigFile settings(path("plain.cfg"), root);
    settings.WriteItem("Section", key, value);
    settings.WriteItem("Empty", key, value);
    settings.ClearSection("Empty");
    settings.Save();
    settings.SetFileName(path());
    QVERIFY(settings.SaveAtomically());
    QCOMPARE(TestFiles::read(path()), TestFiles::read(path("plain.cfg")));
    QCOMPARE(TestFiles::listing(m_folder->path()).size(), 2);
}

void tst_TorkConfigFileReplace::longerFileIsReplaced()
{
    QVERIFY(TestFiles::write(path(), QByteArray(100000, 'x')));
    QVERIFY(SaveNew(path()).result);
    QCOMPARE(TestFiles::listing(m_folder->path()),
             QStringList("viewer.cfg: " + QString::fromLatin1(newBytes)));
}

void tst_TorkConfigFileReplace::lastErrorIsEmptied()
{
    const Saved saved = SaveNew(path());
    QVERIFY(saved.result);
    QCOMPARE(saved.error, QString());
    QVERIFY(!saved.error.isNull());
}

void tst_TorkConfigFileReplace::shortFileName()
{
    const QString folder = QDir::currentPath();
    QVERIFY(QDir::setCurrent(m_folder->path()));
    const Saved none = SaveNew("");
    const Saved one = SaveNew("a");
    const Saved two = SaveNew("ab");
    QVERIFY(QDir::setCurrent(folder));
    QVERIFY(none.result && one.result && two.result);
    QCOMPARE(none.error, QString("from before"));
    QCOMPARE(one.error, QString("from before"));
    QCOMPARE(TestFiles::listing(m_folder->path()),
             QStringList("ab: " + QString::fromLatin1(newBytes)));
}

void tst_TorkConfigFileReplace::nulInFileName()
{
    const QString name = path() + QChar(0) + "more";
    const Saved saved = SaveNew(name);
    QVERIFY(!saved.result);
    QCOMPARE(saved.error, Unable(name, EINVAL));
    QCOMPARE(TestFiles::listing(m_folder->path()), QStringList());
}

void tst_TorkConfigFileReplace::noDescriptorIsLeft()
{
    if (!QFile::exists("/proc/self/fd"))
        QSKIP("No list of open files on this system.");
    QVERIFY(SaveNew(path()).result); // what Qt opens once and keeps
    const int before = openFileCount();
    for (int i = 0; i < 3; ++i) {
        QVERIFY(SaveNew(path()).result);
        QVERIFY(!SaveNew(path("missing/viewer.cfg")).result);
        QVERIFY(!SaveNew(m_folder->path()).result);
    }
    QCOMPARE(openFileCount(), before);
}

// The first file is then 0.
void tst_TorkConfigFileReplace::noDescriptorIsLeftWithoutInput()
{
    const ChildProcess::Result child = ChildProcess::run("without input", {path()});
    QVERIFY2(child.ended(), child.report());
    QCOMPARE(child.output, QByteArray("true 0"));
}

void tst_TorkConfigFileReplace::newFileFollowsTheMask_data()
{
    QTest::addColumn<unsigned>("mask");
    QTest::addColumn<unsigned>("mode");
    QTest::newRow("usual") << 0022U << 0644U;
    QTest::newRow("private") << 0077U << 0600U;
    QTest::newRow("none") << 0000U << 0666U;
}

void tst_TorkConfigFileReplace::newFileFollowsTheMask()
{
    QFETCH(unsigned, mask);
    const mode_t before = ::umask(static_cast<mode_t>(mask));
    const Saved saved = SaveNew(path());
    ::umask(before);
    QVERIFY2(saved.result, qPrintable(saved.error));
    QTEST(ModeOf(path()), "mode");
}

void tst_TorkConfigFileReplace::permissionsAreKept_data()
{
    QTest::addColumn<unsigned>("mode");
    for (unsigned mode : {0600U, 0640U, 0644U, 0664U, 0666U, 0755U, 0777U, 0200U})
        QTest::newRow(qPrintable(QString::number(mode, 8))) << mode;
}

void tst_TorkConfigFileReplace::permissionsAreKept()
{
    QFETCH(unsigned, mode);
    QVERIFY(TestFiles::write(path(), oldBytes));
    QVERIFY(SetMode(path(), mode));
    const struct stat before = StatusOf(path());
    QVERIFY(SaveNew(path()).result);
    QCOMPARE(ModeOf(path()), mode);
    QVERIFY(StatusOf(path()).st_ino != before.st_ino); // it is another file
}

void tst_TorkConfigFileReplace::ownerAndGroupAreKept()
{
    if (geteuid() != 0)
        QSKIP("Only root can change the owner of files.");
    QVERIFY(TestFiles::write(path(), oldBytes));
    QVERIFY(SetMode(path(), 0660));
    QVERIFY(::chown(QFile::encodeName(path()), 12345, 23456) == 0);
    QVERIFY(SaveNew(path()).result);
    QCOMPARE(TestFiles::read(path()), newBytes);
    QCOMPARE(StatusOf(path()).st_uid, uid_t(12345));
    QCOMPARE(StatusOf(path()).st_gid, gid_t(23456));
    QCOMPARE(ModeOf(path()), 0660U);
}

namespace {

// Runs as the unprivileged user; prints the result and what is reported.
int savesAsOrdinaryUser(QStringList const& arguments)
{
    if (!ProcessLimits::becomeOrdinaryUser())
        return ChildProcess::skipped;
    const Saved saved = SaveNew(arguments.at(0));
    std::printf("%s", qPrintable((saved.result ? "true " : "false ") + saved.error));
    return 0;
}

// Belongs to another group, too.
int savesAsMember(QStringList const& arguments)
{
    const gid_t group = 23456;
    if (setgroups(1, &group) != 0 || setgid(65534) != 0 || setuid(65534) != 0)
        return ChildProcess::skipped;
    ProcessLimits::allowTracing();
    const Saved saved = SaveNew(arguments.at(0));
    std::printf("%s", qPrintable((saved.result ? "true " : "false ") + saved.error));
    return 0;
}

int savesWithoutInput(QStringList const& arguments)
{
    ::close(STDIN_FILENO);
    const Saved saved = SaveNew(arguments.at(0));
    const int next = ::open("/dev/null", O_RDONLY);
    std::printf("%s%d", saved.result ? "true " : "false ", next);
    return 0;
}

int savesBeyondFileSize(QStringList const& arguments)
{
    if (!ProcessLimits::limitFileSize(10))
        return ChildProcess::skipped;
    const Saved saved = SaveNew(arguments.at(0));
    std::printf("%s", qPrintable((saved.result ? "true " : "false ") + saved.error));
    return 0;
}

int saves(QStringList const& arguments)
{
    const Saved saved = SaveNew(arguments.at(0));
    std::printf("%s", qPrintable((saved.result ? "true " : "false ") + saved.error));
    return 0;
}

} // namespace

#define RUN_AS_OTHER_USER(child, name)                                                             \
    if (geteuid() != 0)                                                                            \
        QSKIP("Only root can set this up.");                                                       \
    const ChildProcess::Result child = ChildProcess::run(name, {path()});                          \
    if (child.wasSkipped())                                                                        \
        QSKIP("This process cannot become another user.");                                         \
    QVERIFY2(child.ended(), child.report())

#define RUN_AS_ORDINARY_USER(child) RUN_AS_OTHER_USER(child, "ordinary")

// The user owns file and folder, but belongs only to its own group.
void tst_TorkConfigFileReplace::lostGroupGetsNoRights()
{
    QVERIFY(TestFiles::write(path(), oldBytes));
    QVERIFY(SetMode(path(), 0674));
    if (geteuid() == 0) {
        QVERIFY(::chown(QFile::encodeName(path()), 65534, 0) == 0);
        QVERIFY(::chown(QFile::encodeName(m_folder->path()), 65534, 65534) == 0);
    }
    RUN_AS_ORDINARY_USER(child);
    QCOMPARE(child.output, QByteArray("true "));
    QCOMPARE(TestFiles::read(path()), newBytes);
    QCOMPARE(StatusOf(path()).st_gid, gid_t(65534));
    QCOMPARE(ModeOf(path()), 0644U);
}

// The user may give it to a group that is not its first one.
void tst_TorkConfigFileReplace::ownGroupIsKept()
{
    QVERIFY(TestFiles::write(path(), oldBytes));
    QVERIFY(SetMode(path(), 0660));
    if (geteuid() == 0) {
        QVERIFY(::chown(QFile::encodeName(path()), 65534, 23456) == 0);
        QVERIFY(::chown(QFile::encodeName(m_folder->path()), 65534, 65534) == 0);
    }
    RUN_AS_OTHER_USER(child, "member");
    QCOMPARE(child.output, QByteArray("true "));
    QCOMPARE(TestFiles::read(path()), newBytes);
    QCOMPARE(StatusOf(path()).st_gid, gid_t(23456));
    QCOMPARE(ModeOf(path()), 0660U);
}

void tst_TorkConfigFileReplace::linkStays_data()
{
    QTest::addColumn<QString>("target");  // of the link viewer.cfg
    QTest::addColumn<QString>("between"); // target of the link "between"; empty: there is none
    QTest::addColumn<QString>("file");    // where the settings end up
    QTest::addColumn<bool>("isThere");

    QTest::newRow("beside it") << "real.cfg"
                               << ""
                               << "real.cfg" << true;
    QTest::newRow("in another folder") << "other/real.cfg"
                                       << ""
                                       << "other/real.cfg" << true;
    QTest::newRow("absolute") << "/real.cfg"
                              << ""
                              << "real.cfg" << true;
    QTest::newRow("link to a link") << "between"
                                    << "other/real.cfg"
                                    << "other/real.cfg" << true;
    QTest::newRow("through a linked folder") << "between/../real.cfg"
                                             << "other/deep"
                                             << "other/real.cfg" << true;
    QTest::newRow("no target yet") << "other/real.cfg"
                                   << ""
                                   << "other/real.cfg" << false;
    QTest::newRow("no target yet, link to a link") << "between"
                                                   << "other/real.cfg"
                                                   << "other/real.cfg" << false;
}

void tst_TorkConfigFileReplace::linkStays()
{
    QFETCH(QString, target);
    QFETCH(QString, between);
    QFETCH(QString, file);
    QFETCH(bool, isThere);
    QVERIFY(QDir().mkpath(path("other/deep")));
    if (target.startsWith('/'))
        target.prepend(m_folder->path());
    // Qt's own function would make the target absolute.
    QVERIFY(::symlink(QFile::encodeName(target), QFile::encodeName(path())) == 0);
    if (!between.isEmpty())
        QVERIFY(::symlink(QFile::encodeName(between), QFile::encodeName(path("between"))) == 0);
    if (isThere) {
        QVERIFY(TestFiles::write(path(file), oldBytes));
        QVERIFY(SetMode(path(file), 0600));
    }

    const Saved saved = SaveNew(path());
    QVERIFY2(saved.result, qPrintable(saved.error));
    QCOMPARE(saved.error, QString());
    QVERIFY(S_ISLNK(StatusOf(path()).st_mode));
    QVERIFY(S_ISREG(StatusOf(path(file)).st_mode));
    QCOMPARE(TestFiles::read(path(file)), newBytes);
    QVERIFY(!isThere || ModeOf(path(file)) == 0600);
    QVERIFY(TestFiles::listing(m_folder->path()).filter(".saving").isEmpty());
}

// As many as the system follows.
void tst_TorkConfigFileReplace::manyLinks_data()
{
    QTest::addColumn<int>("links");
    QTest::addColumn<bool>("result");
    QTest::newRow("forty") << 40 << true;
    QTest::newRow("one more") << 41 << false;
}

void tst_TorkConfigFileReplace::manyLinks()
{
    QFETCH(int, links);
    QFETCH(bool, result);
    QVERIFY(TestFiles::write(path("0"), oldBytes));
    for (int link = 1; link <= links; ++link)
        QVERIFY(::symlink(QByteArray::number(link - 1),
                          QFile::encodeName(path(QString::number(link)))) == 0);
    const QString last = path(QString::number(links));
    const Saved saved = SaveNew(last);
    QCOMPARE(saved.result, result);
    QCOMPARE(saved.error, result ? QString() : Unable(last, ELOOP));
    QCOMPARE(TestFiles::read(path("0")), result ? newBytes : oldBytes);
}

// The longest that the system allows; there is no room for the new file's name.
void tst_TorkConfigFileReplace::longLink()
{
    const int longest = 4095;
    QByteArray target = QFile::encodeName(m_folder->path());
    while (target.size() < longest - 10)
        target += "/.";
    target += QByteArray(longest - 8 - target.size(), '/') + "real.cfg";
    QVERIFY(TestFiles::write(path("real.cfg"), oldBytes));
    QVERIFY(::symlink(target, QFile::encodeName(path())) == 0);
    const Saved saved = SaveNew(path());
    QCOMPARE(saved.error, InPlace(path(), ENAMETOOLONG));
    QVERIFY(saved.result);
    QCOMPARE(TestFiles::read(path("real.cfg")), newBytes);
}

void tst_TorkConfigFileReplace::linkToItself()
{
    QVERIFY(QFile::link(path(), path()));
    const Saved saved = SaveNew(path());
    QVERIFY(!saved.result);
    QCOMPARE(saved.error, Unable(path(), ELOOP));
    QVERIFY(S_ISLNK(StatusOf(path()).st_mode));
}

void tst_TorkConfigFileReplace::hardLinkKeepsTheOldFile()
{
    QVERIFY(TestFiles::write(path(), oldBytes));
    QVERIFY(::link(QFile::encodeName(path()), QFile::encodeName(path("second.cfg"))) == 0);
    QVERIFY(SaveNew(path()).result);
    QCOMPARE(TestFiles::read(path()), newBytes);
    QCOMPARE(TestFiles::read(path("second.cfg")), oldBytes);
}

void tst_TorkConfigFileReplace::untouched_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<int>("error");
    QTest::newRow("folder that does not exist") << "missing/viewer.cfg" << ENOENT;
    QTest::newRow("file where a folder should be") << "file/viewer.cfg" << ENOTDIR;
    QTest::newRow("folder where the file should be") << "folder" << EISDIR;
    QTest::newRow("FIFO") << "fifo" << EINVAL;
    QTest::newRow("name that is too long") << QString(300, 'x') << ENAMETOOLONG;
}

void tst_TorkConfigFileReplace::untouched()
{
    QFETCH(QString, name);
    QFETCH(int, error);
    QVERIFY(TestFiles::write(path("file"), oldBytes));
    QVERIFY(QDir().mkpath(path("folder")));
    const QStringList before = TestFiles::listing(m_folder->path());
    QVERIFY(::mkfifo(QFile::encodeName(path("fifo")), 0666) == 0);

    const Saved saved = SaveNew(path(name));
    QVERIFY(!saved.result);
    QCOMPARE(saved.error, Unable(path(name), error));
    QVERIFY(S_ISFIFO(StatusOf(path("fifo")).st_mode));
    QVERIFY(QFile::remove(path("fifo")));
    QCOMPARE(TestFiles::listing(m_folder->path()), before);
}

void tst_TorkConfigFileReplace::fifoDoesNotBlock()
{
    QVERIFY(::mkfifo(QFile::encodeName(path()), 0666) == 0);
    const ChildProcess::Result child = ChildProcess::run("save", {path()}, QString(), 20000);
    QVERIFY2(child.ended(), child.report());
    QVERIFY2(child.output.startsWith("false "), child.report());
    QVERIFY(S_ISFIFO(StatusOf(path()).st_mode));
}

void tst_TorkConfigFileReplace::device_data()
{
    QTest::addColumn<QString>("device");
    QTest::addColumn<bool>("result");
    QTest::addColumn<QString>("error");
    QTest::newRow("accepts everything") << "/dev/null" << true << InPlace("/dev/null", ENODEV);
    QTest::newRow("is always full") << "/dev/full" << false << Unable("/dev/full", ENOSPC);
}

void tst_TorkConfigFileReplace::device()
{
    QFETCH(QString, device);
    if (!QFile::exists(device))
        QSKIP("This system has no such device.");
    const Saved saved = SaveNew(device);
    QTEST(saved.result, "result");
    QTEST(saved.error, "error");
    QVERIFY(S_ISCHR(StatusOf(device).st_mode));
    QVERIFY(!QFile::exists(device + ".saving"));
}

// What may not be written may not be replaced either.
void tst_TorkConfigFileReplace::readOnlyFile()
{
    QVERIFY(TestFiles::write(path(), oldBytes));
    QVERIFY(SetMode(path(), 0444));
    QVERIFY(SetMode(m_folder->path(), 0777));
    RUN_AS_ORDINARY_USER(child);
    QCOMPARE(QString::fromUtf8(child.output), "false " + Unable(path(), EACCES));
    QCOMPARE(TestFiles::listing(m_folder->path()), QStringList("viewer.cfg: old\n"));
}

void tst_TorkConfigFileReplace::readOnlyFolder()
{
    QVERIFY(TestFiles::write(path(), QByteArray(1000, 'x')));
    QVERIFY(SetMode(path(), 0666));
    const struct stat before = StatusOf(path());
    RUN_AS_ORDINARY_USER(child);
    QCOMPARE(QString::fromUtf8(child.output), "true " + InPlace(path(), EACCES));
    QCOMPARE(TestFiles::listing(m_folder->path()),
             QStringList("viewer.cfg: " + QString::fromLatin1(newBytes)));
    QCOMPARE(StatusOf(path()).st_ino, before.st_ino);
}

void tst_TorkConfigFileReplace::newFileInReadOnlyFolder()
{
    RUN_AS_ORDINARY_USER(child);
    QCOMPARE(QString::fromUtf8(child.output), "false " + Unable(path(), EACCES));
    QCOMPARE(TestFiles::listing(m_folder->path()), QStringList());
}

// As in the system's temporary folder: everybody may create files, only the owner may replace them.
void tst_TorkConfigFileReplace::foldersWithStickyBit()
{
    QVERIFY(TestFiles::write(path(), oldBytes));
    QVERIFY(SetMode(path(), 0666));
    QVERIFY(SetMode(m_folder->path(), 01777));
    RUN_AS_ORDINARY_USER(child);
    QCOMPARE(QString::fromUtf8(child.output), "true " + InPlace(path(), EPERM));
    QCOMPARE(TestFiles::listing(m_folder->path()),
             QStringList("viewer.cfg: " + QString::fromLatin1(newBytes)));
}

void tst_TorkConfigFileReplace::noRoomForTheLongerName()
{
    const QString name(250, 'x');
    QVERIFY(TestFiles::write(path(name), oldBytes));
    const Saved saved = SaveNew(path(name));
    QVERIFY(saved.result);
    QCOMPARE(saved.error, InPlace(path(name), ENAMETOOLONG));
    QCOMPARE(TestFiles::read(path(name)), newBytes);
}

void tst_TorkConfigFileReplace::fileSizeLimit()
{
    QVERIFY(TestFiles::write(path(), oldBytes));
    const ChildProcess::Result child = ChildProcess::run("limited", {path()});
    if (child.wasSkipped())
        QSKIP("The size of files cannot be limited here.");
    QVERIFY2(child.ended(), child.report());
    QCOMPARE(QString::fromUtf8(child.output), "false " + Unable(path(), EFBIG));
    QCOMPARE(TestFiles::listing(m_folder->path()), QStringList("viewer.cfg: old\n"));
}

void tst_TorkConfigFileReplace::leftoverIsRemoved_data()
{
    QTest::addColumn<QString>("kind");
    QTest::newRow("of a killed save") << "file";
    QTest::newRow("that may not be written") << "read-only file";
    QTest::newRow("link, whose target stays") << "link";
    QTest::newRow("link without a target") << "dangling link";
    QTest::newRow("FIFO") << "fifo";
}

void tst_TorkConfigFileReplace::leftoverIsRemoved()
{
    QFETCH(QString, kind);
    const QString leftover = path() + ".saving";
    QVERIFY(TestFiles::write(path(), oldBytes));
    QVERIFY(TestFiles::write(path("target"), "target\n"));
    if (kind == "fifo")
        QVERIFY(::mkfifo(QFile::encodeName(leftover), 0666) == 0);
    else if (kind.endsWith("link"))
        QVERIFY(QFile::link(path(kind == "link" ? "target" : "missing"), leftover));
    else
        QVERIFY(TestFiles::write(leftover, QByteArray(5000, 'p')));
    if (kind == "read-only file")
        QVERIFY(SetMode(leftover, 0444));

    const Saved saved = SaveNew(path());
    QVERIFY2(saved.result, qPrintable(saved.error));
    QCOMPARE(saved.error, QString());
    QCOMPARE(TestFiles::listing(m_folder->path()),
             QStringList({"target: target\n", "viewer.cfg: " + QString::fromLatin1(newBytes)}));
}

void tst_TorkConfigFileReplace::folderInTheNewFilesPlace()
{
    QVERIFY(TestFiles::write(path(), oldBytes));
    QVERIFY(QDir().mkpath(path() + ".saving"));
    const Saved saved = SaveNew(path());
    QVERIFY2(saved.result, qPrintable(saved.error));
    QVERIFY(saved.error.startsWith(path() + " was written in place"));
    QCOMPARE(TestFiles::read(path()), newBytes);
}

namespace {

// A save that is in progress while this object lives, or until it is told to end.
class OtherSave
{
public:
    explicit OtherSave(QString const& path)
        : m_path(QFile::encodeName(path)),
          m_descriptor(::open(m_path + ".saving", O_WRONLY | O_CREAT, 0600))
    {
        isUnderWay = m_descriptor != -1 && ::flock(m_descriptor, LOCK_EX) == 0 &&
                     ::write(m_descriptor, "half", 4) == 4;
    }
    ~OtherSave() { ::close(m_descriptor); }
    Q_DISABLE_COPY(OtherSave)

    void end() const
    {
        if (::rename(m_path + ".saving", m_path) == 0)
            ::flock(m_descriptor, LOCK_UN);
    }

    bool isUnderWay = false;

private:
    QByteArray m_path;
    int m_descriptor;
};

} // namespace

void tst_TorkConfigFileReplace::waitsForAnotherSave()
{
    QVERIFY(TestFiles::write(path(), oldBytes));
    const OtherSave other(path());
    QVERIFY(other.isUnderWay);
    std::thread ending([&other] {
        QTest::qSleep(100);
        other.end();
    });
    const Saved saved = SaveNew(path());
    ending.join();
    QVERIFY2(saved.result, qPrintable(saved.error));
    QCOMPARE(TestFiles::listing(m_folder->path()),
             QStringList("viewer.cfg: " + QString::fromLatin1(newBytes)));
}

void tst_TorkConfigFileReplace::givesUpOnAnotherSave()
{
    QVERIFY(TestFiles::write(path(), oldBytes));
    const OtherSave other(path());
    QVERIFY(other.isUnderWay);
    const Saved saved = SaveNew(path());
    QVERIFY(!saved.result);
    QCOMPARE(saved.error, Unable(path(), EAGAIN));
    QCOMPARE(TestFiles::listing(m_folder->path()),
             QStringList({"viewer.cfg: old\n", "viewer.cfg.saving: half"}));
}

// A concurrent reader finds a complete file, and no save removes another's file.
void tst_TorkConfigFileReplace::manySavesAtOnce()
{
    QVERIFY(SaveNew(path()).result);
    std::atomic<int> saved(0);
    std::atomic<int> refused(0);
    std::vector<std::thread> threads;
    for (int i = 0; i < 4; ++i) {
        threads.emplace_back([this, i, &saved, &refused] {
            TorkConfigFile settings(path());
            for (int save = 0; save < 50; ++save) {
                settings.WriteItem("a", "b", QString(i * 1000 + save, QChar('a' + i)));
                const bool isOver = settings.SaveAtomically();
                ++(isOver ? saved : refused);
            }
        });
    }
    bool isWhole = true;
    while (saved + refused < 200)
        isWhole = isWhole && TestFiles::read(path()).endsWith("</VelocorSettings>\n");
    for (std::thread& thread : threads)
        thread.join();

    QVERIFY(isWhole);
    QVERIFY2(saved > 0, qPrintable(QString::number(refused))); // only the slowest may be refused
    QCOMPARE(TestFiles::listing(m_folder->path()).size(), 1);
}

int main(int argc, char** argv)
{
    return ChildProcess::main<tst_TorkConfigFileReplace>(argc, argv,
                                                         {{"ordinary", savesAsOrdinaryUser},
                                                          {"member", savesAsMember},
                                                          {"without input", savesWithoutInput},
                                                          {"limited", savesBeyondFileSize},
                                                          {"save", saves}});
}

#include "tst_TorkConfigFileReplace.moc"
