// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Rotation, call by call: what the failure of one means, and what is on the disk when.

#include "common/log/TorkLog.h"
#include "log/LogFileTest.h"
#include "log/LogFolder.h"
#include "reliability/FaultyFiles.h"
#include "support/ChildProcess.h"
#include "support/OpenFiles.h"
#include "support/TestFiles.h"

#include <QtTest>

#include <cerrno>
#include <fcntl.h>
#include <unistd.h>

class tst_TorkLogRotationSteps : public QObject
{
    Q_OBJECT

private slots:
    void folderThatCannotBeListed_data();
    void folderThatCannotBeListed();
    void fullFileAppearsMeanwhile();
    void copyThatFails_data();
    void copyThatFails();
    void copyIsWrittenBeforeItIsSynced();
    void copyIsOnTheDisk_data();
    void copyIsOnTheDisk();
    void noFileIsLeftOpen_data();
    void noFileIsLeftOpen();
};

namespace {

void makeFiles(LogFolder const& folder, QStringList const& files)
{
    for (QString const& file : files)
        LogFileTest::make(folder.logs(), file);
}

} // namespace

// The older files are then found by name, from number 1 up to the first that is missing.
void tst_TorkLogRotationSteps::folderThatCannotBeListed_data()
{
    QTest::addColumn<QString>("limit");
    QTest::addColumn<QStringList>("before");
    QTest::addColumn<QStringList>("after");

    const auto row = [](char const* name, QString const& limit, QStringList const& before,
                        QStringList const& after) {
        QTest::newRow(name) << limit << before << after;
    };
    row("none", "3", {"app.log: c"}, {"app.log.1: c"});
    row("one", "3", {"app.log: c", "app.log.1: a"}, {"app.log.1: c", "app.log.2: a"});
    row("two", "3", {"app.log: c", "app.log.1: a", "app.log.2: b"},
        {"app.log.1: c", "app.log.2: a", "app.log.3: b"});
    row("one too many", "2", {"app.log: c", "app.log.1: a", "app.log.2: b"},
        {"app.log.1: c", "app.log.2: a"});
    row("one behind a gap stays", "3", {"app.log: c", "app.log.1: a", "app.log.3: d"},
        {"app.log.1: c", "app.log.2: a", "app.log.3: d"});
    row("number 0 stays", "3", {"app.log: c", "app.log.0: z", "app.log.1: a"},
        {"app.log.0: z", "app.log.1: c", "app.log.2: a"});
}

void tst_TorkLogRotationSteps::folderThatCannotBeListed()
{
    QFETCH(QString, limit);
    QFETCH(QStringList, before);
    LogFolder folder;
    makeFiles(folder, before);
    TorkLog log;
    log.setOutputPath(folder.logs());
    folder.configure(log, {{"filePrefix", "app"}, {"maxLogFiles", limit}});

    FaultyFiles files(folder.root());
    files.failAt(1, FaultyFiles::FromThereOn, EMFILE, "opendir");
    log.deleteOldFiles();
    files.mend();
    QVERIFY(files.reached());
    QTEST(folder.listing(), "after");
}

// Another program makes the folder and fills a log before this one does.
void tst_TorkLogRotationSteps::fullFileAppearsMeanwhile()
{
    LogFolder folder;
    const QString logs = folder.root() + "new/";
    TorkLog log;
    folder.prepare(log, "app", 10);
    log.setOutputPath(logs);

    FaultyFiles files(folder.root());
    files.before("mkdir", 1, [&] { TestFiles::write(logs + "app.log", "of the other one\n"); });
    log.write(QStringLiteral("entry\n"));
    QCOMPARE(TestFiles::listing(logs),
             QStringList({"app.log: entry\n", "app.log.1: of the other one\n"}));
}

// The current file is gone all the same, but nothing that is not whole gets its number.
void tst_TorkLogRotationSteps::copyThatFails_data()
{
    QTest::addColumn<QByteArray>("call");
    QTest::addColumn<int>("size");
    QTest::addColumn<bool>("isKept");

    QTest::newRow("a short one is not written") << QByteArray("write") << 100 << false;
    QTest::newRow("a long one is not written") << QByteArray("write") << 200000 << false;
    QTest::newRow("it is not read") << QByteArray("read") << 100 << false;
    QTest::newRow("the disk does not sync") << QByteArray("fsync") << 100 << true;
}

void tst_TorkLogRotationSteps::copyThatFails()
{
    QFETCH(QByteArray, call);
    QFETCH(int, size);
    QFETCH(bool, isKept);
    LogFolder folder;
    const QByteArray text(size, 'x');
    QVERIFY(TestFiles::write(folder.logs() + "app.log", text));
    TorkLog log;
    folder.prepare(log, "app");

    FaultyFiles files(folder.root());
    files.failAt(1, FaultyFiles::Once, EIO, call);
    log.deleteOldFiles();
    files.mend();
    QVERIFY(files.reached());
    QCOMPARE(folder.listing(),
             isKept ? QStringList("app.log.1: " + QString::fromLatin1(text)) : QStringList());
}

// A call that is interrupted is made again, so nothing fails here.
void tst_TorkLogRotationSteps::copyIsWrittenBeforeItIsSynced()
{
    LogFolder folder;
    QVERIFY(TestFiles::write(folder.logs() + "app.log", "text"));
    TorkLog log;
    folder.prepare(log, "app");

    bool isWritten = false;
    FaultyFiles files(folder.root());
    files.failAt(1, FaultyFiles::Once, EINTR, "write");
    files.before("fsync", 1, [&] { isWritten = files.reached(); });
    log.deleteOldFiles();
    files.mend();
    QVERIFY(isWritten);
    QCOMPARE(folder.listing(), QStringList("app.log.1: text"));
}

// Before it gets its name, and the name before the current file is removed: a power failure in
// between loses nothing.
void tst_TorkLogRotationSteps::copyIsOnTheDisk_data()
{
    QTest::addColumn<int>("sync");
    QTest::addColumn<QByteArray>("call"); // before which it is synced
    QTest::addColumn<QString>("path");

    QTest::newRow("its text") << 1 << QByteArray("link") << QString();
    QTest::newRow("its name") << 2 << QByteArray("unlink") << "logs";
}

void tst_TorkLogRotationSteps::copyIsOnTheDisk()
{
    QFETCH(int, sync);
    QFETCH(QByteArray, call);
    QFETCH(QString, path);
    LogFolder folder;
    QVERIFY(TestFiles::write(folder.logs() + "app.log", "text"));
    TorkLog log;
    folder.prepare(log, "app");

    bool isSynced = false;
    FaultyFiles files(folder.root());
    files.failAt(sync, FaultyFiles::Once, EINVAL, "fsync");
    files.before(call, 1, [&] { isSynced = files.reached(); });
    log.deleteOldFiles();
    files.mend();
    QVERIFY(isSynced);
    if (!path.isEmpty())
        QCOMPARE(files.path(), folder.root() + path);
    QCOMPARE(folder.listing(), QStringList("app.log.1: text"));
}

namespace {

// Prints how many files are left open.
int rotates(QStringList const& arguments)
{
    LogFolder folder;
    TestFiles::write(folder.logs() + "app.log", "text");
    TorkLog log;
    folder.prepare(log, "app");
    const int before = openFileCount();
    FaultyFiles files(folder.root());
    if (arguments.at(0) == "folder that does not open")
        files.failAt(3, FaultyFiles::Once, EMFILE, "open");
    log.deleteOldFiles();
    files.mend();
    std::printf("%d %s|%s", openFileCount() - before, qPrintable(folder.listing().join(' ')),
                qPrintable(QFileInfo(files.path()).fileName()));
    return 0;
}

} // namespace

void tst_TorkLogRotationSteps::noFileIsLeftOpen_data()
{
    QTest::addColumn<QString>("when");
    QTest::addColumn<QByteArray>("failed");
    QTest::newRow("usual") << "" << QByteArray();
    QTest::newRow("folder does not open") << "folder that does not open" << QByteArray("logs");
}

void tst_TorkLogRotationSteps::noFileIsLeftOpen()
{
    QFETCH(QString, when);
    QFETCH(QByteArray, failed);
    const ChildProcess::Result child = ChildProcess::run("rotates", {when});
    QVERIFY2(child.ended(), child.report());
    QCOMPARE(child.output, "0 app.log.1: text|" + failed);
}

int main(int argc, char** argv)
{
    return ChildProcess::main<tst_TorkLogRotationSteps>(argc, argv, {{"rotates", rotates}});
}

#include "tst_TorkLogRotationSteps.moc"
