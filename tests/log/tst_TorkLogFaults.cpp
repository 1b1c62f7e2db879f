// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/log/TorkLog.h"
#include "log/LogFileTest.h"
#include "log/LogFolder.h"
#include "support/ChildProcess.h"
#include "support/MessageCapture.h"
#include "support/ProcessLimits.h"
#include "support/TestFiles.h"

#include <QtTest>

#include <cstdio>
#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

using namespace LogFileTest;

class tst_TorkLogFaults : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void cleanup();

    void notAFile_data();
    void notAFile();
    void nullDevice();

    void fileInPlaceOfDirectory();
    void directoryInPlaceOfFile();
    void directoryRemovedWhileOpen();
    void triesAgainAfterFailure();
    void withoutPermission_data();
    void withoutPermission();
    void diskFull_data();
    void diskFull();
    void fullFileSystem();

private:
    QString m_workingDirectory;
};

void tst_TorkLogFaults::init()
{
    m_workingDirectory = QDir::currentPath();
}

void tst_TorkLogFaults::cleanup()
{
    QDir::setCurrent(m_workingDirectory);
}

namespace {

// More than a pipe holds; then a regular file replaces it.
int writesToNoFile(QStringList const& arguments)
{
    TorkLog log(arguments.at(0));
    log.setEnable(true);
    for (int i = 0; i < linesEach; ++i)
        log.write(lineOf('x', 89));
    std::printf("%s\n", qPrintable(log.errorString()));
    QFile::remove(arguments.at(0) + ".log");
    log.write(QStringLiteral("kept\n"));
    return 0;
}

} // namespace

// None of these may block an entry, and the next entry tries again.
void tst_TorkLogFaults::notAFile_data()
{
    QTest::addColumn<QStringList>("entries");

    QTest::newRow("pipe") << QStringList(".log |");
    QTest::newRow("link to a pipe") << QStringList({"pipe |", ".log -> pipe"});
    QTest::newRow("socket") << QStringList(".log =");
}

void tst_TorkLogFaults::notAFile()
{
    QFETCH(QStringList, entries);
    LogFolder folder;
    for (QString const& entry : entries) {
        if (entry.endsWith(" =")) {
            sockaddr_un address = {};
            address.sun_family = AF_UNIX;
            std::snprintf(address.sun_path, sizeof address.sun_path, "%s",
                          qPrintable(folder.logs() + ".log"));
            const int socket = ::socket(AF_UNIX, SOCK_STREAM, 0);
            QCOMPARE(::bind(socket, reinterpret_cast<sockaddr*>(&address), sizeof address), 0);
            ::close(socket);
        } else {
            make(folder.logs(), entry);
        }
    }

    const ChildProcess::Result child =
        ChildProcess::run("no file", {folder.logs()}, QString(), 10000);
    QVERIFY2(child.ended(), child.report());
    QCOMPARE(child.output, QByteArray("Not a regular file\n"));
    QCOMPARE(TestFiles::read(folder.logs() + ".log"), QByteArray("kept\n"));
}

void tst_TorkLogFaults::nullDevice()
{
    LogFolder folder;
    make(folder.logs(), "app.log -> /dev/null");
    TorkLog log;
    folder.prepare(log, "app", 10);
    for (int i = 0; i < 3; ++i) {
        log.write(QStringLiteral("beyond the limit\n"));
        QVERIFY(i == 1 || log.close());
    }
    QCOMPARE(log.errorString(), QString());
    QCOMPARE(QFileInfo(folder.logs() + "app.log").symLinkTarget(), QString("/dev/null"));
    QCOMPARE(namesIn(folder.logs()), QStringList("app.log"));
}

void tst_TorkLogFaults::fileInPlaceOfDirectory()
{
    LogFolder folder;
    populate(folder.root(), {"file: x"});
    TorkLog log;
    folder.prepare(log, "app");
    log.setOutputPath(folder.root() + "file/");

    MessageCapture messages;
    log.write(QStringLiteral("lost\n"));
    QCOMPARE(log.errorString(), reasonNotToOpen(folder.root() + "file/app.log"));
    QCOMPARE(TestFiles::read(folder.root() + "file"), QByteArray("x"));
    QCOMPARE(messages.texts(), QStringList());
}

void tst_TorkLogFaults::directoryInPlaceOfFile()
{
    LogFolder folder;
    populate(folder.logs(), {"app.log/", "app.log/x: y"});
    TorkLog log;
    folder.prepare(log, "app");

    log.write(QStringLiteral("lost\n"));
    QVERIFY(!log.errorString().isEmpty());
    QCOMPARE(log.errorString(), reasonNotToOpen(folder.logs() + "app.log"));
    QCOMPARE(folder.listing(), QStringList({"app.log/", "app.log/x: y"}));
}

void tst_TorkLogFaults::directoryRemovedWhileOpen()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");
    log.write(QStringLiteral("1\n"));

    // The open file remains without a name.
    QVERIFY(QDir(folder.logs()).removeRecursively());
    log.write(QStringLiteral("2\n"));
    QCOMPARE(log.errorString(), QString());
    QVERIFY(!QFile::exists(folder.logs()));

    // Reopening creates the file again.
    QVERIFY(log.close());
    log.write(QStringLiteral("3\n"));
    QCOMPARE(folder.listing(), QStringList("app.log: 3\n"));
}

void tst_TorkLogFaults::triesAgainAfterFailure()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");
    const QString path = folder.root() + "later";
    log.setOutputPath(path);
    log.write(QStringLiteral("lost\n"));
    QVERIFY(!log.errorString().isEmpty());

    QVERIFY(QDir().mkpath(path));
    log.write(QStringLiteral("kept\n"));
    QCOMPARE(TestFiles::listing(path), QStringList("app.log: kept\n"));
}

namespace {

const QFileDevice::Permissions readOnly = QFileDevice::ReadOwner | QFileDevice::ExeOwner;
const QFileDevice::Permissions writable = readOnly | QFileDevice::WriteOwner;

// Writes while the permissions are missing and once more when they are restored; prints the reason
// of the failure and the contents of the directory each time.
int writesWithoutPermission(QStringList const& arguments)
{
    if (!ProcessLimits::becomeOrdinaryUser())
        return ChildProcess::skipped;

    LogFolder folder;
    populate(folder.logs(), arguments.mid(1));
    const QString protectedPath = folder.logs() + arguments.at(0);
    TorkLog log;
    folder.prepare(log, "app", 9);
    log.setLogPipeToConsole(true);
    QFile::setPermissions(protectedPath, readOnly);

    log.write(QStringLiteral("one\n"));
    std::printf("%s\n%s\n", qPrintable(log.errorString()), qPrintable(folder.listing().join('|')));

    QFile::setPermissions(protectedPath, writable);
    log.write(QStringLiteral("two\n"));
    std::printf("%s\n", qPrintable(folder.listing().join('|')));
    return 0;
}

} // namespace

void tst_TorkLogFaults::withoutPermission_data()
{
    QTest::addColumn<QString>("protectedName");
    QTest::addColumn<QStringList>("before");
    QTest::addColumn<QByteArray>("output");
    QTest::addColumn<QByteArray>("echo");

    QTest::newRow("directory") << "" << QStringList()
                               << QByteArray("Permission denied\n\napp.log: two\n\n")
                               << QByteArray("\"two\\n\"\n");
    QTest::newRow("file") << "app.log" << QStringList("app.log: 1234\n")
                          << QByteArray("Permission denied\napp.log: 1234\n\napp.log: two\n\n\n")
                          << QByteArray("\"two\\n\"\n");
    // Nothing can be moved out of the way, so the old content is overwritten.
    QTest::newRow("directory with a full file")
        << "" << QStringList({"app.log: 12345678\n", "app.log.1: a"})
        << QByteArray("\napp.log: one\n5678\n|app.log.1: a\n"
                      "app.log: 5678two\n|app.log.1: a\n")
        << QByteArray("\"one\\n\"\n\"two\\n\"\n");
}

void tst_TorkLogFaults::withoutPermission()
{
    QFETCH(QString, protectedName);
    QFETCH(QStringList, before);
    const ChildProcess::Result child =
        ChildProcess::run("without permission", QStringList(protectedName) + before);
    if (child.wasSkipped())
        QSKIP("This process cannot become an ordinary user.");

    QVERIFY2(child.ended(), child.report());
    QTEST(child.output, "output");
    QTEST(child.errors, "echo");
}

namespace {

const int lineCount = 100;

QString longLine(int number)
{
    return QString("line %1 %2\n").arg(number).arg(QString(90, 'x'));
}

QByteArray allLines()
{
    QByteArray lines;
    for (int i = 0; i < lineCount; ++i)
        lines += longLine(i).toLatin1();
    return lines;
}

// Writes more than fits, then makes room and writes once more.
int writesToFullDisk(QStringList const& arguments)
{
    if (!ProcessLimits::limitFileSize(4096))
        return ChildProcess::skipped;

    TorkLog log(arguments.at(0));
    log.setEnable(true);
    for (int i = 0; i < lineCount; ++i)
        log.write(longLine(i));
    std::printf("%lld", static_cast<long long>(QFile(arguments.at(0) + ".log").size()));

    if (arguments.at(1) == "then room" && !ProcessLimits::unlimitFileSize())
        return ChildProcess::skipped;
    log.write(QStringLiteral("last\n"));
    return 0;
}

} // namespace

void tst_TorkLogFaults::diskFull_data()
{
    QTest::addColumn<QString>("then");
    QTest::addColumn<QByteArray>("expected");

    QTest::newRow("permanently") << "permanently" << allLines().left(4096);
    QTest::newRow("until there is room again") << "then room" << allLines() + "last\n";
}

void tst_TorkLogFaults::diskFull()
{
    QFETCH(QString, then);
    LogFolder folder;
    const ChildProcess::Result child = ChildProcess::run("disk full", {folder.logs(), then});
    if (child.wasSkipped())
        QSKIP("The size of files cannot be limited here.");

    QVERIFY2(child.ended(), child.report());
    QCOMPARE(child.output, QByteArray("4096"));
    QCOMPARE(child.errors, QByteArray());
    QTEST(TestFiles::read(folder.logs() + ".log"), "expected");
}

void tst_TorkLogFaults::fullFileSystem()
{
    LogFolder folder;
    if (QProcess::execute("mount", {"-t", "tmpfs", "-o", "size=64k", "tmpfs", folder.logs()}) != 0)
        QSKIP("No file system can be mounted here.");
    struct Unmount
    {
        QString path;
        ~Unmount() { QProcess::execute("umount", {path}); }
    } unmount{folder.logs()};

    TorkLog log;
    folder.prepare(log, "app");
    log.write(QStringLiteral("before\n"));

    QFile filler(folder.logs() + "filler");
    QVERIFY(filler.open(QIODevice::WriteOnly | QIODevice::Unbuffered));
    while (filler.write(QByteArray(4096, 'f')) == 4096) {}
    QByteArray expected = "before\n";
    for (int i = 0; i < lineCount; ++i) {
        log.write(longLine(i));
        expected += longLine(i).toLatin1();
    }
    const QByteArray whileFull = TestFiles::read(folder.logs() + "app.log");
    QCOMPARE(whileFull, expected.left(4096));

    QVERIFY(filler.remove());
    log.write(QStringLiteral("after\n"));
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"), expected + "after\n");
    QVERIFY(log.close());
}

int main(int argc, char** argv)
{
    return ChildProcess::main<tst_TorkLogFaults>(argc, argv,
                                                 {{"without permission", writesWithoutPermission},
                                                  {"disk full", writesToFullDisk},
                                                  {"no file", writesToNoFile}});
}

#include "tst_TorkLogFaults.moc"
