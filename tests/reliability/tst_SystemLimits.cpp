// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Faults that the system itself produces: a full disk, a folder that accepts no new files, no
// descriptor left, a folder that is gone.

#include "common/config/TorkConfigFile.h"
#include "common/log/TorkLog.h"
#include "log/LogFolder.h"
#include "reliability/Figures.h"
#include "support/ChildProcess.h"
#include "support/ProcessLimits.h"
#include "support/SmallDisk.h"

#include <QtTest>

#include <fcntl.h>
#include <sys/resource.h>
#include <unistd.h>

class tst_SystemLimits : public QObject
{
    Q_OBJECT

private slots:
    void fullDisk();
    void readOnlyFolder();
    void tooManyOpenFiles();
    void folderRemoved();
    void cleanupTestCase();

private:
    QStringList m_shown;
};

namespace {

void write(TorkLog& log, QByteArray const& line)
{
    log.write(QString::fromLatin1(line));
}

} // namespace

// A rotation loses what was to become number 1, a save is cut, and both continue when there is
// room.
void tst_SystemLimits::fullDisk()
{
    LogFolder folder;
    const SmallDisk disk(folder.logs());
    if (!disk.isMounted)
        QSKIP("No file system can be mounted here.");
    TorkLog log;
    folder.prepare(log, "app", 100);
    TestFiles::write(folder.logs() + "app.log", QByteArray(8192, 'c'));
    TestFiles::write(folder.logs() + "app.log.1", "older\n");
    const QString viewer = folder.logs() + "viewer.cfg";
    TorkConfigFile configuration(viewer);
    configuration.WriteItem("a", "b", QString(8192, 'v'));
    QVERIFY(configuration.Save());
    const QByteArray whole = TestFiles::read(viewer);

    QVERIFY(disk.fill());
    QVERIFY(!configuration.SaveAtomically());
    QCOMPARE(configuration.m_lastError, "Unable to save " + viewer + ": No space left on device");
    QCOMPARE(TestFiles::read(viewer), whole);
    QVERIFY(!QFile::exists(viewer + ".saving"));
    configuration.m_lastError.clear();
    write(log, "entry\n");
    QVERIFY(configuration.Save());
    QVERIFY(whole.startsWith(TestFiles::read(viewer)));
    QCOMPARE(configuration.m_lastError, QString());
    QCOMPARE(TestFiles::read(folder.logs() + "app.log.2"), QByteArray("older\n"));

    QVERIFY(disk.makeRoom());
    write(log, "after\n");
    QVERIFY(configuration.SaveAtomically());
    QCOMPARE(configuration.m_lastError, QString());
    QCOMPARE(TestFiles::read(viewer), whole);
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"), QByteArray("entry\nafter\n"));
    QCOMPARE(TestFiles::read(folder.logs() + "app.log.2"), QByteArray("older\n"));
    QVERIFY(log.close());
    m_shown.append("a full disk");
}

namespace {

// Rotates in a folder that accepts no new files, where the log itself may be written.
int rotatesInReadOnlyFolder(QStringList const& arguments)
{
    QString const& logs = arguments.at(0);
    if (!ProcessLimits::becomeOrdinaryUser())
        return ChildProcess::skipped;

    TorkLog log(logs);
    log.setEnable(true);
    log.setMaxLogFileSize(0);
    write(log, "entry\n");
    std::printf("%s\n", qPrintable(log.errorString()));
    TorkConfigFile configuration(logs + "viewer.cfg");
    configuration.Save();
    std::printf("%s\n", qPrintable(configuration.m_lastError.section(':', 0, 0)));
    return 0;
}

} // namespace

void tst_SystemLimits::readOnlyFolder()
{
    LogFolder folder;
    const QString logs = folder.logs();
    const QString temporary = folder.root() + "temporary/";
    const QByteArray full(4000, 'c');
    TestFiles::write(logs + ".log", full);
    TestFiles::write(logs + ".log.1", "older\n");
    QVERIFY(QDir().mkpath(temporary));
    QVERIFY(QFile::setPermissions(logs + ".log", QFile::Permissions(0x6666)));
    QVERIFY(QFile::setPermissions(temporary, QFile::Permissions(0x7777)));
    QVERIFY(QFile::setPermissions(folder.root(), QFile::Permissions(0x7755)));
    QVERIFY(QFile::setPermissions(logs, QFile::Permissions(0x5555)));

    qputenv("TMPDIR", QFile::encodeName(temporary));
    const ChildProcess::Result child = ChildProcess::run("read-only", {logs});
    qunsetenv("TMPDIR");
    QVERIFY(QFile::setPermissions(logs, QFile::Permissions(0x7755)));
    if (child.wasSkipped())
        QSKIP("This process cannot become another user.");
    QVERIFY2(child.ended(), child.report());
    QCOMPARE(child.output, QByteArray("\nUnable to open file\n"));
    QCOMPARE(TestFiles::listing(temporary), QStringList());
    QCOMPARE(folder.listing(),
             QStringList({".log: entry\n" + QString::fromLatin1(full.mid(6)), ".log.1: older\n"}));
    m_shown.append("a read-only folder");
}

namespace {

// Allows no more open files than there are now, or restores the limit.
bool allowMoreFiles(bool allow)
{
#ifdef NEEDS_DESCRIPTORS
    return false;
#endif
    static rlimit usual = {};
    if (!allow && getrlimit(RLIMIT_NOFILE, &usual) != 0)
        return false;
    rlimit limit = usual;
    if (!allow) {
        const int next = ::open("/dev/null", O_RDONLY);
        ::close(next);
        limit.rlim_cur = static_cast<rlim_t>(next);
    }
    return setrlimit(RLIMIT_NOFILE, &limit) == 0;
}

int writesWithoutDescriptors(QStringList const& arguments)
{
    QString const& root = arguments.at(0);
    TorkLog isOpen(root + "open/");
    isOpen.setEnable(true);
    write(isOpen, "before\n");
    TorkLog isNot(root + "closed/");
    isNot.setEnable(true);
    TorkConfigFile configuration(root + "viewer.cfg");
    configuration.WriteItem("a", "b", "c");
    configuration.Save();

    if (!allowMoreFiles(false))
        return ChildProcess::skipped;
    write(isOpen, "meanwhile\n");
    write(isNot, "meanwhile\n");
    std::printf("%s\n", qPrintable(isNot.errorString()));
    configuration.Save();
    std::printf("%s\n", qPrintable(configuration.m_lastError.section(':', 0, 0)));
    const bool replaced = configuration.SaveAtomically();
    std::printf("%s%s\n", replaced ? "replaced" : "not replaced",
                qPrintable(configuration.m_lastError.section(':', -1)));
    configuration.Load();
    std::printf("%s\n", qPrintable(configuration.m_lastError));

    if (!allowMoreFiles(true))
        return ChildProcess::skipped;
    write(isOpen, "after\n");
    write(isNot, "after\n");
    const bool loaded = configuration.Load();
    std::printf("%s\n", loaded && configuration.HasSection("a") ? "loaded" : "not loaded");
    return 0;
}

} // namespace

void tst_SystemLimits::tooManyOpenFiles()
{
    LogFolder folder;
    const ChildProcess::Result child = ChildProcess::run("descriptors", {folder.root()});
    if (child.wasSkipped())
        QSKIP("The number of open files cannot be limited here.");
    QVERIFY2(child.ended(), child.report());
    QCOMPARE(child.output, QByteArray("Too many open files\nUnable to open file\n"
                                      "not replaced Too many open files\n"
                                      "ConfigFile - Could not parse the input file.\nloaded\n"));
    QCOMPARE(TestFiles::read(folder.root() + "open/.log"),
             QByteArray("before\nmeanwhile\nafter\n"));
    QCOMPARE(TestFiles::read(folder.root() + "closed/.log"), QByteArray("after\n"));
    m_shown.append("too many open files");
}

// What goes to the open file is lost with it; the next opening creates the folder again.
void tst_SystemLimits::folderRemoved()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");
    TorkConfigFile configuration(folder.logs() + "viewer.cfg");
    write(log, "before\n");
    QVERIFY(QDir(folder.logs()).removeRecursively());

    write(log, "meanwhile\n");
    QVERIFY(configuration.Save());
    QCOMPARE(configuration.m_lastError, "Unable to open file: " + folder.logs() + "viewer.cfg");
    QVERIFY(log.close());
    QVERIFY(!QFile::exists(folder.logs()));

    write(log, "after\n");
    QVERIFY(configuration.Save());
    QCOMPARE(folder.listing(), QStringList({"app.log: after\n", "viewer.cfg: <VelocorSettings>\n"
                                                                "</VelocorSettings>\n"}));
    m_shown.append("a folder that is removed");
}

void tst_SystemLimits::cleanupTestCase()
{
    if (!m_shown.isEmpty())
        Figures::print("faults of the system: logging and saving outlived " + m_shown.join(", "));
}

int main(int argc, char** argv)
{
    return ChildProcess::main<tst_SystemLimits>(
        argc, argv,
        {{"read-only", rotatesInReadOnlyFolder}, {"descriptors", writesWithoutDescriptors}});
}

#include "tst_SystemLimits.moc"
